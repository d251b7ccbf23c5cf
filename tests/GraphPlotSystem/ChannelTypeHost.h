#pragma once

#include "ChannelSystemUtils/ChannelParameterNames.h"
#include "GraphPlotSystem/ActiveChannelHost.h"

/// A host whose channel types and selection a test writes down. Every channel is a pose of an angle and a length; a
/// derived one is named by its expression with the input's name in it, so that the rows of a plot tell all options.
namespace ChannelTypeHost
{

inline std::shared_ptr<FakeHost::Parameters> MakeParameters(const std::string& i_rName, const std::string& i_rCategory)
{
    auto pParameters = std::make_shared<FakeHost::Parameters>();
    (void)pParameters->SetParameter("TypeDisplayName", i_rName);
    if (!i_rCategory.empty())
        (void)pParameters->SetParameter("CategoryDisplayName", i_rCategory);
    return pParameters;
}

inline const TQL::ComponentDescription s_Pose{{{true, {{1, 1}}}, {true, {{2, 1}}}}, false, "Pose"};

struct ListedType
{
    std::string Name;
    std::shared_ptr<FakeHost::Parameters> pParameters; ///< null for a type without
    TQL::ESelectionKind Kind = TQL::ESelectionKind::None;
};

struct Host : ActiveChannelHost::Host
{
    std::shared_ptr<TQL::IChannel> Make(const std::string& i_rContext, const std::string& i_rType,
                                        const std::string& i_rName) const
    {
        auto& rpChannel = Channels[i_rContext + "/" + i_rType + "/" + i_rName];
        if (!rpChannel)
        {
            rpChannel = ActiveChannelHost::MakeChannel(i_rContext, i_rType, i_rName, false);
            rpChannel->OutputDescription = s_Pose;
            rpChannel->SetData(true);
        }
        return rpChannel;
    }

    std::shared_ptr<TQL::IChangeSignal> TypeListChanged() const override { return pTypesChanged; }
    std::shared_ptr<TQL::IMultiCallbackPostal<void(bool)>> SelectionChanged() const override
    {
        return pSelectionChanged;
    }
    std::vector<std::string> GetChannelTypes(std::uint64_t i_Mask, std::string_view i_Context) const override
    {
        Asked += "types " + std::to_string(i_Mask) + " of '" + std::string(i_Context) + "'\n";
        std::vector<std::string> names;
        for (const ListedType& rType : Listed)
            names.push_back(rType.Name);
        return names;
    }
    std::shared_ptr<TQL::IChannelParameters> GetTypeParameters(std::string_view i_Type) const override
    {
        const auto found = std::ranges::find(Listed, i_Type, &ListedType::Name);
        return found == Listed.end() ? nullptr : found->pParameters;
    }
    TQL::IResult GetSubTypeTable(std::uint16_t i_SubTypeId, TQL::SubTypeRecord& o_rRecord) const override
    {
        using TQL::SubTypeRecord;
        o_rRecord.Dimension = i_SubTypeId == 1 ? SubTypeRecord::DimensionAngle : SubTypeRecord::DimensionLength;
        return TQL::Result::Ok;
    }
    std::shared_ptr<TQL::IChannel> CreateDerivedChannel(std::string_view i_Operation,
                                                        const ChannelSystem::VDerivedChannelParameters& i_rParameters,
                                                        const Host::Channels& i_rInputs) override
    {
        const std::string input = i_rInputs.at(0)->GetInstanceId().Text;
        std::string text(i_Operation);
        for (const auto& [rName, rValue] : i_rParameters.OperationParameters)
            if (rName == ChannelSystemUtils::ParameterName::Expression)
                text = std::get<std::string>(rValue);
            else if (const auto* pNumber = std::get_if<std::int32_t>(&rValue); pNumber && rName != "Mode")
                text += " " + rName + std::to_string(*pNumber);
        if (i_Operation == "Derivative")
            text += " #0";
        for (std::size_t place = text.find("#0"); place != std::string::npos; place = text.find("#0", place))
            text.replace(place, 2, input);
        return Make(i_rInputs[0]->GetInstanceId().DataContextName, i_rInputs[0]->GetInstanceId().TypeName, text);
    }
    std::shared_ptr<TQL::IChannel> GetChannel(const TQL::IChannelInstanceId& i_rId) const override
    {
        return i_rId.DataContextName.empty() ? nullptr : Make(i_rId.DataContextName, i_rId.TypeName, i_rId.Text);
    }

    void GetSelectedChannelIds(std::string_view i_Context, std::string_view i_Type,
                               std::vector<TQL::IChannelInstanceId>& o_rIds) const override
    {
        o_rIds.clear();
        auto kind = TQL::ESelectionKind::None;
        if (GetSelectionKind(i_Type, kind).IsSuccess() && kind == TQL::ESelectionKind::Global)
            o_rIds = {{std::string(i_Context), std::string(i_Type), 0, 0, std::string(i_Type)}};
        else if (const auto found = Selected.find(std::string(i_Type)); found != Selected.end())
            for (const std::string& rName : found->second)
                o_rIds.push_back({std::string(i_Context), std::string(i_Type), 0, 0, rName});
    }
    void GetSelectedTypeCounts(std::uint64_t, std::map<std::string, std::uint64_t>& o_rCounts) const override
    {
        for (const auto& [rType, rNames] : Selected)
            if (!rNames.empty())
                o_rCounts[rType] = rNames.size();
    }
    void GetSelectedChannelTypes(std::uint64_t i_Mask, std::set<std::string>& o_rTypes) const override
    {
        Asked += "selected types " + std::to_string(i_Mask) + "\n";
        std::map<std::string, std::uint64_t> counts;
        GetSelectedTypeCounts(i_Mask, counts);
        for (const auto& [rType, count] : counts)
            o_rTypes.insert(rType);
    }
    void GetGlobalChannelTypes(std::uint64_t, std::set<std::string>& o_rTypes) const override
    {
        for (const ListedType& rType : Listed)
            if (rType.Kind == TQL::ESelectionKind::Global)
                o_rTypes.insert(rType.Name);
    }
    TQL::IResult GetSelectionKind(std::string_view i_Type, TQL::ESelectionKind& o_rKind) const override
    {
        const auto found = std::ranges::find(Listed, i_Type, &ListedType::Name);
        if (found == Listed.end())
            return TQL::Result::NotFound;
        o_rKind = found->Kind;
        return TQL::Result::Ok;
    }

    void GetTypes(std::uint64_t, std::vector<std::string>& o_rTypes) const override
    {
        for (const auto& [rName, rSpecifier] : Specifiers)
            o_rTypes.push_back(rName);
    }
    TQL::IResult GetSpecifier(std::string_view i_Type, TQL::VChannelSpecifier& o_rSpecifier) const override
    {
        const auto found = Specifiers.find(i_Type);
        if (found == Specifiers.end())
            return TQL::Result::NotFound;
        o_rSpecifier = found->second;
        return TQL::Result::Ok;
    }
    TQL::IResult CreateChannels(std::string_view i_Type, const Host::Channels& i_rInputs,
                                Host::Channels& o_rChannels) override
    {
        o_rChannels = {Make(i_rInputs[0]->GetInstanceId().DataContextName, std::string(i_Type),
                            ActiveChannelHost::MadeOf(i_Type, i_rInputs))};
        std::static_pointer_cast<ActiveChannelHost::Channel>(o_rChannels[0])->Inputs = i_rInputs;
        return TQL::Result::Ok;
    }
    TQL::IResult CreateGlobalChannels(std::string_view i_Type, std::string_view i_Context,
                                      Host::Channels& o_rChannels) override
    {
        o_rChannels = {Make(std::string(i_Context), std::string(i_Type), std::string(i_Type))};
        return TQL::Result::Ok;
    }
    bool CanComputeMagnitude(std::string_view, std::string_view i_Type) const override { return i_Type == "Marker"; }

    void Create(const std::string& i_rType, std::int64_t i_Inputs, std::set<std::string> i_InputTypes,
                const std::string& i_rName, const std::string& i_rCategory, std::uint32_t i_Flags = 0)
    {
        Specifiers[i_rType] = {MakeParameters(i_rName, i_rCategory), i_Flags, i_Inputs, std::move(i_InputTypes)};
    }

    std::vector<ListedType> Listed;
    std::map<std::string, TQL::VChannelSpecifier, std::less<>> Specifiers;
    mutable std::map<std::string, std::shared_ptr<ActiveChannelHost::Channel>> Channels;
    mutable std::string Asked; ///< what the host was asked, a line a call
    const std::shared_ptr<NotificationSystem::VChangeSignal> pTypesChanged =
        std::make_shared<NotificationSystem::VChangeSignal>();
    const std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void(bool)>> pSelectionChanged =
        std::make_shared<NotificationSystem::VMultiCallbackPostal<void(bool)>>();
};

/// The types that most tests want.
inline std::shared_ptr<Host> MakeHost()
{
    using enum TQL::ESelectionKind;
    auto pHost = std::make_shared<Host>();
    pHost->Listed = {{"Marker", MakeParameters("Position", "Labels"), Label},
                     {"SubjectSegmentPose", MakeParameters("Pose", "Segments"), Segment},
                     {"Force", MakeParameters("%1% Force", ""), AnalogueDeviceOutput},
                     {"Clock", MakeParameters("Clock", "Time"), Global},
                     {"Raw", MakeParameters("Raw Bytes", "Developer"), Net},
                     {"Nameless", nullptr, Camera},
                     {"Auto", MakeParameters("Not the start row", "Labels"), Label}};
    pHost->Create("_PositionAndRotation", 1, {"SubjectSegmentPose", "SubjectSegmentPoseRetarget"},
                  "%1% Position and Rotation", "Segments");
    pHost->Create("_DistanceBetween", 2, {"Marker", "SubjectSegmentPose"}, "Distance Between", "Relative Measurements");
    pHost->Create("_Cluster", -1, {"Marker"}, "Cluster", "Labels");
    pHost->Create("_World", 0, {}, "World", "Time");
    pHost->Create("_Debug", 1, {"Marker"}, "Debug", "Labels", TQL::VChannelSpecifier::FlagDeveloperOnly);
    pHost->Create("_Trial", 1, {"Marker"}, "Trial", "Developer");
    pHost->Create("Raw", 1, {"Force"}, "Not listed twice", "Labels");
    return pHost;
}

} // namespace ChannelTypeHost
