#include "Channels/Derived/VDerivedParameters.h"

#include <algorithm>
#include <charconv>
#include <utility>
#include <variant>

namespace Channels
{

namespace
{

constexpr std::string_view ErrorParameter = "ErrorData";
constexpr std::string_view ComponentNamesParameter = "ComponentDisplayNames";

/// Reads "%12%" at the beginning of a text; 0 when there is none, else the number, and the length of it all.
std::size_t ReadPlaceholder(std::string_view i_Text, std::size_t& o_rLength)
{
    std::size_t number = 0;
    const char* pBegin = i_Text.data() + 1;
    const char* pEnd = i_Text.data() + i_Text.size();
    const auto [pBehind, error] = std::from_chars(pBegin, pEnd, number);
    if (error != std::errc() || pBehind == pEnd || *pBehind != '%')
        return 0;
    o_rLength = static_cast<std::size_t>(pBehind - i_Text.data()) + 1;
    return number;
}

} // namespace

std::string ReplacePlaceholders(std::string_view i_Text,
                                const std::function<std::optional<std::string>(std::size_t)>& i_rTextOf)
{
    std::string text;
    while (!i_Text.empty())
    {
        const std::size_t percent = std::min(i_Text.find('%'), i_Text.size());
        text += i_Text.substr(0, percent);
        i_Text.remove_prefix(percent);
        if (i_Text.empty())
            break;
        std::size_t length = 1;
        const std::size_t number = ReadPlaceholder(i_Text, length);
        const std::optional<std::string> replacement = number == 0 ? std::nullopt : i_rTextOf(number);
        if (!replacement)
            length = 1;
        text += replacement ? *replacement : std::string(1, '%');
        i_Text.remove_prefix(length);
    }
    return text;
}

VDerivedParameters::VDerivedParameters(const ChannelSystem::VDerivedChannelParameters& i_rRecord,
                                       const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs,
                                       TextFunction i_OwnError, TextFunction i_ComponentNames)
    : m_OwnError(std::move(i_OwnError))
    , m_ComponentNames(std::move(i_ComponentNames))
    , m_pNotifier(std::make_shared<VChangeNotifier>())
{
    for (const auto& [rName, rValue] : i_rRecord.TypeParameters)
        m_Entries.insert_or_assign(rName, Entry{VChannelParameters::TypeGroup, rValue});
    for (const auto& [rName, rValue] : i_rRecord.InstanceParameters)
        m_Entries.insert_or_assign(rName, Entry{VChannelParameters::InstanceGroup, rValue});
    std::erase_if(m_Entries,
                  [](const auto& i_rEntry) { return std::holds_alternative<std::monostate>(i_rEntry.second.Value); });
    m_Entries.try_emplace(std::string(ErrorParameter), Entry{VChannelParameters::InstanceGroup, std::string("%1%")});
    for (const std::shared_ptr<TQL::IChannel>& rpInput : i_rInputs)
        m_Inputs.push_back(rpInput->GetParameters());
}

TQL::IResult VDerivedParameters::Read(std::string_view i_Group, std::string_view i_Name,
                                      TQL::ParameterValue& o_rValue) const
{
    const auto entry = m_Entries.find(i_Name);
    if (entry == m_Entries.end() && i_Name == ComponentNamesParameter && m_ComponentNames &&
        (i_Group.empty() || i_Group == VChannelParameters::TypeGroup))
        if (std::string names = m_ComponentNames(); !names.empty())
        {
            o_rValue = std::move(names);
            return TQL::Result::Ok;
        }
    if (entry == m_Entries.end() || (!i_Group.empty() && i_Group != entry->second.Group))
        return m_Inputs.front()->Read(i_Group, i_Name, o_rValue);
    const std::string* pText = std::get_if<std::string>(&entry->second.Value);
    if (!pText)
        o_rValue = entry->second.Value;
    else if (i_Name == ErrorParameter)
        o_rValue = ErrorData(*pText);
    else
        o_rValue = Substitute(*pText, i_Name);
    return TQL::Result::Ok;
}

std::string VDerivedParameters::TextOfInput(std::size_t i_Input, std::string_view i_Name) const
{
    TQL::ParameterValue value;
    if (m_Inputs[i_Input]->Read("", i_Name, value).IsError())
        return {};
    const std::string* pText = std::get_if<std::string>(&value);
    return pText ? *pText : std::string();
}

std::string VDerivedParameters::Substitute(const std::string& i_rTemplate, std::string_view i_Name) const
{
    return ReplacePlaceholders(i_rTemplate,
                               [&](std::size_t i_Number) -> std::optional<std::string>
                               {
                                   if (i_Number > m_Inputs.size())
                                       return std::nullopt;
                                   return TextOfInput(i_Number - 1, i_Name);
                               });
}

/// Its own error, else those of the inputs as the template puts them; nothing while no input has one.
std::string VDerivedParameters::ErrorData(const std::string& i_rTemplate) const
{
    if (std::string error = m_OwnError(); !error.empty())
        return error;
    for (std::size_t i = 0; i < m_Inputs.size(); ++i)
        if (!TextOfInput(i, ErrorParameter).empty())
            return Substitute(i_rTemplate, ErrorParameter);
    return {};
}

TQL::IResult VDerivedParameters::SetParameter(std::string_view i_Name, const TQL::ParameterValue&)
{
    TQL::ParameterValue value;
    return Read("", i_Name, value).IsSuccess() ? TQL::Result::NotPermitted : TQL::Result::NotFound;
}

void VDerivedParameters::GetErrors(std::vector<std::string>& o_rErrors) const
{
    o_rErrors.clear();
    if (std::string error = m_OwnError(); !error.empty())
        o_rErrors.push_back(std::move(error));
    std::vector<std::string> errors;
    for (const std::shared_ptr<TQL::IChannelParameters>& rpInput : m_Inputs)
    {
        rpInput->GetErrors(errors);
        for (std::string& rError : errors)
            if (std::ranges::find(o_rErrors, rError) == o_rErrors.end())
                o_rErrors.push_back(std::move(rError));
    }
}

} // namespace Channels
