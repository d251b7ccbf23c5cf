#pragma once

#include "Store/VStore.h"
#include "Store/ValueTextWriter.h"
#include "StoreIO/VStoreExporterJson.h"
#include "StoreIO/VStoreImporterJson.h"
#include "StoreInterface/ScopedAccess.h"
#include "TQL/ISchema.h"
#include "TQL/TextStream.h"

#include <algorithm>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <utility>

namespace StoreIOTest
{

inline std::shared_ptr<TQL::IStore> MakeStore()
{
    return TQL::MakeShared<Store::VStore>();
}

/// Reads the text and imports it if that went well. Gives the last result.
inline TQL::IResult ImportText(TQL::IStore& i_rStore, std::string_view i_Text)
{
    StoreIO::VStoreImporterJson importer;
    TQL::VTextInput input(i_Text);
    const TQL::IResult read = importer.ReadStream(input);
    return read.IsError() ? read : importer.Import(*TQL::ScopedWrite(i_rStore));
}

/// The file that a store makes; the name of the result where it makes none.
inline std::string ExportText(TQL::IStore& i_rStore)
{
    StoreIO::VStoreExporterJson exporter;
    TQL::VTextOutput output;
    TQL::IResult result = exporter.Export(*TQL::ScopedRead(i_rStore));
    if (result.IsSuccess())
        result = exporter.WriteToStream(output);
    return result.IsSuccess() ? output.Text() : std::string(result.Name());
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
