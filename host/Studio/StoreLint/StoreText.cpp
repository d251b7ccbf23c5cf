#include "Studio/StoreLint/StoreText.h"

#include "Store/ValueTextWriter.h"
#include "StoreInterface/IStore.h"
#include "StoreInterface/IStoreReader.h"
#include "TQL/ISchema.h"
#include "TQL/JsonText.h"

namespace Studio
{
namespace
{

std::string MembersText(const TQL::ISchema& i_rSchema)
{
    std::string text = " (";
    for (const TQL::SchemaMember& rMember : i_rSchema.SubSchemas)
        text += (&rMember == &i_rSchema.SubSchemas.front() ? "" : ", ") +
                (rMember.Name.empty() ? "" : rMember.Name + ": ") + TypeText(rMember.Schema);
    return text + ")";
}

std::string ElementText(const TQL::ISchema& i_rSchema)
{
    return i_rSchema.SubSchemas.size() == 1 ? TypeText(i_rSchema.SubSchemas.front().Schema) : "?";
}

std::string ValueText(const Store::StoreValue& i_rValue)
{
    std::string text;
    return Store::AppendValueText(text, *i_rValue.Schema(), i_rValue.Bytes()) ? Shortened(text) : "?";
}

void AppendEntry(std::string& o_rText, const TQL::IStoreReader& i_rReader, Store::EntryHandle i_Entry,
                 std::size_t i_Depth)
{
    o_rText.append(2 * i_Depth, ' ');
    TQL::JsonText::AppendEscaped(o_rText, i_rReader.GetStore().GetEntryPath(i_Entry).Leaf());
    const Store::StoreValue& rVerified = i_rReader.GetVerifiedValue(i_Entry);
    const Store::StoreValue& rProposed = i_rReader.GetProposedValue(i_Entry);
    if (i_rReader.HasValue(i_Entry))
        o_rText += ": " + TypeText(i_rReader.GetValueSchema(i_Entry));
    if (!rVerified.IsEmpty())
        o_rText += " = " + ValueText(rVerified);
    if (!rProposed.IsEmpty())
        o_rText += ", proposed " + ValueText(rProposed);
    o_rText += '\n';
    for (const Store::EntryHandle child : i_rReader.GetChildren(i_Entry))
        AppendEntry(o_rText, i_rReader, child, i_Depth + 1);
}

} // namespace

std::string TypeText(const TQL::ISchema& i_rSchema)
{
    const std::string name(TQL::GetName(i_rSchema.Type));
    if (!i_rSchema.TypeName.empty())
        return i_rSchema.TypeName;
    switch (i_rSchema.Type)
    {
    case TQL::EType::List:
        return name + " of " + ElementText(i_rSchema);
    case TQL::EType::Array:
        return name + " of " + std::to_string(i_rSchema.Count) + " " + ElementText(i_rSchema);
    case TQL::EType::Tuple:
    case TQL::EType::NamedTuple:
        return name + MembersText(i_rSchema);
    default:
        return name;
    }
}

std::string Shortened(std::string_view i_Text)
{
    constexpr std::size_t most = 120;
    if (i_Text.size() <= most)
        return std::string(i_Text);
    std::size_t end = most;
    while ((static_cast<unsigned char>(i_Text[end]) & 0xC0) == 0x80) // inside a character
        --end;
    return std::string(i_Text.substr(0, end)) + "...";
}

std::string FormatStoreTree(const TQL::IStoreReader& i_rReader)
{
    std::string text;
    for (const Store::EntryHandle entry : i_rReader.GetChildren(i_rReader.GetStore().GetRoot()))
        AppendEntry(text, i_rReader, entry, 0);
    return text;
}

} // namespace Studio
