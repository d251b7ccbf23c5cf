#pragma once

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/VDerivedChannelParameters.h"
#include "Channels/Common/VChannelParameters.h"

#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace Channels
{

/// The parameters of a derived channel. A text of its own may hold "%1%", "%2%", ...: whoever reads it gets the same
/// parameter of that input in the place, as it is then. What it does not have it reads from its first input. Errors are
/// its own and those of its inputs. Nothing can be set. Any thread.
class VDerivedParameters : public TQL::IChannelParameters
{
public:
    using TextFunction = std::function<std::string()>;

    /// Both functions are called with no lock held. i_OwnError gives the error of the channel itself, empty for none;
    /// i_ComponentNames, which may be left out, the component names where they are neither told by the record nor those
    /// of the first input, empty otherwise.
    VDerivedParameters(const ChannelSystem::VDerivedChannelParameters& i_rRecord,
                       const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs, TextFunction i_OwnError,
                       TextFunction i_ComponentNames = {});

    VChangeNotifier& Notifier() { return *m_pNotifier; }

    // IChannelParameters. SetParameter: NotPermitted, or NotFound for what cannot be read either.
    TQL::IResult Read(std::string_view i_Group, std::string_view i_Name, TQL::ParameterValue& o_rValue) const override;
    TQL::IResult SetParameter(std::string_view i_Name, const TQL::ParameterValue& i_rValue) override;
    std::shared_ptr<TQL::IChannelChangeNotifier> GetChangeNotifier() override { return m_pNotifier; }
    void GetErrors(std::vector<std::string>& o_rErrors) const override;

private:
    struct Entry
    {
        std::string_view Group;
        TQL::ParameterValue Value;
    };

    std::string TextOfInput(std::size_t i_Input, std::string_view i_Name) const;
    std::string Substitute(const std::string& i_rTemplate, std::string_view i_Name) const;
    std::string ErrorData(const std::string& i_rTemplate) const;

    std::map<std::string, Entry, std::less<>> m_Entries; // fixed once made
    std::vector<std::shared_ptr<TQL::IChannelParameters>> m_Inputs;
    const TextFunction m_OwnError;
    const TextFunction m_ComponentNames; ///< may be empty
    const std::shared_ptr<VChangeNotifier> m_pNotifier;
};

/// The text with each "%n%", n from 1, replaced by what the function gives for n. A number that it gives nothing for
/// (an empty optional) stays as it is, and so does a lone percent sign.
std::string ReplacePlaceholders(std::string_view i_Text,
                                const std::function<std::optional<std::string>(std::size_t)>& i_rTextOf);

} // namespace Channels
