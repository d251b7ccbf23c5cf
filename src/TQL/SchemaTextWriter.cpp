#include "TQL/JsonText.h"
#include "TQL/SchemaText.h"

#include <concepts>

namespace TQL
{
namespace
{

using JsonText::AppendNumber;
using JsonText::AppendQuoted;

void Append(std::string& o_rText, const ISchema& i_rSchema, ESchemaTextMode i_Mode);

void Append(std::string& o_rText, EType i_Type, ESchemaTextMode)
{
    AppendQuoted(o_rText, GetName(i_Type));
}

void Append(std::string& o_rText, ERole i_Role, ESchemaTextMode)
{
    AppendQuoted(o_rText, GetName(i_Role));
}

template <std::integral Integer>
void Append(std::string& o_rText, Integer i_Value, ESchemaTextMode)
{
    AppendNumber(o_rText, std::int64_t{i_Value});
}

void Append(std::string& o_rText, const std::string& i_rText, ESchemaTextMode)
{
    AppendQuoted(o_rText, i_rText);
}

template <typename First, typename Second>
void AppendPair(std::string& o_rText, const First& i_rFirst, const Second& i_rSecond, ESchemaTextMode i_Mode)
{
    o_rText += '[';
    Append(o_rText, i_rFirst, i_Mode);
    o_rText += ',';
    Append(o_rText, i_rSecond, i_Mode);
    o_rText += ']';
}

void Append(std::string& o_rText, const SchemaEnumValue& i_rValue, ESchemaTextMode i_Mode)
{
    AppendPair(o_rText, i_rValue.Name, i_rValue.Value, i_Mode);
}

void Append(std::string& o_rText, const SchemaMember& i_rMember, ESchemaTextMode i_Mode)
{
    AppendPair(o_rText, i_rMember.Name, i_rMember.Schema, i_Mode);
}

void Append(std::string& o_rText, const SchemaRename& i_rRename, ESchemaTextMode i_Mode)
{
    AppendPair(o_rText, i_rRename.From, i_rRename.To, i_Mode);
}

template <typename T>
void Append(std::string& o_rText, const std::vector<T>& i_rList, ESchemaTextMode i_Mode)
{
    if (i_Mode == ESchemaTextMode::Counts)
    {
        AppendNumber(o_rText, std::uint64_t{i_rList.size()});
        return;
    }
    o_rText += '[';
    for (std::size_t i = 0; i < i_rList.size(); ++i)
    {
        if (i != 0)
            o_rText += ',';
        Append(o_rText, i_rList[i], i_Mode);
    }
    o_rText += ']';
}

template <auto Field>
void AppendField(std::string& o_rText, const ISchema& i_rSchema, ESchemaTextMode i_Mode)
{
    Append(o_rText, i_rSchema.*Field, i_Mode);
}

/// One member of the textual form: its name, its text in a default schema, and how it is written.
struct MemberRow
{
    std::string_view Name;
    std::string_view DefaultText;
    void (*pAppend)(std::string& o_rText, const ISchema& i_rSchema, ESchemaTextMode i_Mode);
};

constexpr MemberRow s_Members[] = {
    {"Type", "\"Void\"", AppendField<&ISchema::Type>},       {"Role", "\"Value\"", AppendField<&ISchema::Role>},
    {"Detail", "0", AppendField<&ISchema::Detail>},          {"Count", "0", AppendField<&ISchema::Count>},
    {"TypeName", "\"\"", AppendField<&ISchema::TypeName>},   {"EnumValues", "[]", AppendField<&ISchema::EnumValues>},
    {"SubSchemas", "[]", AppendField<&ISchema::SubSchemas>}, {"Docs", "[]", AppendField<&ISchema::Docs>},
    {"History", "[]", AppendField<&ISchema::History>}};

void AppendMembers(std::string& o_rText, const ISchema& i_rSchema, ESchemaTextMode i_Mode)
{
    const bool bNamed = i_Mode == ESchemaTextMode::Named || i_Mode == ESchemaTextMode::NamedBrief;
    bool bFirst = true;
    for (const MemberRow& rMember : s_Members)
    {
        const std::size_t start = o_rText.size();
        if (!bFirst)
            o_rText += ',';
        if (bNamed)
        {
            AppendQuoted(o_rText, rMember.Name);
            o_rText += ':';
        }
        const std::size_t value = o_rText.size();
        rMember.pAppend(o_rText, i_rSchema, i_Mode);
        if (i_Mode == ESchemaTextMode::NamedBrief && std::string_view(o_rText).substr(value) == rMember.DefaultText)
            o_rText.resize(start);
        else
            bFirst = false;
    }
}

void Append(std::string& o_rText, const ISchema& i_rSchema, ESchemaTextMode i_Mode)
{
    const bool bPositional = i_Mode == ESchemaTextMode::Positional;
    o_rText += bPositional ? '[' : '{';
    AppendMembers(o_rText, i_rSchema, i_Mode);
    o_rText += bPositional ? ']' : '}';
}

} // namespace

std::string WriteSchema(const ISchema& i_rSchema, ESchemaTextMode i_Mode)
{
    std::string text;
    if (i_Mode == ESchemaTextMode::Counts)
        AppendMembers(text, i_rSchema, i_Mode);
    else
        Append(text, i_rSchema, i_Mode);
    return text;
}

} // namespace TQL
