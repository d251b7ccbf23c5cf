#pragma once

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelSelectionManager.h"
#include "ChannelSystem/IChannelService.h"
#include "ChannelSystem/IChannelTypeRegistry.h"
#include "GraphPlotSystem/IChannelTextProvider.h"
#include "NotificationSystem/VMultiCallbackPostal.h"
#include "OrvanePluginInterface/IChannelMigrationService.h"

#include <map>
#include <tuple>

/// A host that selects and creates channels as a test says. A channel is written "context/name"; its type is "Marker",
/// its name stands in the id, and a tail "~2" tells channels of one name apart.
namespace ActiveChannelHost
{

struct Output : TQL::IChannelOutput
{
    explicit Output(std::weak_ptr<TQL::IChannel> i_pChannel) : pChannel(std::move(i_pChannel)) {}
    std::shared_ptr<TQL::IChannel> GetChannel() const override { return pChannel.lock(); }
    bool IsStale() const override { return false; }
    std::shared_ptr<ChannelSystem::IChannelBlock> GetBlock() const override { return nullptr; }
    TQL::ComponentDescription GetDescription() const override
    {
        TQL::ComponentDescription description;
        description.FormatName = "Position";
        return description;
    }

    const std::weak_ptr<TQL::IChannel> pChannel;
};

struct Channel : TQL::IChannel,
                 TQL::IChannelParameters,
                 TQL::IChannelChangeNotifier,
                 std::enable_shared_from_this<Channel>
{
    std::shared_ptr<TQL::IChannelParameters> GetParameters() const override
    {
        return const_cast<Channel*>(this)->shared_from_this();
    }
    void GetDependentChannels(std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) const override
    {
        o_rChannels = Inputs;
    }
    std::shared_ptr<TQL::IChannelOutput> GetOutput() const override { return pOutput; }
    TQL::ComponentDescription GetDescription() const override { return {}; }
    const TQL::IChannelInstanceId& GetInstanceId() const override { return Id; }
    std::uint64_t GetRevision() const override { return 1; }

    TQL::IResult Read(std::string_view, std::string_view, TQL::ParameterValue&) const override
    {
        return TQL::Result::NotFound;
    }
    TQL::IResult SetParameter(std::string_view, const TQL::ParameterValue&) override { return TQL::Result::NotFound; }
    std::shared_ptr<TQL::IChannelChangeNotifier> GetChangeNotifier() override { return shared_from_this(); }
    void GetErrors(std::vector<std::string>& o_rErrors) const override { o_rErrors = Errors; }
    std::shared_ptr<void> AddOutputChangedCallback(std::function<void()> i_Callback,
                                                   std::shared_ptr<TQL::IPostalService> i_pPostalService) override
    {
        const auto handle = pChanged->Add(std::move(i_Callback), std::move(i_pPostalService));
        return {nullptr, [pSignal = pChanged, handle](void*)
                {
                    pSignal->Remove(handle);
                }};
    }

    void SetData(bool i_bData)
    {
        pOutput = i_bData ? std::make_shared<Output>(weak_from_this()) : nullptr;
        pChanged->Invoke();
    }

    TQL::IChannelInstanceId Id;
    std::shared_ptr<TQL::IChannelOutput> pOutput;
    std::vector<std::shared_ptr<TQL::IChannel>> Inputs;
    std::vector<std::string> Errors;
    std::shared_ptr<NotificationSystem::VChangeSignal> pChanged = std::make_shared<NotificationSystem::VChangeSignal>();
};

inline std::shared_ptr<Channel> MakeChannel(const std::string& i_rContext, const std::string& i_rType,
                                            const std::string& i_rText, bool i_bData = true)
{
    auto pChannel = std::make_shared<Channel>();
    pChannel->Id = {i_rContext, i_rType, 0, 0, i_rText};
    pChannel->SetData(i_bData);
    return pChannel;
}

/// All of the host in one object, its tables open to the test.
struct Host : ChannelSystem::IChannelService,
              TQL::IChannelSelectionManager,
              TQL::IChannelTypeRegistry,
              TQL::IChannelTextProvider,
              OrvanePluginInterface::IChannelMigrationService
{
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

    // IChannelService
    std::shared_ptr<ChannelSystem::IChannelContext> GetContextByName(std::string_view) const override { return {}; }
    std::shared_ptr<TQL::IChangeSignal> ContextListChanged() const override { return {}; }
    std::shared_ptr<TQL::IChangeSignal> TypeListChanged() const override { return {}; }
    std::vector<std::string> GetChannelTypes(std::uint64_t, std::string_view) const override { return {}; }
    std::shared_ptr<TQL::IChannelParameters> GetTypeParameters(std::string_view) const override { return {}; }
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
    TQL::IResult GetSubTypeTable(std::uint16_t, TQL::SubTypeRecord&) const override { return TQL::Result::NotFound; }

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
        std::string text(i_Type);
        for (const auto& rpInput : i_rInputs)
            text += (text == i_Type ? '(' : '+') + rpInput->GetInstanceId().Text;
        const auto pChannel = MakeChannel("Live", std::string(i_Type), text + ")", i_Type != "Empty");
        pChannel->Errors = {"no sense in it"};
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

    // IChannelTextProvider
    QString GetChannelTypeName(const TQL::IChannelInstanceId&) const override { return {}; }
    QString GetChannelDisplayName(const TQL::IChannelInstanceId& i_rChannel) const override
    {
        return QString::fromStdString(i_rChannel.Text.substr(0, i_rChannel.Text.find('~')));
    }
    std::uint64_t GetSubTypeId(const TQL::IChannelInstanceId&) const override { return 0; }
    QString GetSubTypeDisplayName(std::uint64_t) const override { return {}; }
    QString GetSubTypeUnits(std::uint64_t) const override { return {}; }
    std::uint64_t GetComponentCount(std::uint64_t) const override { return 0; }
    QString GetComponentName(const TQL::IChannelInstanceId&, std::uint64_t) const override { return {}; }
    QString GetComponentName(std::uint64_t, std::uint64_t) const override { return {}; }
    QString GetComponentUnits(std::uint64_t, std::uint64_t, bool) const override { return {}; }
    QString GetCategory(const TQL::IChannelInstanceId&) const override { return {}; }
    TQL::IResult Update(const std::shared_ptr<TQL::IChannel>&) override { return TQL::Result::Failed; }
    void Update(std::span<const TQL::ITraceId>) override {}
    std::shared_ptr<TQL::IChangeSignal> TextChanged() const override { return {}; }
    void NotifyTextChanged() override {}

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
    Channels Kept; ///< the derived ones, whose outputs do not keep them
};

} // namespace ActiveChannelHost
