#pragma once

#include "StoreInterface/EntryPath.h"
#include "TQL/ISchema.h"
#include "TQL/RapidJson.h"

#include <array>
#include <cstddef>
#include <functional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace TQL
{
class IStoreWriter;
}

namespace StoreIO
{

/// Goes once through a document that ReadJson made and stages what it holds. Lives for one import, inside a write of
/// the store, on its thread. What is wrong becomes a message and does not stop the walk, but for a child that is no
/// object: the rest of its siblings is left out.
class VImportWalk
{
public:
    explicit VImportWalk(TQL::IStoreWriter& i_rWriter) : m_rWriter(i_rWriter) {}

    /// Reads the document, an object of a supported version.
    void ReadRoot(const rapidjson::Value& i_rRoot);

    /// One for each thing that was wrong, in the order of the document.
    const std::vector<std::string>& Messages() const { return m_Messages; }

private:
    struct TextHash
    {
        using is_transparent = void;
        std::size_t operator()(std::string_view i_Text) const noexcept { return std::hash<std::string_view>()(i_Text); }
    };

    void ReadChildren(const rapidjson::Value& i_rChildren, const Store::EntryPath& i_rPath, std::size_t i_Depth);
    void ReadEntry(const rapidjson::Value& i_rEntry, const Store::EntryPath& i_rPath, std::size_t i_Depth);
    const TQL::ISchema* ReadSchemaOf(const rapidjson::Value& i_rEntry, const Store::EntryPath& i_rPath);
    template <typename TSet>
    void SetValue(const rapidjson::Value& i_rJson, const TQL::ISchema& i_rSchema, const Store::EntryPath& i_rPath,
                  std::string_view i_Member, const TSet& i_rSet);
    template <typename... Args>
    void AddMessage(const char* i_pFormat, const Args&... i_rArgs);

    struct TypedEntry
    {
        const rapidjson::Value* pEntry = nullptr;
        const TQL::ISchema* pSchema = nullptr;
    };

    TQL::IStoreWriter& m_rWriter;
    std::vector<std::string> m_Messages;
    std::array<TypedEntry, 8> m_RecentEntries; ///< of different types
    std::size_t m_NextRecent = 0;
    rapidjson::StringBuffer m_SchemaText; ///< of the entry being read; kept for its memory
    std::unordered_map<std::string, const TQL::ISchema*, TextHash, std::equal_to<>> m_Schemas; ///< by their texts
};

} // namespace StoreIO
