#include "StoreIO/VImportWalk.h"

#include "StoreIO/JsonMembers.h"
#include "StoreIO/SchemaMembers.h"
#include "StoreIO/StoreFormat.h"
#include "StoreIO/ValueFromJson.h"
#include "StoreInterface/EntryFlag.h"
#include "StoreInterface/IStore.h"
#include "StoreInterface/IStoreWriter.h"
#include "TQL/SchemaIntern.h"
#include "TQL/SchemaText.h"

#include <boost/format.hpp>

#include <algorithm>

namespace StoreIO
{
void VImportWalk::ReadRoot(const rapidjson::Value& i_rRoot)
{
    const rapidjson::Value* const pChildren = FindMember(i_rRoot, ChildrenMember);
    if (!pChildren)
        AddMessage("The file has no top-level \"data\" member to read");
    else if (!pChildren->IsObject())
        AddMessage("The value stored under the member \"data\" is not an object");
    else
        ReadChildren(*pChildren, Store::EntryPath(), 0);
}

void VImportWalk::ReadChildren(const rapidjson::Value& i_rChildren, const Store::EntryPath& i_rPath,
                               std::size_t i_Depth)
{
    for (const auto& rMember : i_rChildren.GetObject())
    {
        const std::string_view name = TextOf(rMember.name);
        if (!rMember.value.IsObject())
            return AddMessage(
                "Expected to encounter a json object as the value of member '%1%' at path '%2%', (Element "
                "XPath=\"%3%\")",
                name, i_rPath.Text(), XPathText(i_rPath.Text()));
        const std::size_t depth = i_Depth + 1 + static_cast<std::size_t>(std::ranges::count(name, '/'));
        if (i_rPath.IsRoot() && (name.empty() || name.front() == '/'))
            AddMessage("Encountered '%1%', which names no entry, (Element XPath=\"%2%\")", name,
                       XPathText(i_rPath.Text()));
        else if (depth > MaximumPathDepth || i_rPath.Text().size() + 1 + name.size() > MaximumPathSize)
            AddMessage("Encountered a path longer than %1% bytes or %2% levels, (Element XPath=\"%3%\")",
                       MaximumPathSize, MaximumPathDepth, XPathText(i_rPath.Text()));
        else
            ReadEntry(rMember.value, i_rPath / name, depth);
    }
}

void VImportWalk::ReadEntry(const rapidjson::Value& i_rEntry, const Store::EntryPath& i_rPath, std::size_t i_Depth)
{
    const rapidjson::Value* const pProposed = FindMember(i_rEntry, ProposedMember);
    const rapidjson::Value* const pVerified = FindMember(i_rEntry, ValueMember);
    const TQL::ISchema* const pSchema = pProposed || pVerified ? ReadSchemaOf(i_rEntry, i_rPath) : nullptr;
    if (pSchema)
    {
        const Store::EntryHandle entry = m_rWriter.GetStore().GetEntry(i_rPath);
        if (pProposed)
            SetValue(*pProposed, *pSchema, i_rPath, ProposedMember,
                     [&](Store::StoreValue&& i_rrValue)
                     {
                         const TQL::IResult flagged = m_rWriter.EnableFlags(entry, Store::EntryFlag::VerifyRequired);
                         return flagged.IsError() ? flagged : m_rWriter.SetProposedValue(entry, std::move(i_rrValue));
                     });
        if (pVerified)
            SetValue(*pVerified, *pSchema, i_rPath, ValueMember,
                     [&](Store::StoreValue&& i_rrValue)
                     { return m_rWriter.SetVerifiedValue(entry, std::move(i_rrValue)); });
    }
    const rapidjson::Value* const pChildren = FindMember(i_rEntry, ChildrenMember);
    if (pChildren && pChildren->IsObject())
        ReadChildren(*pChildren, i_rPath, i_Depth);
}

/// Most entries have a type that one of the last few before had too.
const TQL::ISchema* VImportWalk::ReadSchemaOf(const rapidjson::Value& i_rEntry, const Store::EntryPath& i_rPath)
{
    for (const TypedEntry& rRecent : m_RecentEntries)
        if (rRecent.pEntry && HaveSameSchemaText(*rRecent.pEntry, i_rEntry))
            return rRecent.pSchema;
    WriteSchemaText(i_rEntry, m_SchemaText);
    const std::string_view text(m_SchemaText.GetString(), m_SchemaText.GetSize());
    auto known = m_Schemas.find(text);
    if (known == m_Schemas.end())
    {
        TQL::ISchema schema;
        if (TQL::ReadSchema(text, schema).IsError())
        {
            AddMessage("Encountered '%1%', and unable to set value schema from '%2%'. (Element XPath=\"%3%\")",
                       i_rPath.Leaf(), text, XPathText(i_rPath.Text()));
            return nullptr;
        }
        known = m_Schemas.emplace(text, &TQL::IO::GetUniqueSchema(schema)).first;
    }
    m_RecentEntries[m_NextRecent++ % m_RecentEntries.size()] = {&i_rEntry, known->second};
    return known->second;
}

template <typename TSet>
void VImportWalk::SetValue(const rapidjson::Value& i_rJson, const TQL::ISchema& i_rSchema,
                           const Store::EntryPath& i_rPath, std::string_view i_Member, const TSet& i_rSet)
{
    Store::StoreValue value = ValueFromJson(i_rJson, i_rSchema);
    if (value.IsEmpty())
        return AddMessage("Encountered '%1%' with invalid '%2%', (Element XPath=\"%3%\")", i_rPath.Leaf(), i_Member,
                          XPathText(i_rPath.Text()));
    // A name that is a wildcard, or a second member of that name with another type.
    if (const TQL::IResult set = i_rSet(std::move(value)); set.IsError())
        AddMessage("Encountered '%1%', and unable to set '%2%': %3% (Element XPath=\"%4%\")", i_rPath.Leaf(), i_Member,
                   set.Description(), XPathText(i_rPath.Text()));
}

template <typename... Args>
void VImportWalk::AddMessage(const char* i_pFormat, const Args&... i_rArgs)
{
    boost::format format(i_pFormat);
    m_Messages.push_back((format % ... % i_rArgs).str());
}

} // namespace StoreIO
