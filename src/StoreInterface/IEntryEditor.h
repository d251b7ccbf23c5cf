#pragma once

#include "StoreInterface/IStoreWriter.h"
#include "StoreInterface/TypedAccess.h"
#include "TQL/SchemaIntern.h"
#include "TQL/SchemaText.h"

#include <string>
#include <utility>

namespace TQL
{

/// What an editor does with an entry that already has another type.
enum class EOtherType
{
    Keep,   ///< all changes of values will fail
    Replace ///< the entry is removed, so that it can take the editor's type
};

/// Gives an entry the type that an editor writes, with lines in the log where that cannot be.
inline void PrepareEntry(IStoreWriter& i_rWriter, Store::EntryHandle i_Entry, const ISchema& i_rSchema,
                         EOtherType i_OtherType)
{
    const ISchema& rPresent = i_rWriter.GetValueSchema(i_Entry);
    const auto text = [](const ISchema& i_rOf)
    {
        return WriteSchema(i_rOf, ESchemaTextMode::NamedBrief);
    };
    const auto setSchema = [&]
    {
        const IResult result = i_rWriter.SetValueSchema(i_Entry, i_rSchema);
        if (result.IsError())
            LogEntry(i_rWriter, i_Entry, ELogSeverity::Error, "Failed to set entry %1% schema %2%: %3%.",
                     text(i_rSchema), result.Description());
    };
    if (rPresent.Type == EType::Void)
        return setSchema();
    if (&rPresent == &IO::GetUniqueSchema(i_rSchema))
        return;
    const bool bReplace = i_OtherType == EOtherType::Replace;
    LogEntry(i_rWriter, i_Entry, ELogSeverity::Error,
             bReplace ? "Error editing '%1%': editor schema %2% does not match the entry schema %3%, the previous "
                        "entry value will be removed."
                      : "Error editing '%1%': editor schema %2% does not match the entry schema %3%, all value changes "
                        "will fail.",
             text(i_rSchema), text(rPresent));
    if (bReplace && i_rWriter.RemoveEntry(i_Entry).IsSuccess())
        setSchema();
}

/// Writes the values of one entry as T, for the length of a write and on its thread.
template <typename T>
class IEntryEditor
{
public:
    IEntryEditor(IStoreWriter& i_rWriter, Store::EntryHandle i_Entry, EOtherType i_OtherType = EOtherType::Keep)
        : m_rWriter(i_rWriter), m_Entry(i_Entry)
    {
        PrepareEntry(i_rWriter, i_Entry, Store::SchemaOf<T>(), i_OtherType);
    }

    IResult SetValue(const T& i_rValue) { return m_rWriter.SetValue(m_Entry, Store::MakeValue(i_rValue)); }
    IResult SetDefault(const T& i_rValue) { return m_rWriter.SetDefaultValue(m_Entry, Store::MakeValue(i_rValue)); }
    IResult SetMinimum(const T& i_rValue) { return m_rWriter.SetMinimum(m_Entry, Store::MakeValue(i_rValue)); }
    IResult SetMaximum(const T& i_rValue) { return m_rWriter.SetMaximum(m_Entry, Store::MakeValue(i_rValue)); }
    IResult AddChoice(const T& i_rValue, std::string i_Name, std::string i_Description)
    {
        return m_rWriter.AddChoice(m_Entry, Store::MakeValue(i_rValue), std::move(i_Name), std::move(i_Description));
    }

private:
    IStoreWriter& m_rWriter;
    const Store::EntryHandle m_Entry;
};

} // namespace TQL
