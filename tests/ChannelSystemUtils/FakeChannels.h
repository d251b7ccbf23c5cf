#pragma once

#include "GraphPlotSystem/FakeHost.h"

#include <set>

/// A host that writes down which channels it was asked to derive; a derived one looks like its input unless the test
/// planned another look for it.
namespace FakeChannels
{

/// Unit ids of the fake table.
inline constexpr std::uint16_t Millimetre = 1;
inline constexpr std::uint16_t Second = 2;
inline constexpr std::uint16_t Radian = 3;
inline constexpr std::uint16_t Volt = 4;
inline constexpr std::uint16_t Gram = 5;
inline constexpr std::uint16_t NotInTheTable = 99;

using FakeHost::Output;

class Channel : public FakeHost::Channel
{
public:
    using FakeHost::Channel::Channel;

    void SetText(const char* i_pName, const char* i_pText)
    {
        (void)pParameters->SetParameter(i_pName, std::string(i_pText));
    }
    std::string GetText(const std::string& i_rName) const
    {
        TQL::ParameterValue value;
        (void)pParameters->Read("", i_rName, value);
        const auto* pText = std::get_if<std::string>(&value);
        return pText ? *pText : "";
    }
};

class Service : public FakeHost::Service
{
public:
    Service() : FakeHost::Service(std::make_shared<FakeHost::Journal>()) {}

    TQL::IResult GetSubTypeTable(std::uint16_t i_SubTypeId, TQL::SubTypeRecord& o_rRecord) const override
    {
        using Record = TQL::SubTypeRecord;
        static const std::map<std::uint16_t, Record> s_Units = {
            {Millimetre, {0, Record::DimensionLength, 1e-3, "millimeter", "mm"}},
            {Second, {0, 2, 1.0, "second", "s"}},
            {Radian, {0, Record::DimensionAngle, 1.0, "radian", "rad"}},
            {Volt, {0, 15, 1.0, "volt", "V"}},
            {Gram, {0, 1, 1.0, "gram", "g"}}};
        const auto found = s_Units.find(i_SubTypeId);
        if (found != s_Units.end())
            o_rRecord = found->second;
        return found != s_Units.end() ? TQL::Result::Ok : TQL::Result::InvalidId;
    }

    std::shared_ptr<TQL::IChannel>
    CreateDerivedChannel(std::string_view i_Operation, const ChannelSystem::VDerivedChannelParameters& i_rParameters,
                         const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs) override
    {
        std::string what(i_Operation);
        for (const auto& [rName, rValue] : i_rParameters.OperationParameters)
            if (const auto* pNumber = std::get_if<std::int32_t>(&rValue))
                what += " " + std::to_string(*pNumber);
            else if (const auto& rText = std::get<std::string>(rValue); !rText.empty())
                what += " " + rText;
        const auto& rInput = static_cast<const Channel&>(*i_rInputs.at(0));
        pJournal->Add(what + " of " + rInput.Id.Text);
        if (Refused.contains(what))
            return nullptr;
        const auto planned = Planned.find(what);
        auto pChannel = MakeChannel(what, planned == Planned.end() ? rInput.Description : planned->second);
        for (const char* pName : {"TypeDisplayName", "InstanceDisplayName", "ComponentDisplayNames"})
            pChannel->SetText(pName, rInput.GetText(pName).c_str());
        for (const auto* pValues : {&i_rParameters.TypeParameters, &i_rParameters.InstanceParameters})
            for (const auto& [rName, rValue] : *pValues)
            {
                std::string text = std::get<std::string>(rValue);
                if (const auto at = text.find("%1%"); at != std::string::npos)
                    text.replace(at, 3, rInput.GetText(rName));
                pChannel->SetText(rName.c_str(), text.c_str());
            }
        if (TQL::ParameterValue value; rInput.pParameters->Read("", "SupportMagnitude", value).IsSuccess())
            (void)pChannel->pParameters->SetParameter("SupportMagnitude", value);
        if (WithoutOutput.contains(what))
            pChannel->SetOutput(nullptr);
        return pChannel;
    }

    /// A channel that is its name; it lives as long as this service.
    std::shared_ptr<Channel> MakeChannel(const std::string& i_rName, const TQL::ComponentDescription& i_rDescription)
    {
        auto pChannel = std::make_shared<Channel>(TQL::IChannelInstanceId{"", "Internal", 0, 0, i_rName});
        pChannel->Description = i_rDescription;
        pChannel->SetOutput(std::make_shared<Output>(i_rDescription, pChannel));
        m_Channels.push_back(pChannel);
        return pChannel;
    }

    std::set<std::string> Refused; ///< by the text of the derivation, as the next two
    std::set<std::string> WithoutOutput;
    std::map<std::string, TQL::ComponentDescription> Planned;

private:
    std::vector<std::shared_ptr<Channel>> m_Channels;
};

} // namespace FakeChannels
