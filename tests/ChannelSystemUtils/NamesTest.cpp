#include "ChannelSystemUtils/ChannelNames.h"
#include "ChannelSystemUtils/ChannelParameterAccess.h"
#include "ChannelSystemUtils/FakeChannels.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

using namespace ChannelSystemUtils;

namespace
{

TEST(ChannelNames, DerivationsAreCalledWhatTheyAre)
{
    const std::pair<const char*, const char*> cases[] = {
        {"Position 1st Derivative", "Velocity"},
        {"Position 2nd Derivative", "Acceleration"},
        {"Difference Between 1st Derivative", "Velocity Between"},
        {"Difference Between 2nd Derivative", "Acceleration Between"},
        {"Rotation 1st Derivative", "Angular Velocity"},
        {"Rotation 2nd Derivative", "Angular Acceleration"},
        {"Angle 1st Derivative", "Angular Velocity"},
        {"Angle 2nd Derivative", "Angular Acceleration"},
        {"Angle Between 1st Derivative", "Angular Velocity Between"},
        {"Angle Between 2nd Derivative", "Angular Acceleration Between"},
        {"Position (Magnitude)", "Distance From Origin"},
        {"Relative Rotation (Magnitude)", "Relative Angle"},
        {"Difference Between (Magnitude)", "Distance Between"},
        // What an earlier row wrote is seen by a later one.
        {"Position 1st Derivative (Magnitude)", "Speed"},
        {"Rotation 1st Derivative (Magnitude)", "Angular Speed"},
        {"Angle 1st Derivative (Magnitude)", "Angular Speed"},
        {"Position 2nd Derivative (Magnitude)", "Acceleration (Magnitude)"},
        // No row is tied to the beginning, so a shorter text goes first even inside a longer one.
        {"Relative Position (Magnitude)", "Relative Distance From Origin"},
        {"Relative Position 1st Derivative", "Relative Velocity"},
        {"Angular Velocity (Magnitude)", "Angular Speed"},
        {"Position 1st Derivative, Position 1st Derivative", "Velocity, Velocity"},
        // Case and brackets count.
        {"position 1st derivative", "position 1st derivative"},
        {"Position Magnitude", "Position Magnitude"},
        {"Pose (Euler XYX)", "Pose (Euler XYX)"},
        {"", ""},
    };
    for (const auto& [pType, pExpected] : cases)
        EXPECT_EQ(RenameType(pType), pExpected) << pType;
}

TEST(ChannelNames, TypeAndInstance)
{
    struct Case
    {
        const char* pType; ///< null: not set
        const char* pInstance;
        const char* pTypeName;
        const char* pDisplayName;
    };
    const Case cases[] = {
        {"Position 1st Derivative (Magnitude)", "LASI", "Speed", "Speed - LASI"},
        {"Position", "", "Position", "Position"},
        {"Position", nullptr, "Position", "Position"},
        {"Pose", " of Pelvis", "Pose", "Pose of Pelvis"},
        {"Distance Between", "LASI \u279E RASI", "Distance Between", "Distance Between - LASI \u279E RASI"},
        {nullptr, "LASI", "LabelPosition", "LabelPosition - LASI"},
        {"", "", "LabelPosition", "LabelPosition"},
    };
    for (const Case& rCase : cases)
    {
        FakeChannels::Channel channel(TQL::IChannelInstanceId{"", "LabelPosition", 0, 0, ""});
        if (rCase.pType)
            channel.SetText("TypeDisplayName", rCase.pType);
        if (rCase.pInstance)
            channel.SetText("InstanceDisplayName", rCase.pInstance);
        EXPECT_EQ(ComposeChannelNames(channel), (ChannelNames{rCase.pTypeName, rCase.pDisplayName}));
    }
}

TEST(ChannelNames, ComponentsAreCutAtCommas)
{
    struct Case
    {
        const char* pNames;
        std::size_t Index;
        const char* pExpected; ///< null: past the end
    };
    const Case cases[] = {{"TX,TY,TZ", 0, "TX"},
                          {"TX,TY,TZ", 2, "TZ"},
                          {"TX,TY,TZ", 3, nullptr},
                          {"TX, TY ,", 1, " TY "},
                          {"TX, TY ,", 2, ""},
                          {"", 0, nullptr},
                          {",", 1, ""}};
    for (const Case& rCase : cases)
    {
        std::string name = "left over";
        EXPECT_EQ(GetComponentName(rCase.pNames, rCase.Index, name),
                  rCase.pExpected ? TQL::Result::Ok : TQL::Result::InvalidIndex);
        EXPECT_EQ(name, rCase.pExpected ? rCase.pExpected : "");
    }
}

TEST(ChannelParameters, TheKindOfSelectionIsReadByNumberOrName)
{
    TestSupport::LogGuard log;
    using Kind = TQL::ESelectionKind;
    const std::tuple<TQL::ParameterValue, TQL::IResult, Kind> cases[] = {
        {std::int32_t{10}, TQL::Result::Ok, Kind::Segment},
        {std::int64_t{15}, TQL::Result::Ok, Kind::ModelOutput},
        {std::string("AnalogueDeviceOutput"), TQL::Result::Ok, Kind::AnalogueDeviceOutput},
        {std::int32_t{16}, TQL::Result::InvalidType, Kind::None},
        {std::int32_t{-1}, TQL::Result::InvalidType, Kind::None},
        {std::string("segment"), TQL::Result::InvalidType, Kind::None},
        {true, TQL::Result::InvalidType, Kind::None}};
    for (const auto& [rValue, result, expected] : cases)
    {
        FakeHost::Parameters parameters;
        (void)parameters.SetParameter("Selection", rValue);
        Kind kind = Kind::Net;
        EXPECT_EQ(ReadSelectionParameter(parameters, kind), result);
        EXPECT_EQ(kind, expected);
        const auto entries = log.Take();
        EXPECT_EQ(entries.empty() ? "" : entries[0].Text,
                  result.IsError() ? "Failed to interpret default value as expected type." : "");
    }
    Kind kind = Kind::Net;
    EXPECT_EQ(ReadSelectionParameter(FakeHost::Parameters(), kind), TQL::Result::NotFound);
    EXPECT_TRUE(log.Take().empty());
}

} // namespace
