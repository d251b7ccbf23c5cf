#include "TQL/RapidJson.h"
#include "TQL/SchemaText.h"

#include <limits>

namespace TQL
{
namespace
{

using Json = rapidjson::Value;

constexpr int MaximumDepth = 64;

bool Read(const Json& i_rJson, ISchema& o_rSchema, int i_Depth);

bool Read(const Json& i_rJson, std::string& o_rText, int)
{
    if (!i_rJson.IsString())
        return false;
    o_rText.assign(i_rJson.GetString(), i_rJson.GetStringLength());
    return true;
}

bool Read(const Json& i_rJson, EType& o_rType, int)
{
    const auto type = i_rJson.IsString() ? FindType({i_rJson.GetString(), i_rJson.GetStringLength()}) : std::nullopt;
    o_rType = type.value_or(EType::Void);
    return type.has_value();
}

bool Read(const Json& i_rJson, ERole& o_rRole, int)
{
    const auto role = i_rJson.IsString() ? FindRole({i_rJson.GetString(), i_rJson.GetStringLength()}) : std::nullopt;
    o_rRole = role.value_or(ERole::Value);
    return role.has_value();
}

template <typename Unsigned>
bool ReadUnsigned(const Json& i_rJson, Unsigned& o_rValue)
{
    if (!i_rJson.IsUint() || i_rJson.GetUint() > std::numeric_limits<Unsigned>::max())
        return false;
    o_rValue = static_cast<Unsigned>(i_rJson.GetUint());
    return true;
}

bool Read(const Json& i_rJson, std::uint16_t& o_rValue, int)
{
    return ReadUnsigned(i_rJson, o_rValue);
}

bool Read(const Json& i_rJson, std::uint32_t& o_rValue, int)
{
    return ReadUnsigned(i_rJson, o_rValue);
}

bool Read(const Json& i_rJson, std::int32_t& o_rValue, int)
{
    if (!i_rJson.IsInt())
        return false;
    o_rValue = i_rJson.GetInt();
    return true;
}

template <typename First, typename Second>
bool ReadPair(const Json& i_rJson, First& o_rFirst, Second& o_rSecond, int i_Depth)
{
    return i_rJson.IsArray() && i_rJson.Size() == 2 && Read(i_rJson[0], o_rFirst, i_Depth) &&
           Read(i_rJson[1], o_rSecond, i_Depth);
}

bool Read(const Json& i_rJson, SchemaEnumValue& o_rValue, int i_Depth)
{
    return ReadPair(i_rJson, o_rValue.Name, o_rValue.Value, i_Depth);
}

bool Read(const Json& i_rJson, SchemaMember& o_rMember, int i_Depth)
{
    return ReadPair(i_rJson, o_rMember.Name, o_rMember.Schema, i_Depth + 1);
}

bool Read(const Json& i_rJson, SchemaRename& o_rRename, int i_Depth)
{
    return ReadPair(i_rJson, o_rRename.From, o_rRename.To, i_Depth);
}

template <typename T>
bool Read(const Json& i_rJson, std::vector<T>& o_rList, int i_Depth)
{
    if (!i_rJson.IsArray())
        return false;
    o_rList.resize(i_rJson.Size());
    for (rapidjson::SizeType i = 0; i < i_rJson.Size(); ++i)
    {
        if (!Read(i_rJson[i], o_rList[i], i_Depth))
            return false;
    }
    return true;
}

template <typename T>
bool ReadMember(const Json& i_rObject, const char* i_pName, T& o_rValue, int i_Depth)
{
    const auto member = i_rObject.FindMember(i_pName);
    return member == i_rObject.MemberEnd() || Read(member->value, o_rValue, i_Depth);
}

bool Read(const Json& i_rJson, ISchema& o_rSchema, int i_Depth)
{
    return i_rJson.IsObject() && i_Depth < MaximumDepth && ReadMember(i_rJson, "Type", o_rSchema.Type, i_Depth) &&
           ReadMember(i_rJson, "Role", o_rSchema.Role, i_Depth) &&
           ReadMember(i_rJson, "Detail", o_rSchema.Detail, i_Depth) &&
           ReadMember(i_rJson, "Count", o_rSchema.Count, i_Depth) &&
           ReadMember(i_rJson, "TypeName", o_rSchema.TypeName, i_Depth) &&
           ReadMember(i_rJson, "EnumValues", o_rSchema.EnumValues, i_Depth) &&
           ReadMember(i_rJson, "SubSchemas", o_rSchema.SubSchemas, i_Depth) &&
           ReadMember(i_rJson, "Docs", o_rSchema.Docs, i_Depth) &&
           ReadMember(i_rJson, "History", o_rSchema.History, i_Depth);
}

} // namespace

IResult ReadSchema(std::string_view i_Text, ISchema& o_rSchema)
{
    rapidjson::Document document;
    // Iterative: a text of brackets alone must not use up the stack.
    document.Parse<rapidjson::kParseIterativeFlag>(i_Text.data(), i_Text.size());
    ISchema schema;
    if (document.HasParseError() || !Read(document, schema, 0))
        return Result::InvalidFormat;
    o_rSchema = std::move(schema);
    return Result::Ok;
}

} // namespace TQL
