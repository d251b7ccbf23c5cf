#include "TQL/SchemaText.h"
#include "TQL/JsonText.h"
#include "TQL/SchemaIntern.h"

#include <gtest/gtest.h>

#include <limits>
#include <sstream>
#include <thread>

namespace
{

using TQL::ESchemaTextMode;
using TQL::EType;
using TQL::ISchema;

ISchema LengthUnits()
{
    return TQL::MakeEnumSchema(EType::Enum32, "ELengthUnits", {{"Millimeters", 0}, {"Centimeters", 1}, {"Meters", 2}});
}

/// Every member set, in each of its kinds.
ISchema FullSchema()
{
    ISchema schema = TQL::MakeNamedTupleSchema("T\"\n", {{"a", LengthUnits()}, {"", ISchema(EType::Float64)}});
    schema.Role = TQL::ERole::Result;
    schema.Detail = 65535;
    schema.Count = 4294967295u;
    schema.SubSchemas[0].Schema.EnumValues[0].Value = -2147483647 - 1;
    schema.Docs = {"Type \u00e4", ""};
    schema.History = {{"", "a"}, {"b", ""}};
    return schema;
}

TEST(SchemaText, WritesFourModes)
{
    const struct
    {
        ISchema Schema;
        const char* pTexts[4];
    } rows[] = {
        {ISchema(),
         {R"(["Void","Value",0,0,"",[],[],[],[]])",
          R"({"Type":"Void","Role":"Value","Detail":0,"Count":0,"TypeName":"","EnumValues":[],"SubSchemas":[],)"
          R"("Docs":[],"History":[]})",
          "{}", R"("Void","Value",0,0,"",0,0,0,0)"}},
        {LengthUnits(),
         {R"(["Enum32","Value",0,0,"ELengthUnits",[["Millimeters",0],["Centimeters",1],["Meters",2]],[],[],[]])",
          nullptr, nullptr, R"("Enum32","Value",0,0,"ELengthUnits",3,0,0,0)"}},
        {TQL::MakeArraySchema(ISchema(EType::Int8), 3),
         {R"(["Array","Value",0,3,"",[],[["",["Int8","Value",0,0,"",[],[],[],[]]]],[],[]])", nullptr,
          R"({"Type":"Array","Count":3,"SubSchemas":[["",{"Type":"Int8"}]]})", R"("Array","Value",0,3,"",0,1,0,0)"}},
        {FullSchema(),
         {nullptr, nullptr,
          R"({"Type":"NamedTuple","Role":"Result","Detail":65535,"Count":4294967295,"TypeName":"T\"\n","SubSchemas":)"
          R"([["a",{"Type":"Enum32","TypeName":"ELengthUnits","EnumValues":[["Millimeters",-2147483648],)"
          R"(["Centimeters",1],["Meters",2]]}],["",{"Type":"Float64"}]],"Docs":["Type ä",""],)"
          R"("History":[["","a"],["b",""]]})",
          R"("NamedTuple","Result",65535,4294967295,"T\"\n",0,2,2,2)"}}};
    for (const auto& rRow : rows)
    {
        for (int mode = 0; mode < 4; ++mode)
        {
            const std::string text = WriteSchema(rRow.Schema, ESchemaTextMode{mode});
            EXPECT_EQ(text, rRow.pTexts[mode] ? rRow.pTexts[mode] : text);
        }
        for (const ESchemaTextMode mode : {ESchemaTextMode::Named, ESchemaTextMode::NamedBrief})
        {
            const std::string text = WriteSchema(rRow.Schema, mode);
            ISchema read(EType::String);
            read.Docs = {"left over"};
            EXPECT_EQ(ReadSchema(text, read), TQL::Result::Ok) << text;
            EXPECT_EQ(WriteSchema(read, mode), text);
        }
    }
}

std::string Nested(int i_Depth)
{
    std::string text = "{}";
    for (int i = 1; i < i_Depth; ++i)
        text = R"({"Type":"List","SubSchemas":[["",)" + text + "]]}";
    return text;
}

TEST(SchemaText, ReaderAcceptsAndRefuses)
{
    const std::string brackets(1'000'000, '[');
    const std::pair<std::string, std::string> readable[] = {
        {" { \"Count\" : 3 , \"Type\" : \"Array\" } ", R"({"Type":"Array","Count":3})"},
        {R"({"Other":[[1]],"Type":"Ref","TypeName":"N"})", R"({"Type":"Ref","TypeName":"N"})"},
        {R"({"Other":)" + brackets + std::string(1'000'000, ']') + "}", "{}"},
        {Nested(64), Nested(64)}};
    for (const auto& [text, brief] : readable)
    {
        ISchema schema;
        EXPECT_EQ(ReadSchema(text, schema), TQL::Result::Ok) << brief;
        EXPECT_EQ(WriteSchema(schema, ESchemaTextMode::NamedBrief), brief);
    }
    std::vector<std::string> unreadable = {"", "[]", "{} {}", brackets, Nested(65)};
    std::istringstream members(R"("Type":"int32";"Type":"Unspecified";"Type":4;"Role":"None";"Detail":65536;"Count":-1;
"Count":1.0;"Count":4294967296;"TypeName":null;"EnumValues":[["A"]];"EnumValues":[["A",0,0]];"EnumValues":[[0,"A"]];
"EnumValues":[["A",2147483648]];"SubSchemas":{};"SubSchemas":[["a",{"Type":"None"}]];"Docs":["a",1];"History":["a"])");
    for (std::string member; std::getline(members, member, ';');)
        unreadable.push_back("{" + member + "}");
    EXPECT_EQ(unreadable.size(), 22u);
    for (const std::string& rText : unreadable)
    {
        ISchema schema(EType::Bool);
        EXPECT_EQ(ReadSchema(rText, schema), TQL::Result::InvalidFormat) << rText.substr(0, 60);
        EXPECT_EQ(schema.Type, EType::Bool) << "left as it was";
    }
    EXPECT_EQ(GetName(EType{21}), "Unspecified");
    EXPECT_EQ(GetName(TQL::ERole{8}), "Unspecified");
}

TEST(JsonText, SpellsTextsAndNumbers)
{
    std::string text;
    TQL::JsonText::AppendQuoted(text, std::string_view("a/\b\t\n\f\r\"\\\0\x1f\x7f\xc3\xa4", 14));
    EXPECT_EQ(text, "\"a/\\b\\t\\n\\f\\r\\\"\\\\\\u0000\\u001F\x7f\xc3\xa4\"");
    const std::pair<double, const char*> rows[] = {{1.0, "1.0"},
                                                   {-0.0, "-0.0"},
                                                   {1.0 / 3.0, "0.3333333333333333"},
                                                   {1e-7, "1e-7"},
                                                   {1e22, "1e22"},
                                                   {0.1f, "0.10000000149011612"},
                                                   {std::numeric_limits<double>::max(), "1.7976931348623157e308"}};
    for (const auto& [value, pText] : rows)
    {
        text.clear();
        EXPECT_TRUE(TQL::JsonText::AppendNumber(text, value));
        EXPECT_EQ(text, pText);
    }
    text.clear();
    EXPECT_FALSE(TQL::JsonText::AppendNumber(text, std::numeric_limits<double>::infinity()));
    EXPECT_FALSE(TQL::JsonText::AppendNumber(text, std::numeric_limits<double>::quiet_NaN()));
    EXPECT_EQ(text, "");
    TQL::JsonText::AppendNumber(text, std::numeric_limits<std::int64_t>::min());
    TQL::JsonText::AppendNumber(text, std::numeric_limits<std::uint64_t>::max());
    EXPECT_EQ(text, "-922337203685477580818446744073709551615");
}

TEST(SchemaIntern, OneInstanceForAShape)
{
    const ISchema base = TQL::MakeTupleSchema({LengthUnits(), ISchema(EType::Float32)});
    const ISchema& rUnique = TQL::IO::GetUniqueSchema(base);
    ISchema other = base;
    other.Detail = 1;
    other.TypeName = "Other";
    other.Docs = {"doc"};
    other.History = {{"a", "b"}};
    other.SubSchemas[0].Schema.TypeName.clear();
    EXPECT_EQ(&TQL::IO::GetUniqueSchema(other), &rUnique);
    EXPECT_EQ(rUnique.TypeName, "") << "the first one stands";

    void (*const changes[])(ISchema&) = {
        [](ISchema& o_rSchema) { o_rSchema.Type = EType::NamedTuple; },
        [](ISchema& o_rSchema) { o_rSchema.Role = TQL::ERole::Input; },
        [](ISchema& o_rSchema) { o_rSchema.Count = 1; },
        [](ISchema& o_rSchema) { o_rSchema.SubSchemas[0].Name = "a"; },
        [](ISchema& o_rSchema) { o_rSchema.SubSchemas[0].Schema.EnumValues[1].Name = "cm"; },
        [](ISchema& o_rSchema) { o_rSchema.SubSchemas[0].Schema.EnumValues[1].Value = 7; },
        [](ISchema& o_rSchema)
        {
            o_rSchema.SubSchemas.pop_back();
        }};
    for (const auto& rpChange : changes)
    {
        ISchema changed = base;
        rpChange(changed);
        EXPECT_NE(&TQL::IO::GetUniqueSchema(changed), &rUnique) << &rpChange - changes;
        EXPECT_FALSE(HaveSameShape(changed, base)) << &rpChange - changes;
    }

    ISchema ref(EType::Ref);
    ref.TypeName = "A";
    const ISchema& rRefToA = TQL::IO::GetUniqueSchema(ref);
    ref.TypeName = "B";
    EXPECT_NE(&TQL::IO::GetUniqueSchema(ref), &rRefToA);
    EXPECT_EQ(&TQL::IO::GetUniquePodSchema(EType::Int32), &TQL::IO::GetUniqueSchema(ISchema(EType::Int32)));
    EXPECT_EQ(TQL::IO::GetUniquePodSchema(EType{200}).Type, EType::Void);
}

TEST(SchemaIntern, ThreadsAgree)
{
    constexpr std::uint32_t count = 500;
    std::vector<std::vector<const ISchema*>> found(4, std::vector<const ISchema*>(count));
    std::vector<std::thread> threads;
    for (auto& rFound : found)
    {
        threads.emplace_back(
            [&rFound]
            {
                for (std::uint32_t i = 0; i < count; ++i)
                    rFound[i] = &TQL::IO::GetUniqueSchema(TQL::MakeArraySchema(ISchema(EType::UInt16), 1000 + i));
            });
    }
    for (std::thread& rThread : threads)
        rThread.join();
    for (const auto& rFound : found)
        EXPECT_EQ(rFound, found[0]);
    EXPECT_EQ(found[0][7]->Count, 1007u) << "references stay valid while the table grows";
}

} // namespace
