#include "TQL/ISchema.h"

#include "TQL/HashMix.h"

#include <algorithm>
#include <array>

namespace TQL
{
namespace
{

constexpr std::array<std::string_view, TypeCount> s_TypeNames = {
    "Void",    "Bool",   "Int8",  "Int16", "Int32", "Int64",      "UInt8", "UInt16", "UInt32", "UInt64", "Float32",
    "Float64", "String", "Array", "List",  "Tuple", "NamedTuple", "Enum8", "Enum16", "Enum32", "Ref"};

constexpr std::array<std::string_view, RoleCount> s_RoleNames = {"Value",       "Function", "Callback", "Input",
                                                                 "InputOutput", "Output",   "Return",   "Result"};

template <typename TEnum, std::size_t N>
std::string_view NameOf(const std::array<std::string_view, N>& i_rNames, TEnum i_Value) noexcept
{
    const auto index = static_cast<std::size_t>(i_Value);
    return index < N ? i_rNames[index] : "Unspecified";
}

template <typename TEnum, std::size_t N>
std::optional<TEnum> Find(const std::array<std::string_view, N>& i_rNames, std::string_view i_Name) noexcept
{
    const auto name = std::ranges::find(i_rNames, i_Name);
    if (name == i_rNames.end())
        return std::nullopt;
    return static_cast<TEnum>(name - i_rNames.begin());
}

} // namespace

std::string_view GetName(EType i_Type) noexcept
{
    return NameOf(s_TypeNames, i_Type);
}

std::string_view GetName(ERole i_Role) noexcept
{
    return NameOf(s_RoleNames, i_Role);
}

std::optional<EType> FindType(std::string_view i_Name) noexcept
{
    return Find<EType>(s_TypeNames, i_Name);
}

std::optional<ERole> FindRole(std::string_view i_Name) noexcept
{
    return Find<ERole>(s_RoleNames, i_Name);
}

ISchema MakeEnumSchema(EType i_Storage, std::string i_TypeName, std::vector<SchemaEnumValue> i_Values)
{
    ISchema schema(i_Storage);
    schema.TypeName = std::move(i_TypeName);
    schema.EnumValues = std::move(i_Values);
    return schema;
}

ISchema MakeArraySchema(ISchema i_Element, std::uint32_t i_Count)
{
    ISchema schema(EType::Array);
    schema.Count = i_Count;
    schema.SubSchemas.push_back({"", std::move(i_Element)});
    return schema;
}

ISchema MakeListSchema(ISchema i_Element)
{
    ISchema schema(EType::List);
    schema.SubSchemas.push_back({"", std::move(i_Element)});
    return schema;
}

ISchema MakeTupleSchema(std::vector<ISchema> i_Members)
{
    ISchema schema(EType::Tuple);
    for (ISchema& rMember : i_Members)
        schema.SubSchemas.push_back({"", std::move(rMember)});
    return schema;
}

ISchema MakeNamedTupleSchema(std::string i_TypeName, std::vector<SchemaMember> i_Members)
{
    ISchema schema(EType::NamedTuple);
    schema.TypeName = std::move(i_TypeName);
    schema.SubSchemas = std::move(i_Members);
    return schema;
}

bool HaveSameShape(const ISchema& i_rA, const ISchema& i_rB) noexcept
{
    const auto sameMember = [](const SchemaMember& i_rMemberA, const SchemaMember& i_rMemberB)
    {
        return i_rMemberA.Name == i_rMemberB.Name && HaveSameShape(i_rMemberA.Schema, i_rMemberB.Schema);
    };
    return i_rA.Type == i_rB.Type && i_rA.Role == i_rB.Role && i_rA.Count == i_rB.Count &&
           (i_rA.Type != EType::Ref || i_rA.TypeName == i_rB.TypeName) && i_rA.EnumValues == i_rB.EnumValues &&
           std::ranges::equal(i_rA.SubSchemas, i_rB.SubSchemas, sameMember);
}

std::uint64_t HashShape(const ISchema& i_rSchema) noexcept
{
    std::uint64_t hash =
        HashMix(static_cast<std::uint64_t>(i_rSchema.Type), static_cast<std::uint64_t>(i_rSchema.Role));
    hash = HashMix(hash, i_rSchema.Count);
    if (i_rSchema.Type == EType::Ref)
        hash = HashMix(hash, HashText(i_rSchema.TypeName));
    for (const SchemaEnumValue& rValue : i_rSchema.EnumValues)
        hash = HashMix(HashMix(hash, HashText(rValue.Name)), static_cast<std::uint32_t>(rValue.Value));
    for (const SchemaMember& rMember : i_rSchema.SubSchemas)
        hash = HashMix(HashMix(hash, HashText(rMember.Name)), HashShape(rMember.Schema));
    return hash;
}

} // namespace TQL
