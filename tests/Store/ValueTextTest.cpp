#include "Store/ValueText.h"
#include "Store/ValueTextWriter.h"
#include "TQL/SchemaIntern.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <utility>
#include <vector>

namespace
{

using namespace TQL;

std::string Hex(const std::optional<Store::StoreValue>& i_rValue)
{
    if (!i_rValue)
        return "none";
    std::string text;
    for (const std::uint8_t byte : i_rValue->Bytes())
    {
        char digits[3];
        std::snprintf(digits, sizeof(digits), "%02x", byte);
        text += digits;
    }
    return text;
}

TEST(ValueText, ReadsAndWritesEachType)
{
    const ISchema units = MakeEnumSchema(EType::Enum16, "EUnits", {{"Metres", 2}, {"Feet", -3}, {"Far", 70000}});
    const ISchema bits = MakeEnumSchema(EType::Enum8, "EBits", {{"Past", 456}, {"Low", -128}, {"High", 200}});
    const ISchema range =
        MakeNamedTupleSchema("Range", {{"Low", ISchema(EType::Int8)}, {"High", ISchema(EType::UInt16)}});
    const ISchema list = MakeListSchema(ISchema(EType::UInt8));
    const struct
    {
        ISchema Schema;
        const char* pText;
        const char* pBytes;
    } s_Cases[] = {
        {ISchema(EType::Bool), "true", "01"},
        {ISchema(EType::Bool), "1", "none"},
        {ISchema(EType::Int8), "-128", "80"},
        {ISchema(EType::Int8), "128", "none"},
        {ISchema(EType::Int16), "-2", "feff"},
        {ISchema(EType::Int32), "1.0", "none"},
        {ISchema(EType::Int64), "-9223372036854775808", "0000000000000080"},
        {ISchema(EType::UInt8), "-1", "none"},
        {ISchema(EType::UInt64), "18446744073709551615", "ffffffffffffffff"},
        {ISchema(EType::UInt64), "18446744073709551616", "none"},
        {ISchema(EType::Float32), "1", "0000803f"},
        {ISchema(EType::Float32), "1e39", "none"},
        {ISchema(EType::Float64), "-1234.5678901234567", "df0ffd84454a93c0"},
        {ISchema(EType::Float64), "NaN", "none"},
        {ISchema(EType::String), "\"a\\u00e9\"", "0300000061c3a9"},
        {ISchema(EType::String), "bare", "none"},
        {units, "\"Metres\"", "0200"},
        {units, "\"Feet\"", "fdff"},
        {units, "\"Far\"", "none"},
        {bits, "\"Low\"", "80"},
        {bits, "\"High\"", "c8"},
        {bits, "\"Past\"", "none"},
        {units, "\"Miles\"", "none"},
        {list, "[ 1 , 2 ]", "020000000102"},
        {list, "[1,300]", "none"},
        {list, "[1]2", "none"},
        {MakeArraySchema(ISchema(EType::Bool), 2), "[true,false]", "0100"},
        {MakeArraySchema(ISchema(EType::Bool), 2), "[true]", "none"},
        {range, "[-1,258]", "ff0201"},
        {range, "{\"High\":258,\"Low\":-1}", "ff0201"},
        {range, "{\"High\":258}", "none"},
        {range, "{\"Low\":1,\"Low\":1}", "none"},
        {MakeTupleSchema({list, ISchema(EType::Bool)}), "[[7],true]", "010000000701"},
        {MakeListSchema(MakeTupleSchema({})), "[[],[]]", "02000000"},
        {ISchema(EType::Void), "null", "none"},
        {ISchema(EType::Int32), "", "none"},
    };
    for (const auto& rCase : s_Cases)
    {
        const ISchema& rSchema = IO::GetUniqueSchema(rCase.Schema);
        const auto value = Store::ParseValueText(rSchema, rCase.pText);
        EXPECT_EQ(Hex(value), rCase.pBytes) << GetName(rSchema.Type) << " " << rCase.pText;
        if (!value)
            continue;
        std::string text;
        EXPECT_TRUE(Store::AppendValueText(text, rSchema, value->Bytes())) << rCase.pText;
        EXPECT_EQ(Hex(Store::ParseValueText(rSchema, text)), rCase.pBytes) << rCase.pText << " as " << text;
        for (std::size_t size = 0; size < value->Bytes().size(); ++size)
        {
            const std::vector<std::uint8_t> cut(value->Bytes().begin(), value->Bytes().begin() + std::ptrdiff_t(size));
            EXPECT_FALSE(Store::AppendValueText(text, rSchema, cut)) << rCase.pText << " cut to " << size;
        }
    }
}

TEST(ValueText, ADeepTextIsReadWithoutADeepStack)
{
    const ISchema schema = MakeListSchema(ISchema(EType::UInt8));
    const ISchema& rSchema = IO::GetUniqueSchema(schema);
    const std::string deep = std::string(1'000'000, '[') + std::string(1'000'000, ']');
    EXPECT_FALSE(Store::ParseValueText(rSchema, deep));
}

TEST(ValueText, WritesNoValueWithoutAText)
{
    using Bytes = std::vector<std::uint8_t>;
    const ISchema units = MakeEnumSchema(EType::Enum8, "EUnits", {{"Metres", 2}, {"Far", 259}});
    const std::pair<ISchema, Bytes> s_Cases[] = {
        {units, {3}},
        {ISchema(EType::Float32), {0, 0, 0x80, 0x7f}},
        {MakeTupleSchema({ISchema(EType::Bool), ISchema(EType::Float64)}), {1, 0, 0, 0, 0, 0, 0, 0xf8, 0x7f}},
        {ISchema(EType::String), {0xff, 0xff, 0xff, 0xff, 'a'}},
        {MakeListSchema(ISchema(EType::Bool)), {0xff, 0xff, 0xff, 0x7f, 1}},
        {ISchema(EType::List), {0, 0, 0, 0}},
        {ISchema(EType::Void), {1}},
        {ISchema(EType::Ref), {1}},
    };
    for (const auto& [schema, bytes] : s_Cases)
    {
        std::string text = "before";
        EXPECT_FALSE(Store::AppendValueText(text, schema, bytes)) << GetName(schema.Type);
        EXPECT_EQ(text, "before");
    }
}

} // namespace
