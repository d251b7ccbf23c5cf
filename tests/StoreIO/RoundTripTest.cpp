#include "StoreDocuments.h"
#include "TQL/SchemaIntern.h"
#include "TQL/SchemaText.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <bit>
#include <cmath>
#include <cstdint>
#include <random>
#include <vector>

namespace
{

using namespace StoreIOTest;
using TQL::EType;
using TQL::ISchema;

using Bytes = std::vector<std::uint8_t>;

/// Makes stores of everything that a file can hold.
class StoreMaker
{
public:
    explicit StoreMaker(unsigned i_Seed) : m_Random(i_Seed) {}

    std::shared_ptr<TQL::IStore> Make()
    {
        auto pStore = MakeStore();
        const TQL::ScopedWrite write(*pStore);
        AddChildren(*write, Store::EntryPath(), 0);
        return pStore;
    }

private:
    std::uint64_t Below(std::uint64_t i_End) { return m_Random() % i_End; }

    std::string MakeText(bool i_bName)
    {
        static const char* const s_Names[] = {"Children", "Value", "Value-Proposed", "Version", "Versions", "Type",
                                              "**",       " ",     "\"\\\n\x7f",     "Größe",   "骨盤",     "\t#1"};
        if (Below(3) == 0)
            return s_Names[Below(std::size(s_Names))];
        std::string text;
        for (std::uint64_t i = Below(i_bName ? 8 : 40) + (i_bName ? 1 : 0); i != 0; --i)
            text += static_cast<char>(Below(Below(2) == 0 ? 256 : 127));
        std::ranges::replace(text, '/', 'x');
        return i_bName && text == "*" ? "star" : text;
    }

    ISchema MakeSchema(int i_Depth)
    {
        ISchema schema(static_cast<EType>(1 + Below(static_cast<std::uint64_t>(EType::Enum32))));
        if (i_Depth == 5 && schema.Type >= EType::Array && schema.Type <= EType::NamedTuple)
            schema.Type = EType::String;
        if (TQL::IsEnum(schema.Type))
            for (std::int32_t i = 0; i <= static_cast<std::int32_t>(Below(5)); ++i)
                schema.EnumValues.push_back({MakeText(false) + std::to_string(i), i * 30 - 60});
        if (schema.Type == EType::Array || schema.Type == EType::List)
            schema.SubSchemas.push_back({"", MakeSchema(i_Depth + 1)});
        if (schema.Type == EType::Array)
            schema.Count = static_cast<std::uint32_t>(1 + Below(3));
        if (schema.Type == EType::Tuple || schema.Type == EType::NamedTuple)
            for (std::uint64_t i = 1 + Below(3); i != 0; --i)
                schema.SubSchemas.push_back(
                    {schema.Type == EType::Tuple ? "" : MakeText(true), MakeSchema(i_Depth + 1)});
        if (Below(4) == 0)
            schema.Docs = {MakeText(false), "the second"};
        return schema;
    }

    void AppendBits(Bytes& o_rBytes, std::uint64_t i_Bits, std::size_t i_Size)
    {
        const auto* const pBytes = reinterpret_cast<const std::uint8_t*>(&i_Bits);
        o_rBytes.insert(o_rBytes.end(), pBytes, pBytes + i_Size);
    }

    void AppendValue(Bytes& o_rBytes, const ISchema& i_rSchema)
    {
        static constexpr std::size_t s_Sizes[TQL::TypeCount] = {0, 1, 1, 2, 4, 8, 1, 2, 4, 8,
                                                                4, 8, 0, 0, 0, 0, 0, 1, 2, 4};
        const std::size_t size = s_Sizes[static_cast<std::size_t>(i_rSchema.Type)];
        if (size == 0)
            return AppendElements(o_rBytes, i_rSchema);
        std::uint64_t bits = i_rSchema.Type == EType::Bool ? Below(2) : m_Random();
        if (TQL::IsEnum(i_rSchema.Type))
            bits = static_cast<std::uint64_t>(i_rSchema.EnumValues[Below(i_rSchema.EnumValues.size())].Value);
        if (i_rSchema.Type == EType::Float32 && !std::isfinite(std::bit_cast<float>(static_cast<std::uint32_t>(bits))))
            bits = std::bit_cast<std::uint32_t>(-0.0F);
        if (i_rSchema.Type == EType::Float64 && !std::isfinite(std::bit_cast<double>(bits)))
            bits = std::bit_cast<std::uint64_t>(-0.0);
        AppendBits(o_rBytes, bits, size);
    }

    void AppendElements(Bytes& o_rBytes, const ISchema& i_rSchema)
    {
        if (i_rSchema.Type == EType::String)
        {
            const std::string text = MakeText(false);
            AppendBits(o_rBytes, text.size(), 4);
            o_rBytes.insert(o_rBytes.end(), text.begin(), text.end());
            return;
        }
        std::uint64_t count = i_rSchema.Type == EType::Array ? i_rSchema.Count : 1;
        if (i_rSchema.Type == EType::List)
            AppendBits(o_rBytes, count = Below(4), 4);
        for (; count != 0; --count)
            for (const TQL::SchemaMember& rMember : i_rSchema.SubSchemas)
                AppendValue(o_rBytes, rMember.Schema);
    }

    Store::StoreValue MakeValue(const ISchema& i_rSchema)
    {
        Bytes bytes;
        AppendValue(bytes, i_rSchema);
        return {&i_rSchema, bytes};
    }

    /// Every branch ends in values: a bare entry without children leaves nothing behind in a store that reads it.
    void AddChildren(TQL::IStoreWriter& i_rWriter, const Store::EntryPath& i_rPath, int i_Depth)
    {
        for (std::uint64_t i = 1 + Below(6); i != 0; --i)
        {
            const Store::EntryPath path = i_rPath / MakeText(true);
            const bool bParent = i_Depth < 4 && Below(3) == 0;
            if (!bParent || Below(2) == 0)
                AddValues(i_rWriter, i_rWriter.GetStore().GetEntry(path));
            if (bParent)
                AddChildren(i_rWriter, path, i_Depth + 1);
        }
    }

    void AddValues(TQL::IStoreWriter& i_rWriter, Store::EntryHandle i_Entry)
    {
        if (i_rWriter.HasValue(i_Entry))
            return;
        const ISchema made = MakeSchema(0);
        const ISchema& rSchema = TQL::IO::GetUniqueSchema(made);
        const auto flags = static_cast<std::uint32_t>(m_Random()) & Store::EntryFlag::Mask;
        ASSERT_TRUE(i_rWriter.EnableFlags(i_Entry, flags).IsSuccess());
        const bool bProposed = (flags & Store::EntryFlag::VerifyRequired) && Below(3) != 0;
        if (bProposed)
        {
            ASSERT_TRUE(i_rWriter.SetProposedValue(i_Entry, MakeValue(rSchema)).IsSuccess());
        }
        if (!bProposed || Below(2) == 0)
        {
            ASSERT_TRUE(i_rWriter.SetVerifiedValue(i_Entry, MakeValue(rSchema)).IsSuccess());
        }
    }

    std::mt19937_64 m_Random;
};

TEST(RoundTrip, AFileThatWasReadIsWrittenAgainByteForByte)
{
    for (unsigned seed = 1; seed <= 150; ++seed)
    {
        const auto pFirst = StoreMaker(seed).Make();
        const TestSupport::LogGuard log; // after the store: some pairs of flags are no good
        const std::string file = ExportText(*pFirst);
        const auto pSecond = MakeStore();
        ASSERT_EQ(ImportText(*pSecond, file), TQL::Result::Ok) << file;
        ASSERT_EQ(ExportText(*pSecond), file) << "seed " << seed;

        // The bytes in the store too: a number that lost a bit on the way out would be written as before.
        const TQL::ScopedRead first(*pFirst);
        const TQL::ScopedRead second(*pSecond);
        const auto compare = [&](const auto& i_rSelf, Store::EntryHandle i_Entry) -> void
        {
            const Store::EntryHandle entry = pSecond->GetEntry(pFirst->GetEntryPath(i_Entry));
            EXPECT_EQ(first->GetVerifiedValue(i_Entry), second->GetVerifiedValue(entry)) << "seed " << seed;
            if (first->GetFlags(i_Entry) & Store::EntryFlag::VerifyRequired)
            {
                EXPECT_EQ(first->GetProposedValue(i_Entry), second->GetProposedValue(entry)) << "seed " << seed;
            }
            for (const Store::EntryHandle child : first->GetChildren(i_Entry))
                i_rSelf(i_rSelf, child);
        };
        compare(compare, pFirst->GetRoot());
    }
}

} // namespace
