#include "StoreScript.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

namespace
{

enum class EColour : std::uint8_t
{
    Red = 1,
    Green = 2
};

TQL::ISchema DescribeSchema(std::type_identity<EColour>)
{
    return TQL::MakeEnumSchema(TQL::EType::Enum8, "EColour", {{"Red", 1}, {"Green", 2}});
}

struct Range
{
    std::int16_t First = 0;
    std::string Name;
    friend bool operator==(const Range&, const Range&) = default;
};

TQL::ISchema DescribeSchema(std::type_identity<Range>)
{
    return TQL::MakeNamedTupleSchema(
        "Range", {{"First", TQL::ISchema(TQL::EType::Int16)}, {"Name", TQL::ISchema(TQL::EType::String)}});
}

auto TieMembers(Range& i_rRange)
{
    return std::tie(i_rRange.First, i_rRange.Name);
}

template <typename T>
void ExpectRoundTrip(const T& i_rValue, std::vector<std::uint8_t> i_Bytes)
{
    const Store::StoreValue value = Store::MakeValue(i_rValue);
    EXPECT_TRUE(std::ranges::equal(value.Bytes(), i_Bytes)) << testing::PrintToString(i_rValue);
    T read{};
    EXPECT_EQ(Store::DecodeValue(value, read), Store::EDecodeResult::Done);
    EXPECT_EQ(read, i_rValue);
    Store::StoreValue copy = value;
    copy = Store::StoreValue(copy); // through both constructors and the swap
    EXPECT_EQ(copy, value);
    // Cut off anywhere: a number is 0, anything else is refused, nothing is read beyond the end.
    for (std::size_t size = 0; size < i_Bytes.size(); ++size)
    {
        const Store::StoreValue cut(value.Schema(), value.Bytes().first(size));
        const auto result = Store::DecodeValue(cut, read);
        if constexpr (Store::StoreNumber<T>)
        {
            EXPECT_EQ(read, T{});
        }
        else
        {
            EXPECT_EQ(result, Store::EDecodeResult::Malformed) << size;
        }
    }
}

TEST(TypedValues, HaveTheirLayout)
{
    ExpectRoundTrip(true, {1});
    ExpectRoundTrip(std::int8_t{-2}, {0xFE});
    ExpectRoundTrip(std::uint16_t{0x1234}, {0x34, 0x12});
    ExpectRoundTrip(std::int32_t{-2}, {0xFE, 0xFF, 0xFF, 0xFF});
    ExpectRoundTrip(1.0f, {0, 0, 0x80, 0x3F});
    ExpectRoundTrip(1.0, {0, 0, 0, 0, 0, 0, 0xF0, 0x3F});
    ExpectRoundTrip(std::uint64_t{1} << 56, {0, 0, 0, 0, 0, 0, 0, 1});
    ExpectRoundTrip(std::string("a\0b", 3), {3, 0, 0, 0, 'a', 0, 'b'});
    ExpectRoundTrip(std::vector<bool>{true, false}, {2, 0, 0, 0, 1, 0});
    ExpectRoundTrip(std::array<std::int16_t, 2>{1, 2}, {1, 0, 2, 0});
    ExpectRoundTrip(std::tuple<std::uint8_t, std::string>{7, "x"}, {7, 1, 0, 0, 0, 'x'});
    ExpectRoundTrip(Range{-1, "xy"}, {0xFF, 0xFF, 2, 0, 0, 0, 'x', 'y'});
    ExpectRoundTrip(std::vector<std::vector<std::string>>{{}, {"a"}},
                    {2, 0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0, 'a'});
    ExpectRoundTrip(EColour::Green, {2});
    ExpectRoundTrip(static_cast<EColour>(77), {77}); // outside its values: kept as it is
}

TEST(TypedValues, RefuseImpossibleCounts)
{
    using List = std::vector<std::int32_t>;
    const std::vector<std::vector<std::uint8_t>> rows = {
        {0xFF, 0xFF, 0xFF, 0xFF}, {0xFF, 0xFF, 0xFF, 0x7F}, {1, 0, 0, 0, 1, 0, 0}, {1, 0, 0, 0, 1, 0, 0, 0, 9}};
    for (const auto& rBytes : rows)
    {
        List read;
        const Store::StoreValue value(&Store::SchemaOf<List>(), rBytes);
        EXPECT_EQ(Store::DecodeValue(value, read), Store::EDecodeResult::Malformed) << testing::PrintToString(rBytes);
    }
}

TEST(TypedAccess, SaysWhyAValueCannotBeRead)
{
    StoreTest::StoreScript script;
    TestSupport::LogGuard guard;
    script.Write("A=1 B@x C?2");
    {
        TQL::ScopedWrite writer(script.Get());
        const Store::StoreValue bad(&Store::SchemaOf<std::string>(), std::array<std::uint8_t, 1>{9});
        EXPECT_TRUE(writer->SetValue(script.Entry("D"), bad).IsSuccess());
    }
    const TQL::ScopedRead reader(script.Get());
    std::string text;
    std::int32_t number = 0;
    EXPECT_TRUE(TQL::GetValue(*reader, script.Entry("A"), number) && number == 1);
    EXPECT_TRUE(TQL::GetProposedValue(*reader, script.Entry("C"), number) && number == 2);
    for (const char* const pPath : {"A", "B", "D", "X/Y"})
        EXPECT_FALSE(TQL::GetValue(*reader, script.Entry(pPath), text));
    std::string lines;
    for (const auto& rLine : guard.Take())
        lines += rLine.Text + '\n';
    EXPECT_EQ(lines,
              "Failed getting value for store entry 'A': the requested value type does not match the store value "
              "type.\nStore entry 'B' has no value.\nFailed getting value for store entry 'D': encountered an "
              "unknown error.\nStore entry 'X/Y' does not exist.\n");
}

} // namespace
