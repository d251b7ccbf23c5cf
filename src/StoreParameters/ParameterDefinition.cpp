#include "StoreParameters/ParameterDefinition.h"

#include "Store/ValueText.h"
#include "StoreInterface/IStore.h"
#include "StoreParameters/ParameterLog.h"
#include "TQL/ISchema.h"

#include <algorithm>
#include <array>
#include <optional>
#include <string_view>
#include <utility>

namespace Store
{
namespace
{

constexpr std::uint32_t s_HintRange = 2; ///< both limits are known: a view may show a slider

constexpr std::array<std::pair<std::string_view, std::uint32_t>, 4> s_FileAccessModes{
    {{"Folder", 3}, {"Load", 4}, {"LoadMultiple", 5}, {"Save", 6}}};

constexpr std::array<std::pair<std::string_view, std::string_view>, 2> s_PropertyTags{
    {{"<DisplayedDecimals>", "displayedDecimals"}, {"<FileFilter>", "filter"}}};

const std::string* FindTag(const TagTable& i_rTags, std::string_view i_Tag)
{
    const auto found = i_rTags.find(i_Tag);
    return found == i_rTags.end() ? nullptr : &found->second;
}

bool TagIs(const TagTable& i_rTags, std::string_view i_Tag, std::string_view i_Text)
{
    const std::string* const pText = FindTag(i_rTags, i_Tag);
    return pText && *pText == i_Text;
}

std::optional<StoreValue> ReadDefinitionText(const TQL::ISchema& i_rSchema, const std::string& i_rText)
{
    if (i_rSchema.Type == TQL::EType::String)
        return StringValue(i_rSchema, i_rText);
    if (TQL::IsEnum(i_rSchema.Type) && !i_rText.starts_with('"'))
        return EnumValue(i_rSchema, i_rText);
    return ParseValueText(i_rSchema, i_rText);
}

/// Writes one definition and keeps the first failure.
class DefinitionWriter
{
public:
    DefinitionWriter(TQL::IStoreWriter& io_rWriter, EntryHandle i_Entry, const ParameterDefinition& i_rDefinition)
        : m_rWriter(io_rWriter), m_Entry(i_Entry), m_rDefinition(i_rDefinition)
    {
    }

    TQL::IResult Write()
    {
        Keep(m_rWriter.SetValueSchema(m_Entry, *m_rDefinition.pSchema));
        if (m_Result.IsError())
            return m_Result;
        WriteTexts();
        Keep(m_rWriter.EnableFlags(m_Entry, EntryFlagsOf(m_rDefinition)));
        WriteValues();
        WriteChoices();
        return m_Result;
    }

private:
    void WriteTexts()
    {
        const TagTable& rTags = m_rDefinition.Tags;
        const std::string* const pName = FindTag(rTags, "<FriendlyName>");
        Keep(m_rWriter.SetDisplayName(m_Entry, pName ? *pName : m_rDefinition.Key));
        Keep(m_rWriter.SetCategory(m_Entry, CategoryOf(m_rDefinition)));
        if (const std::string* const pText = FindTag(rTags, "<Description>"))
            Keep(m_rWriter.SetDescription(m_Entry, *pText));
        if (const std::string* const pText = FindTag(rTags, "<ValidatorRegex>"))
            Keep(m_rWriter.SetValidator(m_Entry, *pText));
        if (const std::string* const pText = FindTag(rTags, "<FileAccess>"))
            WriteFileAccess(*pText);
        TQL::PropertyMap properties;
        for (const auto& [tag, key] : s_PropertyTags)
            if (const std::string* const pText = FindTag(rTags, tag))
                properties.emplace(key, *pText);
        Keep(m_rWriter.SetPropertyMap(m_Entry, properties));
    }

    void WriteFileAccess(const std::string& i_rText)
    {
        const auto found = std::ranges::find(s_FileAccessModes, std::string_view(i_rText),
                                             &std::pair<std::string_view, std::uint32_t>::first);
        if (found == s_FileAccessModes.end())
            Refuse("<FileAccess>", i_rText);
        else
            Keep(m_rWriter.SetFileAccessMode(m_Entry, found->second));
    }

    void WriteValues()
    {
        if (std::optional<StoreValue> value = ReadTag("<DefaultValue>"))
            Keep(m_rWriter.SetDefaultValue(m_Entry, *std::move(value)));
        std::optional<StoreValue> minimum = ReadTag("<RangeMin>");
        std::optional<StoreValue> maximum = ReadTag("<RangeMax>");
        const bool bRange = minimum && maximum;
        if (minimum)
            Keep(m_rWriter.SetMinimum(m_Entry, *std::move(minimum)));
        if (maximum)
            Keep(m_rWriter.SetMaximum(m_Entry, *std::move(maximum)));
        if (bRange)
            Keep(m_rWriter.SetValueDisplayHint(m_Entry, s_HintRange));
    }

    void WriteChoices()
    {
        if (m_rDefinition.Choices.empty())
            return;
        Keep(m_rWriter.ClearChoices(m_Entry));
        for (const ParameterChoice& rChoice : m_rDefinition.Choices)
            if (std::optional<StoreValue> value = Read("choice", rChoice.Value))
                Keep(m_rWriter.AddChoice(m_Entry, *std::move(value), rChoice.Name, rChoice.Description));
    }

    std::optional<StoreValue> ReadTag(std::string_view i_Tag)
    {
        const std::string* const pText = FindTag(m_rDefinition.Tags, i_Tag);
        return pText ? Read(i_Tag, *pText) : std::nullopt;
    }

    std::optional<StoreValue> Read(std::string_view i_What, const std::string& i_rText)
    {
        std::optional<StoreValue> value = ReadDefinitionText(*m_rDefinition.pSchema, i_rText);
        if (!value)
            Refuse(i_What, i_rText);
        return value;
    }

    void Refuse(std::string_view i_What, const std::string& i_rText)
    {
        LogParameter(TQL::ELogSeverity::Error, "Cannot read the %1% '%2%' of parameter '%3%'.", i_What, i_rText,
                     m_rWriter.GetStore().GetEntryPath(m_Entry).Text());
        Keep(TQL::Result::InvalidValue);
    }

    void Keep(TQL::IResult i_Result)
    {
        if (m_Result.IsSuccess() && i_Result.IsError())
            m_Result = i_Result;
    }

    TQL::IStoreWriter& m_rWriter;
    const EntryHandle m_Entry;
    const ParameterDefinition& m_rDefinition;
    TQL::IResult m_Result;
};

} // namespace

std::string CategoryOf(const ParameterDefinition& i_rDefinition)
{
    const std::string* const pText = FindTag(i_rDefinition.Tags, "<Category>");
    return pText ? *pText : "General";
}

std::uint32_t EntryFlagsOf(const ParameterDefinition& i_rDefinition)
{
    const TagTable& rTags = i_rDefinition.Tags;
    std::uint32_t flags = 0;
    if (FindTag(rTags, "<Serialized>") && !TagIs(rTags, "<Serialized>", "0"))
        flags |= EntryFlag::Persistable;
    if (TagIs(rTags, "<Hidden>", "1"))
        flags |= EntryFlag::Hidden;
    if (TagIs(rTags, "<Advanced>", "1"))
        flags |= EntryFlag::Advanced;
    if (i_rDefinition.Flags & DefinitionFlag::Synthetic)
        flags |= EntryFlag::Synthetic;
    return flags;
}

TQL::IResult WriteParameter(TQL::IStoreWriter& io_rWriter, EntryHandle i_Entry,
                            const ParameterDefinition& i_rDefinition)
{
    return DefinitionWriter(io_rWriter, i_Entry, i_rDefinition).Write();
}

} // namespace Store
