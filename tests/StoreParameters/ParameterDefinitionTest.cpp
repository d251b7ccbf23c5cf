#include "ParameterFixture.h"

#include <gtest/gtest.h>

#include <vector>

namespace
{

using namespace ParameterTest;

std::string Hex(const StoreValue& i_rValue)
{
    constexpr const char* s_pDigits = "0123456789abcdef";
    std::string text;
    for (const std::uint8_t byte : i_rValue.Bytes())
        text += {s_pDigits[byte >> 4], s_pDigits[byte & 15]};
    return text.empty() ? "-" : text;
}

/// All that a definition can set, in one line; what is not set is left out.
std::string Describe(const TQL::IStoreReader& i_rReader, EntryHandle i_Entry)
{
    std::string text = i_rReader.GetDisplayName(i_Entry).value_or("(none)") + "|" + i_rReader.GetCategory(i_Entry);
    const auto add = [&](const char* i_pName, const std::string& i_rText)
    {
        text += i_rText.empty() || i_rText == "0" || i_rText == "-" ? "" : std::string("|") + i_pName + i_rText;
    };
    add("", i_rReader.GetDescription(i_Entry));
    add("flags ", std::to_string(i_rReader.GetFlags(i_Entry)));
    add("value ", Hex(i_rReader.GetVerifiedValue(i_Entry)));
    add("default ", Hex(i_rReader.GetDefaultValue(i_Entry)));
    add("min ", Hex(i_rReader.GetMinimum(i_Entry)));
    add("max ", Hex(i_rReader.GetMaximum(i_Entry)));
    add("hint ", std::to_string(i_rReader.GetValueDisplayHint(i_Entry)));
    add("access ", std::to_string(i_rReader.GetFileAccessMode(i_Entry)));
    add("valid ", i_rReader.GetValidator(i_Entry));
    add("", i_rReader.GetProperties(i_Entry));
    for (std::size_t i = 0; i < i_rReader.GetChoiceCount(i_Entry); ++i)
        add("choice ", Hex(i_rReader.GetChoiceValues(i_Entry)[i]) + "=" + i_rReader.GetChoiceNames(i_Entry)[i]);
    return text;
}

ParameterDefinition With(ParameterDefinition i_Definition, std::vector<ParameterChoice> i_Choices,
                         std::uint32_t i_Flags)
{
    i_Definition.Choices = std::move(i_Choices);
    i_Definition.Flags = i_Flags;
    return i_Definition;
}

TEST(ParameterDefinition, EachTagReachesItsPlace)
{
    const TQL::ISchema schema = TQL::MakeEnumSchema(TQL::EType::Enum8, "EParameterUnits", {{"Metres", 0}, {"Feet", 5}});
    const TQL::ISchema& rUnits = TQL::IO::GetUniqueSchema(schema);
    const auto units = [&](std::string i_Key, TagTable i_Tags)
    {
        return ParameterDefinition{std::move(i_Key), &rUnits, std::move(i_Tags), {}, 0};
    };
    constexpr auto s_String = TQL::EType::String;
    const struct
    {
        ParameterDefinition Definition;
        const char* pExpected;
        const char* pLog = "";
    } s_Cases[] = {
        {Define("Bare"), "Bare|General"},
        {Define("Texts", {{"<FriendlyName>", ""}, {"<Category>", "Filter"}, {"<Description>", "Hz"}, {"<Other>", "x"}}),
         "|Filter|Hz"},
        {Define("Seen", {{"<Serialized>", ""}, {"<Hidden>", "1"}, {"<Advanced>", "1"}}), "Seen|General|flags 13"},
        {Define("Unseen", {{"<Serialized>", "0"}, {"<Hidden>", "0"}, {"<Advanced>", "true"}}), "Unseen|General"},
        {With(Define("Made"), {}, 4), "Made|General|flags 32"},
        {With(Define("NotMade"), {}, 0xFB), "NotMade|General"},
        {Define("Range", {{"<DefaultValue>", "5"}, {"<RangeMin>", "-1"}, {"<RangeMax>", "9"}}),
         "Range|General|flags 512|value 05000000|default 05000000|min ffffffff|max 09000000|hint 2"},
        {Define("HalfRange", {{"<RangeMax>", "9"}}), "HalfRange|General|max 09000000"},
        {Define("BadRange", {{"<RangeMin>", "1.5"}, {"<RangeMax>", "9"}}), "BadRange|General|max 09000000",
         "2 Cannot read the <RangeMin> '1.5' of parameter 'Root/BadRange'.\n"},
        {Define("Text", {{"<DefaultValue>", "a\"b"}, {"<ValidatorRegex>", "^a.*"}}, s_String),
         "Text|General|flags 512|value 03000000612262|default 03000000612262|valid ^a.*"},
        {Define("File", {{"<FileAccess>", "LoadMultiple"}, {"<FileFilter>", "*.c3d"}, {"<DisplayedDecimals>", "3"}},
                s_String),
         "File|General|access 5|displayedDecimals=3\nfilter=*.c3d\n"},
        {Define("BadAccess", {{"<FileAccess>", "load"}}, s_String), "BadAccess|General",
         "2 Cannot read the <FileAccess> 'load' of parameter 'Root/BadAccess'.\n"},
        {units("Quoted", {{"<DefaultValue>", "\"Feet\""}}), "Quoted|General|flags 512|value 05|default 05"},
        {units("Name", {{"<DefaultValue>", "Feet"}}), "Name|General|flags 512|value 05|default 05"},
        {units("BadName", {{"<DefaultValue>", "Miles"}}), "BadName|General",
         "2 Cannot read the <DefaultValue> 'Miles' of parameter 'Root/BadName'.\n"},
        {With(units("Choice", {}), {{"Feet", "ft", ""}, {"Miles", "mi", ""}, {"Metres", "m", ""}}, 0),
         "Choice|General|choice 05=ft|choice 00=m", "2 Cannot read the choice 'Miles' of parameter 'Root/Choice'.\n"},
        {With(units("Choice", {}), {{"Metres", "m", ""}}, 0), "Choice|General|choice 00=m"},
        {Define("Choice"), "Choice|General|choice 00=m",
         "2 Failed to set 'Root/Choice' value schema: the requested type does not match the entry type.\n"},
    };
    const auto pStore = MakeStore();
    TestSupport::LogGuard log;
    for (const auto& rCase : s_Cases)
    {
        const EntryHandle entry = pStore->GetEntry(EntryPath("Root") / rCase.Definition.Key);
        const bool bOk = WriteParameter(*TQL::ScopedWrite(*pStore), entry, rCase.Definition).IsSuccess();
        EXPECT_EQ(TakeLog(log), rCase.pLog);
        EXPECT_EQ(bOk, *rCase.pLog == '\0') << rCase.Definition.Key;
        EXPECT_EQ(Describe(*TQL::ScopedRead(*pStore), entry), rCase.pExpected);
    }
}

} // namespace
