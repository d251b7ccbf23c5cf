#include "Channels/Common/ChannelTypes.h"
#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelService.h"
#include "ChannelSystem/IChannelTypeRegistry.h"
#include "ChannelSystemUtils/DerivedRecords.h"
#include "Channels/Contexts/ContextThings.h"
#include "Channels/Contexts/VLiveContext.h"
#include "Channels/Contexts/VLiveMonitors.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "OrvanePluginInterface/IChannelMigrationService.h"
#include "Services/Checking/VCheckedChannels.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/VHostServices.h"

#include <gtest/gtest.h>

namespace Services
{

namespace
{

using Channel = std::shared_ptr<TQL::IChannel>;
using OrvanePluginInterface::IHostCoreServices;
using Recordings::EChannelKind;

/// "Ann:LFHD mm" are markers, "Ann:Pelvis" poses, "Fx" device outputs.
std::shared_ptr<const Recordings::VRecording> MakeRecording(const std::vector<std::string>& i_rMarkers,
                                                            const std::vector<std::string>& i_rSegments,
                                                            const std::vector<std::string>& i_rOutputs = {})
{
    auto pRecording = std::make_shared<Recordings::VRecording>();
    pRecording->Range = {0, 10 * TQL::DefaultFramePeriod};
    const auto add = [&](EChannelKind i_Kind, const std::vector<std::string>& i_rNames, std::size_t i_Components)
    {
        for (const std::string& rName : i_rNames)
        {
            Recordings::RecordedChannel channel;
            channel.Kind = i_Kind;
            channel.Name = rName;
            channel.Subject = rName.substr(0, std::min(rName.find(':'), rName.size()));
            channel.Units = i_Kind == EChannelKind::Analog ? "N" : "mm";
            channel.ComponentNames.resize(i_Components);
            channel.Samples.assign(10 * i_Components, 0.5f);
            pRecording->Channels.push_back(channel);
        }
    };
    add(EChannelKind::Marker, i_rMarkers, 3);
    add(EChannelKind::SegmentPose, i_rSegments, 6);
    add(EChannelKind::Analog, i_rOutputs, 1);
    return pRecording;
}

std::string Text(TQL::IChannelParameters& i_rParameters, std::string_view i_Name)
{
    TQL::ParameterValue value;
    if (i_rParameters.Read("", i_Name, value).IsError())
        return "absent";
    const std::string* pText = std::get_if<std::string>(&value);
    return pText ? *pText : "no text";
}

/// A host that checks, with two recordings: what a plug-in sees of their channels.
class ChannelTypes : public ::testing::Test
{
protected:
    ChannelTypes() : m_Host(StrictOptions())
    {
        m_Host.SetChannelService(m_pService);
        Open("A", MakeRecording({"Ann:LFHD", "Ann:RFHD", "Bob:LFHD", "Knee", "Ann:Toe"},
                                {"Ann:Pelvis", "Ann:Head", "Bob:Pelvis"}, {"Fx", "Fy"}));
        Open("B", MakeRecording({"Bob:LFHD", "Ann:RFHD", "Cid:LFHD"}, {"Cid:Head", "Bob:Hip"}, {"Fy", "Fz"}));
        static_cast<IHostCoreServices&>(m_Host).GetChannelService(m_pChannels);
        static_cast<IHostCoreServices&>(m_Host).GetFourthFactoryService(m_pTypes);
        static_cast<IHostCoreServices&>(m_Host).GetFifthFactoryService(m_pMigration);
    }

    static HostOptions StrictOptions()
    {
        HostOptions options;
        options.bChecking = true;
        return options;
    }

    void Open(const std::string& i_rName, std::shared_ptr<const Recordings::VRecording> i_pRecording)
    {
        m_pService->AddContext(
            std::make_shared<Channels::VRecordedContext>(i_rName, m_pService->GetSubTypes(), std::move(i_pRecording)));
    }

    /// The channel of a name, as the plug-in gets it.
    Channel Find(const std::string& i_rContext, const std::string& i_rName) const
    {
        const auto pAll = m_pService->FindContext(i_rContext)->GetChannels();
        for (const auto& rpChannel : *pAll)
            if (rpChannel->GetDefinition().Name == i_rName)
                return m_pChannels->GetChannel(rpChannel->GetInstanceId());
        return nullptr;
    }

    std::vector<Channel> Create(const char* i_pType, const std::vector<std::string>& i_rNames) const
    {
        std::vector<Channel> inputs;
        for (const std::string& rName : i_rNames)
            inputs.push_back(Find("A", rName));
        std::vector<Channel> channels;
        EXPECT_TRUE(m_pTypes->CreateChannels(i_pType, inputs, channels).IsSuccess()) << i_pType;
        return channels;
    }

    VHostServices m_Host;
    std::shared_ptr<Channels::VChannelService> m_pService = std::make_shared<Channels::VChannelService>();
    std::shared_ptr<ChannelSystem::IChannelService> m_pChannels;
    std::shared_ptr<TQL::IChannelTypeRegistry> m_pTypes;
    std::shared_ptr<OrvanePluginInterface::IChannelMigrationService> m_pMigration;
};

} // namespace

TEST_F(ChannelTypes, CreatableTypesMakeWhatTheyAreNamedFor)
{
    struct Case
    {
        const char* pType;
        std::vector<std::string> Inputs;
        const char* pName;   ///< of the type as listed
        const char* pFormat; ///< of the channel made
        std::size_t Components;
        bool bMagnitude;
    };
    const std::vector<Case> cases{
        {"_PositionAndRotation", {"Ann:Pelvis"}, "Position and Rotation", "Pose", 6, false},
        {"_CameraPosition", {"Ann:Pelvis"}, "Camera Position", "Position", 3, true},
        {"_DistanceBetween", {"Ann:LFHD", "Ann:RFHD"}, "Distance Between", "", 1, false},
        {"_DifferenceBetween", {"Ann:Pelvis", "Ann:RFHD"}, "Difference Between", "Position", 3, true},
        {"_AngleBetween", {"Ann:LFHD", "Ann:RFHD", "Bob:LFHD"}, "Angle Between", "", 1, false},
        {"_RelativePosition", {"Ann:Pelvis", "Ann:Head"}, "Relative Position", "Position", 3, true},
        {"_RelativeRotation", {"Ann:Pelvis", "Ann:Head"}, "Relative Rotation", "AngleAxis", 3, true},
        {"_RelativePose", {"Ann:Pelvis", "Ann:Head"}, "Relative Pose", "Pose", 6, false},
    };
    std::vector<std::string> types;
    m_pTypes->GetTypes(6, types);
    ASSERT_EQ(types.size(), cases.size());
    for (std::size_t i = 0; i < cases.size(); ++i)
    {
        const Case& rCase = cases[i];
        SCOPED_TRACE(rCase.pType);
        EXPECT_EQ(types[i], rCase.pType);
        TQL::VChannelSpecifier specifier;
        ASSERT_TRUE(m_pTypes->GetSpecifier(rCase.pType, specifier).IsSuccess());
        EXPECT_EQ(specifier.RequiredInputCount, static_cast<std::int64_t>(rCase.Inputs.size()));
        EXPECT_EQ(Text(*specifier.pTypeParameters, "TypeDisplayName"), rCase.pName);
        EXPECT_EQ(specifier.InputTypeNames.contains("SubjectSegmentPoseRetarget"), i != 1);
        EXPECT_EQ(m_pTypes->CanComputeMagnitude("A", rCase.pType), rCase.bMagnitude);
        const std::vector<Channel> channels = Create(rCase.pType, rCase.Inputs);
        ASSERT_EQ(channels.size(), 1u);
        EXPECT_NE(VCheckedChannels::Unwrap(channels[0]), channels[0]) << "a plug-in gets checked channels";
        ASSERT_NE(channels[0]->GetOutput(), nullptr);
        const TQL::ComponentDescription description = channels[0]->GetOutput()->GetDescription();
        EXPECT_EQ(description.Groups.size(), rCase.Components);
        if (*rCase.pFormat)
        {
            EXPECT_EQ(description.FormatName, rCase.pFormat);
        }
        TQL::ParameterValue magnitude;
        ASSERT_TRUE(channels[0]->GetParameters()->Read("", "SupportMagnitude", magnitude).IsSuccess());
        EXPECT_EQ(std::get<bool>(magnitude), rCase.bMagnitude);
        EXPECT_EQ(channels, Create(rCase.pType, rCase.Inputs)) << "the same objects again";
    }
    EXPECT_EQ(Text(*Create("_DistanceBetween", {"Ann:LFHD", "Knee"})[0]->GetParameters(), "InstanceDisplayName"),
              "Ann:LFHD ➞ Knee");
    EXPECT_TRUE(m_pTypes->CanComputeMagnitude("A", "Labelled Reconstructions"));
    EXPECT_FALSE(m_pTypes->CanComputeMagnitude("A", "SubjectSegmentPose"));

    // Made all the same, with its errors; and what cannot be asked for.
    const Channel pOfForce = Create("_RelativePose", {"Ann:Pelvis", "Fx"})[0];
    EXPECT_EQ(pOfForce->GetOutput(), nullptr);
    std::vector<std::string> errors;
    pOfForce->GetParameters()->GetErrors(errors);
    EXPECT_EQ(errors.size(), 1u);
    std::vector<Channel> none;
    EXPECT_EQ(m_pTypes->CreateChannels("_RelativePose", {Find("A", "Ann:Head")}, none), TQL::Result::InvalidArgument);
    EXPECT_EQ(m_pTypes->CreateChannels("SubjectSegmentPose", {}, none), TQL::Result::NotFound);
    EXPECT_EQ(m_pTypes->CreateGlobalChannels("_RelativePose", "A", none), TQL::Result::InvalidArgument);
    EXPECT_EQ(m_Host.Faults(), std::vector<std::string>());
}

/// The first of two that were ticked is the reference, whichever id comes first, and the name tells it.
TEST_F(ChannelTypes, InputsLieInTheOrderOfTicking)
{
    const auto itemOf = [this](const char* i_pName)
    {
        return *Channels::SelectionOfChannel(Find("A", i_pName)->GetInstanceId());
    };
    const auto nameOf = [this](const char* i_pType, const std::vector<std::string>& i_rInputs)
    {
        return Text(*Create(i_pType, i_rInputs)[0]->GetParameters(), "InstanceDisplayName");
    };
    const std::vector<std::string> segments{"Ann:Pelvis", "Ann:Head"};
    m_Host.Selection()->Set({itemOf("Ann:Head"), itemOf("Ann:RFHD"), itemOf("Ann:Pelvis"), itemOf("Ann:LFHD")});
    EXPECT_EQ(nameOf("_RelativePose", segments), "Ann:Head (reference) ➞ Ann:Pelvis");
    EXPECT_EQ(nameOf("_DifferenceBetween", {"Ann:LFHD", "Ann:Head"}), "Ann:Head (reference) ➞ Ann:LFHD");
    EXPECT_EQ(nameOf("_DistanceBetween", {"Ann:LFHD", "Ann:RFHD"}), "Ann:RFHD ➞ Ann:LFHD");
    EXPECT_EQ(nameOf("_DistanceBetween", {"Knee", "Ann:RFHD"}), "Ann:RFHD ➞ Knee") << "not ticked: last";
    m_Host.Selection()->Set({itemOf("Ann:Pelvis"), itemOf("Ann:Head")});
    EXPECT_EQ(nameOf("_RelativePose", segments), "Ann:Pelvis (reference) ➞ Ann:Head");
    // A subject that is ticked stands for its root segment.
    const std::uint64_t ann = itemOf("Ann:Head").First;
    m_Host.Selection()->SetRootSegments([root = itemOf("Ann:Pelvis").Second](std::uint64_t) { return root; });
    m_Host.Selection()->Set({itemOf("Ann:Head"), {TQL::ESelectionKind::Subject, ann, 0, {}}});
    EXPECT_EQ(nameOf("_RelativePose", segments), "Ann:Head (reference) ➞ Ann:Pelvis");
}

TEST_F(ChannelTypes, ChannelsMigrateByNameThenByNumber)
{
    const auto migrate = [this](const Channel& i_rpChannel, const char* i_pContext)
    {
        std::vector<Channel> same, fallbacks;
        const TQL::IResult result = m_pMigration->Migrate(i_rpChannel, i_pContext, same, fallbacks);
        if (result.IsError())
            return std::string(result.Name());
        EXPECT_EQ(same.size() + fallbacks.size(), 1u);
        const Channel& rpFound = same.empty() ? fallbacks.front() : same.front();
        EXPECT_NE(VCheckedChannels::Unwrap(rpFound), rpFound);
        return (same.empty() ? "like " : "same ") + rpFound->GetInstanceId().DataContextName + " " +
               Text(*rpFound->GetParameters(), "InstanceDisplayName");
    };
    const std::vector<std::pair<const char*, const char*>> cases{
        {"Ann:RFHD", "same B Ann:RFHD"},
        {"Bob:LFHD", "same B Bob:LFHD"},  // another number there
        {"Ann:LFHD", "like B Bob:LFHD"},  // of the subject with the same number
        {"Ann:Head", "like B Cid:Head"},  // another subject's
        {"Ann:Pelvis", "like B Bob:Hip"}, // the same numbers
        {"Knee", "like B Cid:LFHD"},      // the same numbers
        {"Ann:Toe", "NotFound"},          // neither name nor numbers
        {"Fy", "same B Fy"},
        {"Fx", "like B Fy"},
    };
    for (const auto& [pName, pExpected] : cases)
        EXPECT_EQ(migrate(Find("A", pName), "B"), pExpected) << pName;
    EXPECT_EQ(migrate(Create("_DistanceBetween", {"Ann:RFHD", "Bob:LFHD"})[0], "B"), "same B Ann:RFHD ➞ Bob:LFHD");
    EXPECT_EQ(migrate(Create("_DistanceBetween", {"Ann:RFHD", "Ann:LFHD"})[0], "B"), "like B Ann:RFHD ➞ Bob:LFHD");
    EXPECT_EQ(migrate(Create("_DistanceBetween", {"Ann:RFHD", "Ann:Toe"})[0], "B"), "NotFound");
    EXPECT_EQ(migrate(m_pChannels->CreateDerivedChannel("Cache", {}, {Find("A", "Fx")}), "B"), "NotSupported");
    EXPECT_EQ(migrate(Find("A", "Fx"), "C"), "NotFound");

    // A global channel stays what it is, and so does what is made from it.
    const Channels::VLiveContext capture("Live", m_pService->GetSubTypes(), {});
    m_pService->SetGlobalChannels(Channels::VLiveMonitors(capture, m_pService->GetSubTypes(), 120.0).GetContext());
    const Channel pMonitor = m_pChannels->GetChannel({"", "Monitor", 1, 0, ""});
    EXPECT_EQ(migrate(pMonitor, "B"), "same GlobalItems Relative frame rate");
    const auto& rRecord = ChannelSystemUtils::GetDerivativeRecord(1, 0);
    EXPECT_EQ(migrate(m_pChannels->CreateDerivedChannel("Derivative", rRecord, {pMonitor}), "B"),
              "same GlobalItems Relative frame rate");
    EXPECT_EQ(migrate(nullptr, "B"), "InvalidArgument");
    EXPECT_EQ(m_Host.Faults(), std::vector<std::string>());
}

TEST_F(ChannelTypes, ThingsOfAContext)
{
    const auto pContext = m_pService->FindContext("B");
    const auto list = [](const std::vector<TQL::SelectionItem>& i_rItems)
    {
        std::string text;
        for (const TQL::SelectionItem& rItem : i_rItems)
            text += std::to_string(static_cast<int>(rItem.Kind)) + "/" + std::to_string(rItem.First) + " ";
        return text;
    };
    EXPECT_EQ(list(Channels::SubjectsOf(*pContext)), "6/0 6/1 6/2 ");
    EXPECT_EQ(list(Channels::DevicesOf(*pContext)), "5/0 ");
    EXPECT_EQ(Channels::RootSegmentOf(*m_pService->FindContext("A"), 0), 0u);
    EXPECT_EQ(Channels::RootSegmentOf(*pContext, 7), 0u);
}

} // namespace Services
