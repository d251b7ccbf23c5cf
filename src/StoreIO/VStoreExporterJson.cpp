#include "StoreIO/VStoreExporterJson.h"

#include "StoreIO/JsonMembers.h"
#include "StoreIO/StoreFormat.h"
#include "StoreIO/StoreIOLog.h"
#include "StoreIO/VJsonLayoutWriter.h"
#include "StoreIO/ValueToJson.h"
#include "StoreInterface/EntryFlag.h"
#include "StoreInterface/IStore.h"
#include "StoreInterface/IStoreReader.h"
#include "TQL/ISchema.h"
#include "TQL/SchemaText.h"
#include "UtilsFileSystem/FileIO.h"

#include <algorithm>
#include <cstring>
#include <unordered_map>
#include <utility>
#include <vector>

namespace StoreIO
{
namespace
{

using rapidjson::SizeType;
using Store::EntryHandle;

constexpr const char* s_pNoSchema = "Failed trying to write the schema for entry path '%1%'";
constexpr const char* s_pTooDeep = "Failed trying to write entry path '%1%', it is longer than %2% bytes or %3% levels";
constexpr const char* s_pNoValue = "Failed trying to write values for entry path '%1%', entry has no values set.";

/// Walks a store and adds its entries to a document that is being populated. An object counts its members as they are
/// added; the number is told at its end.
class VEntryWalk
{
public:
    VEntryWalk(TQL::IStoreReader& i_rReader, rapidjson::Document& i_rTarget)
        : m_rReader(i_rReader), m_rTarget(i_rTarget)
    {
    }

    /// Adds the value of the root's "Children". How deep the tree is does not matter to the stack.
    void AddChildren();

    bool HasFailed() const { return m_bFailed; }

private:
    /// An entry whose children are being added.
    struct Level
    {
        std::vector<EntryHandle> Children;
        std::size_t Next = 0;
        SizeType MemberCount = 0; ///< of the entry, "Children" included
    };

    void Begin(EntryHandle i_Entry, SizeType i_MemberCount);
    void AddEntry(EntryHandle i_Entry);
    SizeType AddMembers(EntryHandle i_Entry);
    SizeType AddValues(EntryHandle i_Entry, const TQL::ISchema& i_rSchema);
    SizeType AddSchema(const TQL::ISchema& i_rSchema);
    bool FitsFile(EntryHandle i_Entry);
    void Fail(const char* i_pMessage, EntryHandle i_Entry);

    TQL::IStoreReader& m_rReader;
    rapidjson::Document& m_rTarget;
    std::vector<Level> m_Levels;
    std::unordered_map<const TQL::ISchema*, rapidjson::Document> m_Schemas; ///< their texts, read once each
    bool m_bFailed = false;
};

void VEntryWalk::AddChildren()
{
    Begin(m_rReader.GetStore().GetRoot(), 0);
    auto& rChildren = m_Levels.back().Children;
    std::stable_partition(rChildren.begin(), rChildren.end(),
                          [this](EntryHandle i_Entry)
                          { return m_rReader.GetStore().GetEntryPath(i_Entry).Leaf() == VersionsEntry; });
    while (!m_Levels.empty())
    {
        Level& rLevel = m_Levels.back();
        if (rLevel.Next < rLevel.Children.size())
        {
            AddEntry(rLevel.Children[rLevel.Next++]);
            continue;
        }
        const SizeType memberCount = rLevel.MemberCount;
        m_rTarget.EndObject(static_cast<SizeType>(rLevel.Children.size()));
        m_Levels.pop_back();
        if (!m_Levels.empty())
            m_rTarget.EndObject(memberCount);
    }
}

void VEntryWalk::Begin(EntryHandle i_Entry, SizeType i_MemberCount)
{
    m_Levels.push_back({m_rReader.GetChildren(i_Entry), 0, i_MemberCount});
    m_rTarget.StartObject();
}

void VEntryWalk::AddEntry(EntryHandle i_Entry)
{
    AddName(m_rTarget, m_rReader.GetStore().GetEntryPath(i_Entry).Leaf());
    m_rTarget.StartObject();
    const bool bFits = FitsFile(i_Entry);
    const SizeType memberCount = bFits ? AddMembers(i_Entry) : 0;
    if (!bFits || !m_rReader.HasChildren(i_Entry))
    {
        m_rTarget.EndObject(memberCount);
        return;
    }
    AddName(m_rTarget, ChildrenMember);
    Begin(i_Entry, memberCount + 1);
}

/// All but "Children". Gives how many were added.
SizeType VEntryWalk::AddMembers(EntryHandle i_Entry)
{
    if (!m_rReader.HasValue(i_Entry))
        return 0;
    const TQL::ISchema& rSchema = m_rReader.GetValueSchema(i_Entry);
    if (rSchema.Type != TQL::EType::Void)
    {
        const SizeType valueCount = AddValues(i_Entry, rSchema);
        return valueCount + AddSchema(rSchema);
    }
    Fail(s_pNoSchema, i_Entry);
    return 0;
}

SizeType VEntryWalk::AddValues(EntryHandle i_Entry, const TQL::ISchema& i_rSchema)
{
    SizeType count = 0;
    const auto add = [&](std::string_view i_Name, const Store::StoreValue& i_rValue)
    {
        if (AddValueMember(m_rTarget, i_Name, i_rSchema, i_rValue.Bytes()))
            ++count;
        else
            Fail(s_pNoValue, i_Entry);
    };
    const Store::StoreValue& rVerified = m_rReader.GetVerifiedValue(i_Entry);
    const Store::StoreValue& rProposed = m_rReader.GetProposedValue(i_Entry);
    const bool bProposed = (m_rReader.GetFlags(i_Entry) & Store::EntryFlag::VerifyRequired) && !rProposed.IsEmpty();
    if (bProposed)
        add(ProposedMember, rProposed);
    if (!rVerified.IsEmpty())
        add(ValueMember, rVerified);
    else if (!bProposed)
        Fail(s_pNoValue, i_Entry);
    return count;
}

SizeType VEntryWalk::AddSchema(const TQL::ISchema& i_rSchema)
{
    // Interned, so the same schema has the same address.
    const auto [found, bNew] = m_Schemas.try_emplace(&i_rSchema);
    rapidjson::Document& rMembers = found->second;
    if (bNew)
    {
        // The strings of a text that is read in place refer to it: the text lives with the target, which shares them.
        const std::string text = TQL::WriteSchema(i_rSchema, TQL::ESchemaTextMode::NamedBrief);
        auto* const pText = static_cast<char*>(m_rTarget.GetAllocator().Malloc(text.size() + 1));
        std::memcpy(pText, text.c_str(), text.size() + 1);
        rMembers.ParseInsitu<rapidjson::kParseIterativeFlag>(pText);
    }
    for (const auto& rMember : std::as_const(rMembers).GetObject())
    {
        rMember.name.Accept(m_rTarget);
        rMember.value.Accept(m_rTarget);
    }
    return rMembers.MemberCount();
}

/// Nothing is written that the importer would refuse.
bool VEntryWalk::FitsFile(EntryHandle i_Entry)
{
    const std::string& rPath = m_rReader.GetStore().GetEntryPath(i_Entry).Text();
    if (m_Levels.size() <= MaximumPathDepth && rPath.size() <= MaximumPathSize)
        return true;
    LogError(s_pTooDeep, rPath.substr(0, MaximumPathSize), MaximumPathSize, MaximumPathDepth);
    m_bFailed = true;
    return false;
}

void VEntryWalk::Fail(const char* i_pMessage, EntryHandle i_Entry)
{
    LogError(i_pMessage, m_rReader.GetStore().GetEntryPath(i_Entry).Text());
    m_bFailed = true;
}

/// The members that an export does not make. Gives how many they are.
SizeType AddOtherMembers(const rapidjson::Value& i_rFrom, rapidjson::Document& i_rTarget)
{
    SizeType count = 0;
    for (const auto& rMember : i_rFrom.GetObject())
    {
        const std::string_view name = TextOf(rMember.name);
        if (name == VersionMember || name == ChildrenMember)
            continue;
        AddName(i_rTarget, name);
        rMember.value.Accept(i_rTarget);
        ++count;
    }
    return count;
}

} // namespace

TQL::IResult VStoreExporterJson::Export(TQL::IStoreReader& i_rReader)
{
    if (!m_Document.IsNull() && !m_Document.IsObject())
    {
        LogError("The Json document is not of type Object or Null");
        return TQL::Result::InvalidArgument;
    }
    // A document of its own: what an earlier export has left is freed when this one has succeeded.
    rapidjson::Document made;
    const auto build = [&](rapidjson::Document& i_rTarget)
    {
        i_rTarget.StartObject();
        const SizeType count = m_Document.IsNull() ? 0 : AddOtherMembers(m_Document, i_rTarget);
        AddName(i_rTarget, VersionMember);
        AddText(i_rTarget, VersionText(CurrentFormat));
        AddName(i_rTarget, ChildrenMember);
        VEntryWalk walk(i_rReader, i_rTarget);
        walk.AddChildren();
        i_rTarget.EndObject(count + 2);
        return !walk.HasFailed();
    };
    made.Populate(build);
    if (made.IsNull())
        return TQL::Result::Failed;
    m_Document.Swap(made);
    return TQL::Result::Ok;
}

TQL::IResult VStoreExporterJson::WriteToStream(TQL::IOutputStream& i_rStream) const
{
    const TQL::IResult result = VJsonLayoutWriter(i_rStream).Write(m_Document);
    if (result.IsError())
        LogError("Error streaming document : %1%", result.Description());
    return result;
}

TQL::IResult VStoreExporterJson::WriteToFile(const std::string& i_rPath, UtilsFileSystem::EWriteMode i_Mode) const
{
    const auto write = [this](const std::string& i_rSidePath)
    {
        auto [pFile, opened] = UtilsFileSystem::OpenOutputFile(i_rSidePath, UtilsFileSystem::EOpenMode::Text, true);
        if (!pFile)
            return opened;
        UtilsFileSystem::VFileOutputStreamVirtual stream(std::move(*pFile));
        return VJsonLayoutWriter(stream).Write(m_Document);
    };
    const TQL::IResult result = UtilsFileSystem::ProtectedSave(write, i_rPath, i_Mode);
    const bool bRefused = i_Mode == UtilsFileSystem::EWriteMode::Exclusive && result == TQL::Result::AlreadyPresent;
    if (result.IsError() && !bRefused)
        LogError("Error writing document %1%: %2%", i_rPath, result.Description());
    return result;
}

} // namespace StoreIO
