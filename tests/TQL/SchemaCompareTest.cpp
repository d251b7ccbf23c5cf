#include "TQL/SchemaCompare.h"
#include "TQL/SchemaHistory.h"
#include "TQL/SchemaReduce.h"
#include "TQL/SchemaText.h"

#include <gtest/gtest.h>

namespace
{

using TQL::EType;
using TQL::ISchema;

ISchema FromText(const std::string& i_rText)
{
    ISchema schema;
    EXPECT_EQ(TQL::ReadSchema(i_rText, schema), TQL::Result::Ok) << i_rText;
    return schema;
}

ISchema Enum(const char* i_pStorage, const std::string& i_rValues, const std::string& i_rHistory = "")
{
    return FromText(R"({"Type":")" + std::string(i_pStorage) + R"(","EnumValues":[)" + i_rValues + R"(],"History":[)" +
                    i_rHistory + "]}");
}

ISchema Struct(const std::vector<std::pair<std::string, EType>>& i_rMembers,
               std::vector<TQL::SchemaRename> i_History = {})
{
    ISchema schema(EType::NamedTuple);
    for (const auto& [name, type] : i_rMembers)
        schema.SubSchemas.push_back({name, ISchema(type)});
    schema.History = std::move(i_History);
    return schema;
}

TEST(SchemaCompare, ConvertsOnlyWithoutLoss)
{
    // Of Bool to UInt64: how many bits a value has beside its sign, and whether it has one.
    const std::pair<int, bool> integers[] = {{1, false}, {7, true},   {15, true},  {31, true}, {63, true},
                                             {8, false}, {16, false}, {32, false}, {64, false}};
    for (std::size_t from = 0; from < TQL::TypeCount; ++from)
    {
        for (std::size_t to = 0; to < TQL::TypeCount; ++to)
        {
            const auto oldType = static_cast<EType>(from);
            const auto newType = static_cast<EType>(to);
            bool bExpected = from == to && oldType != EType::Void && oldType != EType::Ref;
            if (oldType >= EType::Bool && oldType <= EType::UInt64 && newType >= EType::Bool &&
                newType <= EType::UInt64)
                bExpected = integers[from - 1].first <= integers[to - 1].first &&
                            integers[from - 1].second <= integers[to - 1].second;
            bExpected |= oldType == EType::Float32 && newType == EType::Float64;
            bExpected |= TQL::IsEnum(oldType) && TQL::IsEnum(newType);
            EXPECT_EQ(TQL::IsConvertible(oldType, newType), bExpected) << GetName(oldType) << GetName(newType);
        }
    }
}

TEST(SchemaCompare, TellsDifferences)
{
    const std::string ab = R"(["A",0],["B",1])";
    const ISchema outer =
        FromText(R"({"Type":"NamedTuple","TypeName":"S","SubSchemas":[["m",{"Type":"List","TypeName":"L",
        "SubSchemas":[["",{"Type":"Int32"}]]}],["",{"Type":"Bool"}],["z",{"Type":"Array","Count":2,"SubSchemas":
        [["",{"Type":"Float64"}]]}]]})");
    const ISchema outerNew = FromText(R"({"Type":"NamedTuple","SubSchemas":[["m",{"Type":"List",
        "SubSchemas":[["",{"Type":"Int16"}]]}],["",{"Type":"Int8"}],["z",{"Type":"Array","Count":3,"SubSchemas":
        [["",{"Type":"Float64"}]]}]]})");
    const struct
    {
        ISchema Old;
        ISchema New;
        const char* pDifferences; ///< "~" begins a change, "!" an error; the changes first
    } rows[] = {
        {ISchema(EType::Int16), ISchema(EType::Int16), ""},
        {ISchema(EType::Int16), ISchema(EType::Int32), "~c: Type changed from Int16 to Int32.\n"},
        {ISchema(EType::Int32), ISchema(EType::Int16), "!c: Type changed from Int32 to Int16.\n"},
        {ISchema(), ISchema(), "!c: Type changed from Void to Void.\n"},
        {FromText(R"({"Type":"Ref","TypeName":"N"})"), ISchema(EType::Ref), "!c<N>: Type changed from Ref to Ref.\n"},
        {Enum("Enum8", ab), Enum("Enum32", ab), ""},
        {Enum("Enum8", ab), Enum("Enum8", R"(["B",1],["A",0])"), "~c: Enum was modified\n"},
        {Enum("Enum8", ab), Enum("Enum8", R"(["A",0])"), "!c: Enum value B could not be mapped\n"},
        {TQL::MakeTupleSchema({ISchema(EType::Bool)}), TQL::MakeTupleSchema({}),
         "!c: Tuple size changed from 1 to 0.\n"},
        {TQL::MakeTupleSchema({ISchema(EType::Bool), ISchema(EType::Float64), ISchema(EType::UInt8)}),
         TQL::MakeTupleSchema({ISchema(EType::Int8), ISchema(EType::Float32), ISchema(EType::UInt8)}),
         "~c[0]: Type changed from Bool to Int8.\n!c[1]: Type changed from Float64 to Float32.\n"},
        {TQL::MakeListSchema(ISchema(EType::Bool)), ISchema(EType::List), "!c[0]: Type changed from Bool to Void.\n"},
        {outer, outerNew,
         "~c<S>. member was removed.\n~c<S>. member was added.\n!c<S>.m<L>[0]: Type changed from Int32 to Int16.\n"
         "!c<S>.z: Array length changed from 2 to 3.\n"},
        {Struct({{"a", EType::Bool}, {"b", EType::Int8}, {"c", EType::String}}),
         Struct({{"c", EType::String}, {"x", EType::Bool}, {"b", EType::Int16}}),
         "~c.a member was removed.\n~c.x member was added.\n~c: members were re-ordered\n"
         "~c.b: Type changed from Int8 to Int16.\n"},
        {Struct({{"a", EType::Int8}, {"b", EType::Bool}}, {{"", "b"}}),
         Struct({{"n", EType::Int16}, {"b", EType::Bool}}, {{"", "b"}, {"a", "k"}, {"k", "n"}}),
         "~c.a: Type changed from Int8 to Int16.\n"},
        {Struct({{"n", EType::Int8}, {"b", EType::Bool}}, {{"a", "k"}, {"k", "n"}, {"", "b"}}),
         Struct({{"a", EType::Int8}, {"q", EType::Int8}}), "~c.b member was removed.\n~c.q member was added.\n"},
        {Struct({{"a", EType::Int8}}, {{"x", "a"}}), Struct({{"a", EType::Int8}}, {{"y", "a"}}),
         "!c: Schema history has been modified\n"}};
    for (const auto& rRow : rows)
    {
        TQL::SchemaDifferences differences;
        CompareSchemas(rRow.Old, rRow.New, "c", differences);
        std::string text;
        for (const std::string& rChange : differences.Changes)
            text += "~" + rChange + "\n";
        for (const std::string& rError : differences.Errors)
            text += "!" + rError + "\n";
        EXPECT_EQ(text, rRow.pDifferences);
    }
}

std::string ToText(const TQL::EnumMapping& i_rMapping)
{
    std::string text;
    for (const auto& [from, to] : i_rMapping.Values)
        text += std::to_string(from) + ">" + std::to_string(to) + " ";
    for (const std::int32_t value : i_rMapping.Removed)
        text += "-" + std::to_string(value) + " ";
    for (const std::string& rMessage : i_rMapping.Messages)
        text += rMessage + "|";
    return text;
}

TEST(SchemaHistory, MapsEnumValues)
{
    const struct
    {
        ISchema Old;
        ISchema New;
        const char* pMapping;
    } rows[] = {
        {Enum("Enum8", R"(["A",0],["B",1])"), Enum("Enum8", R"(["B",1],["A",0],["C",2])"), ""},
        {Enum("Enum8", R"(["B",5],["A",-3])"), Enum("Enum32", R"(["A",1],["B",2])"), "-3>1 5>2 "},
        {Enum("Enum8", R"(["A",0],["B",0])"), Enum("Enum8", R"(["A",4],["B",4])"), "0>4 "},
        {Enum("Enum8", R"(["B",0],["A",0])"), Enum("Enum8", R"(["A",4],["B",5])"), "0>5 "},
        {Enum("Enum8", R"(["X",0],["A",0])"), Enum("Enum8", R"(["A",4])"), "0>4 Enum value X could not be mapped|"},
        {Enum("Enum8", R"(["A",9],["B",1],["C",2])"),
         Enum("Enum8", R"(["D",1],["",7])", R"(["A",""],["C",""],["B","D"])"), "-2 -9 "},
        {Enum("Enum8", R"(["D",1])", R"(["A","B"],["","E"],["B","D"])"), Enum("Enum8", R"(["A",2])"), "1>2 "},
        {Enum("Enum8", R"(["E",1])", R"(["","E"])"), Enum("Enum8", R"(["E",2])"), "-1 "},
        {Enum("Enum8", R"(["A",1])"), Enum("Enum8", R"(["X",1])", R"(["A",""],["","X"])"), "-1 "},
        {Enum("Enum8", R"(["A",1])", R"(["X","A"])"), Enum("Enum8", R"(["A",1])", R"(["Y","A"])"),
         "Mismatch in enum history|"},
        {Enum("Enum16", R"(["A",255],["B",300],["C",-1])"), Enum("Enum8", R"(["A",255],["B",3],["C",-1])"),
         "-1>-1 255>255 300>3 Enum value Btoo large for enum storage type|"},
        {Enum("Enum32", R"(["A",65535],["B",65536])"), Enum("Enum16", R"(["A",65535],["B",65536])"),
         "Enum value Btoo large for enum storage type|"}};
    for (const auto& rRow : rows)
        EXPECT_EQ(ToText(MapEnum(rRow.Old, rRow.New)), rRow.pMapping);
}

TEST(SchemaReduce, NamedTypesAreKeptOnce)
{
    const ISchema schema = FromText(R"({"Type":"NamedTuple","TypeName":"Outer","Docs":["o"],"SubSchemas":[
        ["a",{"Type":"Array","Count":3,"TypeName":"Inner","History":[["p","q"]],"SubSchemas":[["",{"Type":"Int8"}]]}],
        ["b",{"Type":"List","SubSchemas":[["",{"Type":"Array","Count":3,"TypeName":"Inner","History":[["p","q"]],
        "SubSchemas":[["",{"Type":"Int8"}]]}]]}]]})");
    const std::string before = WriteSchema(schema, TQL::ESchemaTextMode::NamedBrief);
    ISchema reduced = schema;
    TQL::SchemaTypeList types;
    EXPECT_EQ(ReduceSchema(reduced, types), 2u);
    EXPECT_EQ(WriteSchema(reduced, TQL::ESchemaTextMode::NamedBrief), R"({"Type":"Ref","TypeName":"Outer"})");
    ASSERT_EQ(types.size(), 2u);
    EXPECT_EQ(WriteSchema(types[1].SubSchemas[0].Schema, TQL::ESchemaTextMode::NamedBrief),
              R"({"Type":"Ref","Count":3,"TypeName":"Inner","History":[["p","q"]]})");
    TQL::SchemaTypeList none;
    EXPECT_EQ(ReduceSchema(reduced, none), 0u) << "a reference is no new type";

    EXPECT_EQ(ExpandSchema(reduced, types), TQL::Result::Ok);
    EXPECT_EQ(WriteSchema(reduced, TQL::ESchemaTextMode::NamedBrief), before);

    ISchema broken = TQL::MakeTupleSchema({types[1], ISchema(EType::Ref)});
    EXPECT_EQ(ExpandSchema(broken, types), TQL::Result::NotFound);
    EXPECT_EQ(broken.SubSchemas[0].Schema.SubSchemas[0].Schema.Type, EType::Ref) << "left as it was";
    types[0].SubSchemas[0].Schema = FromText(R"({"Type":"Ref","TypeName":"Outer"})");
    EXPECT_EQ(ExpandSchema(broken, types), TQL::Result::InvalidType) << "types that hold one another";
}

} // namespace
