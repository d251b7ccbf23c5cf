#pragma once

#include "ChannelSystem/IChannelSelectionManager.h"
#include "ChannelSystem/IChannelTypeRegistry.h"
#include "GraphPlotSystem/FakeHost.h"
#include "GraphPlotSystem/FakeTexts.h"
#include "OrvanePluginInterface/IChannelMigrationService.h"

#include <map>
#include <tuple>

/// A host that selects and creates channels as a test says. A channel is written "context/name"; its type is "Marker",
/// its name stands in the id, and a tail "~2" tells channels of one name apart.
namespace ActiveChannelHost
{

struct Channel : FakeHost::Channel, std::enable_shared_from_this<Channel>
{
    using FakeHost::Channel::Channel;

    void SetData(bool i_bData)
    {
        SetOutput(i_bData ? std::make_shared<FakeHost::Output>(OutputDescription, weak_from_this()) : nullptr);
    }

    TQL::ComponentDescription OutputDescription{{}, false, "Position"};
};

inline std::shared_ptr<Channel> MakeChannel(const std::string& i_rContext, const std::string& i_rType,
                                            const std::string& i_rText, bool i_bData = true)
{
    auto pChannel = std::make_shared<Channel>(TQL::IChannelInstanceId{i_rContext, i_rType, 0, 0, i_rText});
    pChannel->SetData(i_bData);
    return pChannel;
}

/// "Type(a+b)".
inline std::string MadeOf(std::string_view i_Type, const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs)
{
    std::string text(i_Type);
    for (const auto& rpInput : i_rInputs)
        text += (text == i_Type ? '(' : '+') + rpInput->GetInstanceId().Text;
    return text + ")";
}

/// The name of a channel is the text of its id; nothing else is known of it.
struct Texts : FakeTexts
{
    using FakeTexts::Update;
    QString GetChannelDisplayName(const TQL::IChannelInstanceId& i_rChannel) const override
    {
        return QString::fromStdString(i_rChannel.Text.substr(0, i_rChannel.Text.find('~')));
    }
    TQL::IResult Update(const std::shared_ptr<TQL::IChannel>&) override { return TQL::Result::Failed; }
};

/// All of the host in one object, its tables open to the test.
struct Host : FakeHost::Service,
              TQL::IChannelSelectionManager,
              TQL::IChannelTypeRegistry,
              OrvanePluginInterface::IChannelMigrationService
{
    Host() : FakeHost::Service(nullptr) {}

    using Channels = std::vector<std::shared_ptr<TQL::IChannel>>;

    /// The channel written "context/name", made when first asked for.
    std::shared_ptr<Channel> Get(const std::string& i_rText)
    {
        std::shared_ptr<Channel>& rpChannel = Known[i_rText];
        const std::size_t slash = i_rText.find('/');
        if (!rpChannel)
            rpChannel = MakeChannel(i_rText.substr(0, slash), "Marker", i_rText.substr(slash + 1));
        return rpChannel;
    }

    std::shared_ptr<TQL::IChangeSignal> TypeListChanged() const override { return {}; } // of service and registry

    // IChannelService
    std::shared_ptr<TQL::IChannel> CreateDerivedChannel(std::string_view i_Operation,
                                                        const ChannelSystem::VDerivedChannelParameters& i_rParameters,
                                                        const Channels& i_rInputs) override
    {
        std::weak_ptr<TQL::IChannel>& rpKept = Derived[{std::string(i_Operation), i_rParameters.Hash, i_rInputs}];
        auto pChannel = rpKept.lock();
        if (!pChannel)
        {
            const TQL::IChannelInstanceId& rInput = i_rInputs.at(0)->GetInstanceId();
            rpKept = pChannel = MakeChannel(rInput.DataContextName, std::string(i_Operation), rInput.Text + "'");
        }
        Kept.push_back(pChannel);
        return pChannel;
    }
    std::shared_ptr<TQL::IChannel> GetChannel(const TQL::IChannelInstanceId& i_rId) const override
    {
        const auto found = Known.find(i_rId.DataContextName + "/" + i_rId.Text);
        return found == Known.end() ? nullptr : found->second;
    }
    std::shared_ptr<TQL::IChannelSelectionManager> GetSelectionManager() const override
    {
        return {std::shared_ptr<void>(), const_cast<Host*>(this)};
    }

    // IChannelSelectionManager
    void GetSelectedChannelIds(std::string_view i_Context, std::string_view i_Type,
                               std::vector<TQL::IChannelInstanceId>& o_rIds) const override
    {
        o_rIds.clear();
        if (const auto found = Selected.find(std::string(i_Type)); found != Selected.end())
            for (const std::string& rName : found->second)
                o_rIds.push_back({std::string(i_Context), "Marker", 0, 0, rName});
    }
    void GetSelectedTypeCounts(std::uint64_t, std::map<std::string, std::uint64_t>&) const override {}
    void GetSelectedChannelTypes(std::uint64_t, std::set<std::string>&) const override {}
    void GetGlobalChannelTypes(std::uint64_t, std::set<std::string>&) const override {}
    std::shared_ptr<TQL::IMultiCallbackPostal<void(bool)>> SelectionChanged() const override { return {}; }
    TQL::IResult GetSelectionKind(std::string_view i_Type, TQL::ESelectionKind& o_rKind) const override
    {
        o_rKind = i_Type == GlobalType ? TQL::ESelectionKind::Global : TQL::ESelectionKind::Label;
        return TQL::Result::Ok;
    }
    void SelectThingsOf(const std::shared_ptr<TQL::IChannel>&, bool) override {}
    void RegisterChannelType(std::string_view, TQL::ESelectionKind, std::uint32_t) override {}

    // IChannelTypeRegistry
    void GetTypes(std::uint64_t, std::vector<std::string>&) const override {}
    TQL::IResult GetSpecifier(std::string_view i_Type, TQL::VChannelSpecifier& o_rSpecifier) const override
    {
        const auto found = Creatable.find(i_Type);
        if (found == Creatable.end())
            return TQL::Result::NotFound;
        o_rSpecifier.RequiredInputCount = found->second;
        o_rSpecifier.InputTypeNames = {"Marker"};
        return TQL::Result::Ok;
    }
    TQL::IResult CreateChannels(std::string_view i_Type, const Channels& i_rInputs, Channels& o_rChannels) override
    {
        if (i_Type == "Broken")
            return TQL::Result::NotSupported;
        if (i_Type == "Null")
        {
            o_rChannels = {nullptr, nullptr};
            return TQL::Result::Ok;
        }
        const auto pChannel = MakeChannel("Live", std::string(i_Type), MadeOf(i_Type, i_rInputs), i_Type != "Empty");
        pChannel->pParameters->Errors = {"no sense in it"};
        o_rChannels = {pChannel};
        return TQL::Result::Ok;
    }
    TQL::IResult CreateGlobalChannels(std::string_view i_Type, std::string_view i_Context,
                                      Channels& o_rChannels) override
    {
        o_rChannels = {nullptr, MakeChannel(std::string(i_Context), std::string(i_Type), std::string(i_Type))};
        return TQL::Result::Ok;
    }
    bool CanComputeMagnitude(std::string_view, std::string_view) const override { return false; }

    // IChannelMigrationService: "x..." fails, "y..." finds nothing, "z..." only a fallback.
    TQL::IResult Migrate(const std::shared_ptr<TQL::IChannel>& i_rpChannel, std::string_view i_NewContext,
                         Channels& o_rMigrated, Channels& o_rFallbacks) override
    {
        const std::string name = i_rpChannel->GetInstanceId().Text;
        const std::string context = std::string(i_NewContext) + "/";
        if (name[0] == 'x')
            return TQL::Result::NotConnected;
        if (name[0] == 'z')
            o_rFallbacks = {Get(context + "fallback")};
        else if (name[0] != 'y')
            o_rMigrated = {Get(context + name), Get(context + "other")};
        return TQL::Result::Ok;
    }

    std::map<std::string, std::shared_ptr<Channel>> Known;
    std::map<std::string, std::vector<std::string>> Selected; ///< by type
    std::map<std::string, std::int64_t, std::less<>> Creatable;
    std::string GlobalType = "Clock";
    std::map<std::tuple<std::string, std::uint64_t, Channels>, std::weak_ptr<TQL::IChannel>> Derived;
    const std::shared_ptr<Texts> pTexts = std::make_shared<Texts>();
    Channels Kept; ///< the derived ones, whose outputs do not keep them
};

} // namespace ActiveChannelHost
