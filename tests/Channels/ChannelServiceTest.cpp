#include "Channels/Contexts/VLiveContext.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "Reference.h"
#include "support/LogGuard.h"

#include <numbers>

namespace ChannelsTest
{

namespace
{

using Channels::VChannelService;
using Recordings::EChannelKind;
using TQL::IChannelInstanceId;

std::shared_ptr<Recordings::VRecording> MakeRecording()
{
    auto pRecording = std::make_shared<Recordings::VRecording>();
    pRecording->Range = {0, 10 * TQL::DefaultFramePeriod};
    const auto add = [&](EChannelKind i_Kind, std::string i_Name, std::string i_Subject, std::string i_Units,
                         std::vector<std::string> i_Components)
    {
        Recordings::RecordedChannel channel;
        channel.Kind = i_Kind;
        channel.Name = std::move(i_Name);
        channel.Subject = std::move(i_Subject);
        channel.Units = std::move(i_Units);
        channel.Samples.assign(i_Components.size() * 10, 1.0f);
        channel.ComponentNames = std::move(i_Components);
        pRecording->Channels.push_back(std::move(channel));
    };
    add(EChannelKind::Marker, "Ann:LFHD", "Ann", "mm", {"X", "Y", "Z"});
    add(EChannelKind::Marker, "Ann:RFHD", "Ann", "mm", {"X", "Y", "Z"});
    add(EChannelKind::Marker, "Bob:LFHD", "Bob", "mm", {"X", "Y", "Z"});
    add(EChannelKind::SegmentPose, "Bob:Pelvis", "Bob", "m", {"RX", "RY", "RZ", "TX", "TY", "TZ"});
    add(EChannelKind::Analog, "Fx", "", "N", {""});
    add(EChannelKind::Analog, "EMG", "", "arb. units", {""});
    add(EChannelKind::JointAngles, "Hip", "", "deg", {"X", "Y", "Z"});
    pRecording->Channels.back().RotationOrder = "ZXY";
    add(EChannelKind::Column, "ankle", "", "", {""});
    add(EChannelKind::ModelOutput, "Ann:LKneeAngles", "Ann", "deg", {"X", "Y", "Z"});
    pRecording->Channels.back().Quantity = "Angle";
    add(EChannelKind::Marker, "Ann:unit", "Ann", "", {"X", "Y", "Z"});
    add(EChannelKind::SegmentPose, "Bob:Femur", "Bob", "", {"RX", "RY", "RZ", "TX", "TY", "TZ"});
    return pRecording;
}

std::string Text(const std::shared_ptr<TQL::IChannel>& i_rpChannel, std::string_view i_Name)
{
    TQL::ParameterValue value;
    EXPECT_TRUE(i_rpChannel->GetParameters()->Read("", i_Name, value).IsSuccess()) << i_Name;
    return std::holds_alternative<std::string>(value) ? std::get<std::string>(value) : std::string();
}

} // namespace

TEST(ChannelService, RecordedChannelsAreFoundByTheirExactId)
{
    VChannelService service;
    const auto pRecording = MakeRecording();
    service.AddContext(std::make_shared<Channels::VRecordedContext>("Walk", service.GetSubTypes(), pRecording));
    struct Case
    {
        IChannelInstanceId Id;
        const char* pName; ///< null: not there
        const char* pComponents;
        const char* pFormat;
        const char* pUnits; ///< of each component
        TQL::SelectionItem Item;
    };
    using enum TQL::ESelectionKind;
    const std::vector<Case> cases{
        {{"Walk", "Labelled Reconstructions", 0, 1, ""},
         "Ann:RFHD",
         "TX,TY,TZ",
         "Position",
         "mm mm mm ",
         {Label, 0, 1, ""}},
        {{"Walk", "Labelled Reconstructions", 1, 0, ""},
         "Bob:LFHD",
         "TX,TY,TZ",
         "Position",
         "mm mm mm ",
         {Label, 1, 0, ""}},
        {{"Walk", "SubjectSegmentPose", 1, 0, ""},
         "Bob:Pelvis",
         "RX,RY,RZ,TX,TY,TZ",
         "Pose",
         "rad rad rad m m m ",
         {Segment, 1, 0, ""}},
        {{"Walk", "DeviceOutput", 0, 0, ""}, "Fx", "", "", "N ", {AnalogueDeviceOutput, 0, 0, ""}},
        {{"Walk", "DeviceOutput", 0, 1, ""}, "EMG", "", "", "arb. units ", {AnalogueDeviceOutput, 0, 1, ""}},
        {{"Walk", "ModelSetSamplesOutput", 0, 0, "Hip"},
         "Hip",
         "X,Y,Z",
         "EulerZXY",
         "° ° ° ",
         {ModelOutput, 0, 0, "Hip"}},
        {{"Walk", "ModelSetSamplesOutput", 1, 0, "ankle"}, "ankle", "", "", " ", {ModelOutput, 1, 0, "ankle"}},
        {{"Walk", "ModelSetSamplesOutput", 2, 0, "Ann:LKneeAngles"},
         "Ann:LKneeAngles",
         "X,Y,Z",
         "",
         "° ° ° ",
         {ModelOutput, 2, 0, "Ann:LKneeAngles"}},
        {{"Walk", "Labelled Reconstructions", 0, 2, ""},
         "Ann:unit",
         "TX,TY,TZ",
         "Position",
         "units units units ",
         {Label, 0, 2, ""}},
        {{"Walk", "SubjectSegmentPose", 1, 1, ""},
         "Bob:Femur",
         "RX,RY,RZ,TX,TY,TZ",
         "Pose",
         "rad rad rad units units units ",
         {Segment, 1, 1, ""}},
        {{"Other", "Labelled Reconstructions", 0, 1, ""}, nullptr, "", "", "", {}},
        {{"", "Labelled Reconstructions", 0, 1, ""}, nullptr, "", "", "", {}},
        {{"Walk", "Labelled Reconstructions", 0, 3, ""}, nullptr, "", "", "", {}},
        {{"Walk", "Labelled Reconstructions", 0, 1, "x"}, nullptr, "", "", "", {}},
        {{"Walk", "ModelSetSamplesOutput", 0, 0, ""}, nullptr, "", "", "", {}},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.Id.TypeName + " " + std::to_string(rCase.Id.First) + " " + std::to_string(rCase.Id.Second));
        const auto pChannel = service.GetChannel(rCase.Id);
        ASSERT_EQ(pChannel != nullptr, rCase.pName != nullptr);
        if (!pChannel)
            continue;
        EXPECT_TRUE(TQL::IsSameChannel(pChannel->GetInstanceId(), rCase.Id));
        EXPECT_EQ(Text(pChannel, "InstanceDisplayName"), rCase.pName);
        EXPECT_EQ(Text(pChannel, "ComponentDisplayNames"), rCase.pComponents);
        const TQL::ComponentDescription description = pChannel->GetDescription();
        EXPECT_EQ(description.FormatName, rCase.pFormat);
        std::string units;
        for (const TQL::ComponentGroup& rGroup : description.Groups)
        {
            for (const TQL::UnitFactor& rFactor : rGroup.Factors)
            {
                TQL::SubTypeRecord record;
                ASSERT_TRUE(service.GetSubTypeTable(rFactor.SubTypeId, record).IsSuccess());
                units += record.UnitText;
            }
            units += " ";
        }
        EXPECT_EQ(units, rCase.pUnits);
        EXPECT_EQ(Channels::SelectionOfChannel(rCase.Id), rCase.Item);
        const auto back = Channels::ChannelOfSelection(rCase.Item, "Walk", rCase.Id.TypeName);
        ASSERT_TRUE(back.has_value());
        EXPECT_TRUE(TQL::IsSameChannel(*back, rCase.Id));
        EXPECT_GE(pChannel->GetRevision(), 1u);
        EXPECT_EQ(pChannel->GetOutput()->GetChannel(), pChannel);
    }
    EXPECT_FALSE(Channels::ChannelOfSelection({Label, 0, 0, ""}, "Walk", "SubjectSegmentPose").has_value());
    EXPECT_FALSE(Channels::SelectionOfChannel({"Walk", "Cache", 0, 0, ""}).has_value());
}

TEST(ChannelService, ContextsComeGoAndAreReplaced)
{
    VChannelService service;
    int contextChanges = 0;
    int typeChanges = 0;
    service.ContextListChanged()->AddDirect([&] { ++contextChanges; });
    service.TypeListChanged()->AddDirect([&] { ++typeChanges; });
    const auto make = [&]
    {
        return std::make_shared<Channels::VRecordedContext>("Walk", service.GetSubTypes(), MakeRecording());
    };
    const auto pFirst = make();
    service.AddContext(pFirst);
    EXPECT_EQ(service.GetContextByName("Walk"), pFirst);
    EXPECT_EQ(service.GetContextByName("walk"), nullptr);
    EXPECT_EQ(pFirst->GetTickRange(), (TQL::TickRange{0, 10 * TQL::DefaultFramePeriod}));
    EXPECT_EQ(pFirst->GetType(), ChannelSystem::EContextType::Recorded);

    const IChannelInstanceId id{"Walk", "Labelled Reconstructions", 0, 0, ""};
    const auto pOldChannel = service.GetChannel(id);
    const auto pOldOutput = pOldChannel->GetOutput();
    service.AddContext(make());
    EXPECT_TRUE(pOldOutput->IsStale());
    EXPECT_EQ(pOldChannel->GetOutput(), nullptr);
    const auto pNewChannel = service.GetChannel(id);
    EXPECT_NE(pNewChannel, pOldChannel);
    EXPECT_NE(pNewChannel->GetOutput(), nullptr);

    EXPECT_TRUE(service.RemoveContext("Walk").IsSuccess());
    EXPECT_EQ(service.RemoveContext("Walk"), TQL::Result::NotFound);
    EXPECT_EQ(service.GetChannel(id), nullptr);
    EXPECT_EQ(contextChanges, 3);
    EXPECT_EQ(typeChanges, 3);
}

TEST(ChannelService, ListsTheTypesThatAContextHas)
{
    VChannelService service;
    service.AddContext(std::make_shared<Channels::VRecordedContext>("Walk", service.GetSubTypes(), MakeRecording()));
    const auto pLive =
        std::make_shared<Channels::VLiveContext>("Live", service.GetSubTypes(), Channels::VLiveContext::Options{});
    service.AddContext(pLive);
    std::uint32_t channel = 0;
    EXPECT_TRUE(pLive->AddChannel({"SubjectSegmentPose", 0, 0, "", "", "", {}}, 0, channel).IsSuccess());
    const std::vector<std::string> all{"Labelled Reconstructions", "SubjectSegmentPose", "DeviceOutput",
                                       "ModelSetSamplesOutput"};
    EXPECT_EQ(service.GetChannelTypes(0, "Walk"), all);
    EXPECT_EQ(service.GetChannelTypes(~0ull, ""), all);
    EXPECT_EQ(service.GetChannelTypes(0, "Live"), std::vector<std::string>{"SubjectSegmentPose"});
    EXPECT_TRUE(service.GetChannelTypes(0, "Other").empty());
    for (const std::string& rType : all)
    {
        const auto pParameters = service.GetTypeParameters(rType);
        ASSERT_NE(pParameters, nullptr);
        TQL::ParameterValue value;
        EXPECT_TRUE(pParameters->Read("ChannelTypeParameters", "Selection", value).IsSuccess());
        EXPECT_GT(std::get<std::int32_t>(value), 0);
    }
    EXPECT_EQ(service.GetTypeParameters("Cache"), nullptr);
}

TEST(ChannelService, EveryCacheIsNewAndKnownWhileItLives)
{
    VChannelService service;
    service.AddContext(std::make_shared<Channels::VRecordedContext>("Walk", service.GetSubTypes(), MakeRecording()));
    const auto pInput = service.GetChannel({"Walk", "Labelled Reconstructions", 0, 0, ""});
    auto pFirst = service.CreateDerivedChannel("Cache", {}, {pInput});
    auto pSecond = service.CreateDerivedChannel("Cache", {}, {pInput});
    ASSERT_NE(pFirst, nullptr);
    EXPECT_NE(pFirst, pSecond);
    const IChannelInstanceId id = pFirst->GetInstanceId();
    EXPECT_EQ(id.DataContextName, "Walk");
    EXPECT_EQ(id.TypeName, "Cache");
    EXPECT_EQ(id.Text, "Position");
    EXPECT_TRUE(TQL::IsSameChannel(id, pSecond->GetInstanceId()));
    std::vector<std::shared_ptr<TQL::IChannel>> inputs;
    pFirst->GetDependentChannels(inputs);
    EXPECT_EQ(inputs, std::vector<std::shared_ptr<TQL::IChannel>>{pInput});
    EXPECT_EQ(service.GetChannel(id), pSecond) << "the newest";
    pSecond = nullptr;
    EXPECT_EQ(service.GetChannel(id), pFirst);
    pFirst = nullptr;
    EXPECT_EQ(service.GetChannel(id), nullptr);
    EXPECT_EQ(service.CreateDerivedChannel("Cache", {}, {}), nullptr);
    EXPECT_EQ(service.CreateDerivedChannel("Cache", {}, {nullptr}), nullptr);
    EXPECT_EQ(service.CreateDerivedChannel("Cache", {}, {pInput, pInput}), nullptr);
    EXPECT_EQ(service.CreateDerivedChannel("NoSuchOperation", {}, {pInput}), nullptr);
    for (int i = 0; i < 1000; ++i)
        EXPECT_NE(service.CreateDerivedChannel("Cache", {}, {pInput}), nullptr);
}

TEST(ChannelService, UnitsOfRecordingsFindTheirSubtype)
{
    struct Case
    {
        const char* pText;
        const char* pName;
        const char* pShown;
        std::uint16_t Dimension;
        double Scale;
    };
    constexpr double degree = std::numbers::pi / 180.0;
    const std::vector<Case> cases{
        {"mm", "millimeter", "mm", 0, 1e-3},
        {" mm ", "millimeter", "mm", 0, 1e-3},
        {"millimeters", "millimeter", "mm", 0, 1e-3},
        {"m", "meter", "m", 0, 1.0},
        {"cm", "centimeter", "cm", 0, 1e-2},
        {"deg", "degree", "°", 7, degree},
        {"degrees", "degree", "°", 7, degree},
        {"rad", "radian", "rad", 7, 1.0},
        {"V", "volt", "V", 15, 1.0},
        {"volts", "volt", "V", 15, 1.0},
        {"mV", "millivolt", "mV", 15, 1e-3},
        {"uV", "microvolt", "µV", 15, 1e-6},
        {"N", "newton", "N", 10, 1.0},
        {"s", "second", "s", 2, 1.0},
        {"Hz", "hertz", "Hz", 9, 1.0},
        {"min", "minute", "min", 2, 60.0},
        {"cd", "candela", "cd", 6, 1.0},
        {"MM", "millimeter", "mm", 0, 1e-3},
        {"N*m", "newton meter", "N·m", 30, 1.0},
        {"\xCE\xBCs", "microsecond", "µs", 2, 1e-6},
        {"deg/s", "deg/s", "deg/s", 0xffff, 1.0},
        {"units", "units", "units", 0xffff, 1.0},
        {"Nmm", "Nmm", "Nmm", 0xffff, 1.0},
    };
    Channels::VSubTypeTable table;
    for (const Case& rCase : cases)
    {
        TQL::SubTypeRecord record;
        ASSERT_TRUE(table.Find(table.IdOfUnit(rCase.pText), record).IsSuccess()) << rCase.pText;
        EXPECT_EQ(record.Name, rCase.pName) << rCase.pText;
        EXPECT_EQ(record.UnitText, rCase.pShown) << rCase.pText;
        EXPECT_EQ(record.Dimension, rCase.Dimension) << rCase.pText;
        EXPECT_DOUBLE_EQ(record.Scale, rCase.Scale) << rCase.pText;
    }
    EXPECT_EQ(table.IdOfUnit("mm"), Channels::VSubTypeTable::Millimetre);
    EXPECT_EQ(table.IdOfUnit("m"), Channels::VSubTypeTable::Metre);
    EXPECT_EQ(table.IdOfUnit("rad"), Channels::VSubTypeTable::Radian);
    EXPECT_EQ(table.IdOfUnit("deg"), Channels::VSubTypeTable::Degree);
    EXPECT_EQ(table.IdOfUnit("Nmm"), Channels::VSubTypeTable().IdOfUnit("Nmm")) << "the same in every run";
    TQL::SubTypeRecord record;
    for (const std::uint16_t id : {0x00ff, 0x7f00, 0x8001})
        EXPECT_EQ(table.Find(id, record), TQL::Result::InvalidId) << id;
    std::uint16_t id = 0;
    EXPECT_TRUE(table.FindByName("centi", "meter", id));
    EXPECT_EQ(id, table.IdOfUnit("cm"));
    EXPECT_FALSE(table.FindByName("centi", "yard", id));
}

TEST(ChannelService, RecordedChannelThatMakesNoSenseIsLeftOutWithAWord)
{
    TestSupport::LogGuard log;
    const auto pRecording = MakeRecording();
    pRecording->Channels[0].SamplePeriod = 0;
    pRecording->Channels[1].ComponentNames.clear();
    pRecording->Channels[2].Samples.resize(29); // not a whole number of rows
    const auto pContext =
        std::make_shared<Channels::VRecordedContext>("Walk", std::make_shared<Channels::VSubTypeTable>(), pRecording);
    EXPECT_EQ(pContext->GetChannels()->size(), pRecording->Channels.size() - 2);
    EXPECT_EQ(log.Take().size(), 2u);
    const auto pShort = pContext->FindChannel({"Walk", "Labelled Reconstructions", 1, 0, ""});
    ASSERT_NE(pShort, nullptr);
    EXPECT_EQ(pShort->GetSamples()->GetRange().Last, 9 * TQL::DefaultFramePeriod);
}

} // namespace ChannelsTest
