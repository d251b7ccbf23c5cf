#pragma once

#include "Store/VStore.h"
#include "Store/ValueTextWriter.h"
#include "StoreIO/VStoreExporterJson.h"
#include "StoreIO/VStoreImporterJson.h"
#include "StoreInterface/ScopedAccess.h"
#include "TQL/ISchema.h"

#include <algorithm>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <utility>

namespace StoreIOTest
{

/// Gives a text in small pieces, and the result that it is told to at the end.
class TextInput : public TQL::IInputStream
{
public:
    explicit TextInput(std::string_view i_Text, TQL::IResult i_AtEnd = TQL::Result::Ok)
        : m_Text(i_Text), m_AtEnd(i_AtEnd)
    {
    }

    std::pair<std::size_t, TQL::IResult> Read(std::span<std::byte> o_Bytes) override
    {
        const std::size_t count = std::min(o_Bytes.size(), m_Text.size());
        std::memcpy(o_Bytes.data(), m_Text.data(), count);
        m_Text.remove_prefix(count);
        return {count, count < o_Bytes.size() ? m_AtEnd : TQL::Result::Ok};
    }

private:
    std::string_view m_Text;
    TQL::IResult m_AtEnd;
};

class TextOutput : public TQL::IOutputStream
{
public:
    TQL::IResult Write(std::span<const std::byte> i_Bytes) override
    {
        Text.append(reinterpret_cast<const char*>(i_Bytes.data()), i_Bytes.size());
        return TQL::Result::Ok;
    }
    TQL::IResult Flush() override { return TQL::Result::Ok; }

    std::string Text;
};

inline std::shared_ptr<TQL::IStore> MakeStore()
{
    return TQL::MakeShared<Store::VStore>();
}

/// Reads the text and imports it if that went well. Gives the last result.
inline TQL::IResult ImportText(TQL::IStore& i_rStore, std::string_view i_Text)
{
    StoreIO::VStoreImporterJson importer;
    TextInput input(i_Text);
    const TQL::IResult read = importer.ReadStream(input);
    return read.IsError() ? read : importer.Import(*TQL::ScopedWrite(i_rStore));
}

/// The file that a store makes; the name of the result where it makes none.
inline std::string ExportText(TQL::IStore& i_rStore)
{
    StoreIO::VStoreExporterJson exporter;
    TextOutput output;
    TQL::IResult result = exporter.Export(*TQL::ScopedRead(i_rStore));
    if (result.IsSuccess())
        result = exporter.WriteToStream(output);
    return result.IsSuccess() ? output.Text : std::string(result.Name());
}

/// All entries that have a value: "A/B=Int32 1", with "?2" behind it for a proposed value that awaits verification.
inline std::string ValuesText(TQL::IStore& i_rStore)
{
    const TQL::ScopedRead read(i_rStore);
    std::string text;
    const auto append = [&](const auto& i_rSelf, Store::EntryHandle i_Entry) -> void
    {
        const TQL::ISchema& rSchema = read->GetValueSchema(i_Entry);
        const auto appendValue = [&](char i_Mark, const Store::StoreValue& i_rValue)
        {
            if (i_rValue.IsEmpty())
                return;
            text += i_Mark;
            if (!Store::AppendValueText(text, rSchema, i_rValue.Bytes()))
                text += "no text";
        };
        if (read->HasValue(i_Entry))
        {
            text += std::string(text.empty() ? "" : "; ") + i_rStore.GetEntryPath(i_Entry).Text() + '=';
            text += GetName(rSchema.Type);
            appendValue(' ', read->GetVerifiedValue(i_Entry));
            if (read->GetFlags(i_Entry) & Store::EntryFlag::VerifyRequired)
                appendValue('?', read->GetProposedValue(i_Entry));
        }
        for (const Store::EntryHandle child : read->GetChildren(i_Entry))
            i_rSelf(i_rSelf, child);
    };
    append(append, i_rStore.GetRoot());
    return text;
}

} // namespace StoreIOTest
