#include "TQL/SchemaText.h"
#include "TQL/SkipReaders.h"
#include "TQL/VReaderMappedEnum.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>

namespace
{

using TQL::EType;
using TQL::ISchema;
namespace Result = TQL::Result;

/// Gives the bytes of i_Bytes, then i_Zeros zeros, then nothing.
class Bytes final : public TQL::IByteSource
{
public:
    explicit Bytes(std::vector<std::uint8_t> i_Bytes, std::uint64_t i_Zeros = 0)
        : m_Bytes(std::move(i_Bytes)), m_Size(m_Bytes.size() + i_Zeros)
    {
    }

    bool Read(void* o_pBytes, std::size_t i_Size) override
    {
        ++Reads;
        Largest = std::max(Largest, i_Size);
        if (i_Size > m_Size - Taken)
            return false;
        std::memset(o_pBytes, 0, i_Size);
        if (Taken < m_Bytes.size())
            std::memcpy(o_pBytes, m_Bytes.data() + Taken, std::min<std::size_t>(i_Size, m_Bytes.size() - Taken));
        Taken += i_Size;
        return true;
    }

    std::uint64_t Taken = 0;
    std::size_t Reads = 0;
    std::size_t Largest = 0;

private:
    std::vector<std::uint8_t> m_Bytes;
    std::uint64_t m_Size;
};

TEST(SkipReaders, TakeJustTheirBytes)
{
    const std::string text = R"(["",{"Type":"String"}])";
    const std::string number = R"(["",{"Type":"Int32"}])";
    const std::string many = R"("Type":"Array","Count":2147483648,"SubSchemas":[)";
    const std::string huge = many + R"(["",{)" + many + R"(["",{)" + many + R"(["",{"Type":"Int8"}]]}]]}]])";
    const std::string mixed = number + "," + number + "," + text + "," + number;
    const struct
    {
        std::string Members;
        std::vector<std::uint8_t> Head; ///< bytes that matter; zeros follow
        TQL::IResult Result;
        std::uint64_t Taken;
        std::uint64_t FixedSize;
    } rows[] = {
        {R"("Type":"Void")", {}, Result::Ok, 0, 0},
        {R"("Type":"Enum16")", {}, Result::Ok, 2, 2},
        {R"("Type":"Float64")", {}, Result::Ok, 8, 8},
        {R"("Type":"String")", {3, 0, 0, 0}, Result::Ok, 7, 0},
        {R"("Type":"String")", {255, 255, 255, 255}, Result::Ok, 4, 0},
        {R"("Type":"Array","Count":3,"SubSchemas":[)" + number + "]", {}, Result::Ok, 12, 12},
        {R"("Type":"Array","Count":2,"SubSchemas":[)" + text + "]", {1, 0, 0, 0, 9, 2, 0, 0, 0}, Result::Ok, 11, 0},
        {R"("Type":"Array","Count":0,"SubSchemas":[)" + text + "]", {}, Result::OkButNoEffect, 0, 0},
        {R"("Type":"List","SubSchemas":[)" + number + "]", {2}, Result::Ok, 12, 0},
        {R"("Type":"List","SubSchemas":[)" + text + "]", {2, 0, 0, 0, 1, 0, 0, 0, 9}, Result::Ok, 13, 0},
        {R"("Type":"List","SubSchemas":[)" + text + "]", {255, 255, 255, 255}, Result::Ok, 4, 0},
        {R"("Type":"Tuple")", {}, Result::OkButNoEffect, 0, 0},
        {R"("Type":"Tuple","SubSchemas":[)" + number + "," + number + "]", {}, Result::Ok, 8, 8},
        {many + R"(["",{"Type":"Tuple","SubSchemas":[)" + number + "]}]]", {}, Result::Failed, 0, 4ull << 31},
        {huge, {}, Result::Failed, 0, 0},
        {R"("Type":"NamedTuple","SubSchemas":[)" + mixed + "]", {}, Result::Ok, 16, 0}};
    for (const auto& rRow : rows)
    {
        ISchema schema;
        ASSERT_EQ(TQL::ReadSchema("{" + rRow.Members + "}", schema), Result::Ok) << rRow.Members;
        const auto pReader = MakeSkipReader(schema);
        ASSERT_TRUE(pReader) << rRow.Members;
        Bytes source(rRow.Head, 200'000);
        EXPECT_EQ(pReader->Read(source, nullptr), rRow.Result) << rRow.Members;
        EXPECT_EQ(rRow.Result.IsSuccess() ? source.Taken : 0, rRow.Taken) << rRow.Members;
        EXPECT_EQ(pReader->FixedSize(), rRow.FixedSize) << rRow.Members;
        EXPECT_LE(source.Largest, 65536u) << "a size in a broken file costs no memory";
        if (rRow.Taken > rRow.Head.size() && rRow.Result.IsSuccess())
        {
            Bytes cut(rRow.Head, rRow.Taken - rRow.Head.size() - 1);
            EXPECT_EQ(pReader->Read(cut, nullptr), Result::Failed) << "one byte short: " << rRow.Members;
        }
    }
    EXPECT_FALSE(
        MakeSkipReader(TQL::MakeTupleSchema({ISchema(EType::Bool), TQL::MakeListSchema(ISchema(EType::Ref))})));
    EXPECT_FALSE(MakeSkipReader(ISchema(EType::List)));
    Bytes source({2, 0, 0, 0}, 100);
    EXPECT_EQ(TQL::VReaderSkipContiguousVector(1ull << 63).Read(source, nullptr), Result::Failed) << "wraps to 0";
}

TEST(SkipReaders, TupleMergesNeighboursOfFixedSize)
{
    std::vector<TQL::SkipReaderPtr> members;
    for (int i = 0; i < 3; ++i)
        members.push_back(std::make_unique<TQL::VReaderSkipBytes>(2));
    members.push_back(std::make_unique<TQL::VReaderSkipBytesNoCollapse>(3));
    members.push_back(std::make_unique<TQL::VReaderSkipBytes>(4));
    Bytes source({}, 13);
    EXPECT_EQ(TQL::VReaderSkipTuple(std::move(members)).Read(source, nullptr), Result::Ok);
    EXPECT_EQ(source.Reads, 3u);
    EXPECT_EQ(source.Taken, 13u);
}

TEST(SkipReaders, FoldsTheResultsOfItsRounds)
{
    const TQL::IResult ok = Result::Ok;
    const TQL::IResult partial = Result::OkButPartial;
    const TQL::IResult none = Result::OkButNoEffect;
    const std::pair<std::vector<TQL::IResult>, TQL::IResult> rows[] = {{{}, none},
                                                                       {{none, none}, none},
                                                                       {{ok, ok}, ok},
                                                                       {{ok, none}, partial},
                                                                       {{partial}, partial},
                                                                       {{none, partial}, partial},
                                                                       {{ok, partial}, partial},
                                                                       {{ok, Result::NotFound}, Result::NotFound}};
    for (const auto& [rounds, expected] : rows)
    {
        TQL::VResultFold fold;
        for (const TQL::IResult round : rounds)
            EXPECT_EQ(fold.Add(round), round.IsSuccess());
        EXPECT_EQ(fold.Get(), expected);
    }
}

TEST(MappedEnum, ReadsFourBytes)
{
    ISchema before = TQL::MakeEnumSchema(EType::Enum8, "", {{"A", 0}, {"B", -5}, {"C", 2}});
    ISchema after = TQL::MakeEnumSchema(EType::Enum8, "", {{"A", 10}, {"B", 11}});
    EXPECT_FALSE(MakeEnumReader(before, after)) << "C has no place";
    after.History = {{"C", ""}};
    const auto pReader = MakeEnumReader(before, after);
    ASSERT_TRUE(pReader);
    const struct
    {
        std::vector<std::uint8_t> Source;
        TQL::IResult Result;
        std::int32_t Target;
    } rows[] = {{{0, 0, 0, 0}, Result::Ok, 10},
                {{251, 255, 255, 255}, Result::Ok, 11},
                {{2, 0, 0, 0}, Result::OkButNoEffect, 77},
                {{255, 255, 255, 255}, Result::Failed, 77},
                {{0, 0, 0}, Result::Failed, 77}};
    for (const auto& rRow : rows)
    {
        std::int32_t target = 77;
        Bytes source(rRow.Source);
        EXPECT_EQ(pReader->Read(source, &target), rRow.Result);
        EXPECT_EQ(target, rRow.Target);
    }
    std::int32_t target = 0;
    Bytes unknown({99, 0, 0, 0});
    EXPECT_EQ(MakeEnumReader(after, after)->Read(unknown, &target), Result::Ok) << "nothing to translate";
    EXPECT_EQ(target, 99);
}

} // namespace
