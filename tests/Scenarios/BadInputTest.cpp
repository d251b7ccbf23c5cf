#include "GraphPlotSystem/Subplots/VSubplotManager.h"
#include "GraphPlotSystem/Subplots/VSubplotModel.h"
#include "Scenarios/PlotScenario.h"
#include "Scenarios/SmallTake.h"

#include <functional>
#include <initializer_list>

using namespace GraphPlotUI;

namespace
{

class BadInput : public PlotScenario
{
protected:
    void SetUp() override
    {
        if (!BeginDrawing())
            GTEST_SKIP() << "no desktop OpenGL context here: traces are not tested";
        auto pRecording = SmallTake::MakeRecording();
        pRecording->Channels.push_back(pRecording->Channels[2]);
        pRecording->Channels.back().Name = "Fast";
        pRecording->Channels.back().SamplePeriod /= 2;
        Recordings::RecordedChannel& rMarked = pRecording->Channels.emplace_back();
        rMarked.Name = "<img src='http://127.0.0.1/name'>";
        rMarked.ComponentNames = {"<b>1</b>"};
        rMarked.Units = "<img src='http://127.0.0.1/unit'>";
        rMarked.Samples = {1, 2, 3};
        AddRecording("Take", pRecording);
        Show("Take");
    }

    std::shared_ptr<TQL::IChannel> Compute(const char* i_pExpression, const std::vector<std::string>& i_rInputs)
    {
        ChannelSystem::VDerivedChannelParameters record;
        record.Hash = 1 + std::hash<std::string>()(i_pExpression);
        record.TypeParameters = {{"TypeDisplayName", std::string("Mine")}};
        record.OperationParameters = {{"Expression", std::string(i_pExpression)}};
        std::vector<std::shared_ptr<TQL::IChannel>> inputs;
        for (const std::string& rInput : i_rInputs)
            inputs.push_back(FindSource(rInput));
        return pService->CreateDerivedChannel("AlgebraicExpression", record, inputs);
    }
};

TEST_F(BadInput, WhatCannotBeComputedSaysWhyAndThePlotGoesOn)
{
    struct Case
    {
        const char* pExpression;
        std::vector<std::string> Inputs;
        const char* pError;
    };
    Select({"Anna:LASI"});
    Settle();
    const std::string before = Subplots();
    ASSERT_NE(before, "");
    for (const Case& rCase : std::initializer_list<Case>{
             {"mag(#0", {"Anna:LASI"}, "The expression ends where ',' or ')' was expected, at character 7."},
             {"magnitude(#0)", {"Anna:LASI"}, "There is no function and no unit \"magnitude\"."},
             {"Angle(#0)", {"Anna:LASI"}, "Angle needs a rotation, but #0 is a position."},
             {"EulerXYZ(#0)", {"Force.Fz"}, "EulerXYZ needs a rotation, but #0 is a single number."},
             {"Position(#0)", {"Knee"}, "Position needs a position or a pose, but #0 is a rotation."},
             {"millimeter(#0)", {"Ratio"}, "#0 cannot be given in millimeter; it has no unit."},
             {"degree(#0)", {"Force.Fz"}, "#0 cannot be given in degree; it has N."},
             {"#1", {"Anna:LASI"}, "There is no input #1; the inputs are #0 to #0."},
             {"#0-#1", {"Anna:LASI", "Torque"}, "#0 and #1 have no difference: a position and a single number."},
             {"mag(#0-#1)",
              {"Anna:LASI", "Fast"},
              "\"Anna:LASI\" has 120 samples a second and \"Fast\" has 240; only channels of "
              "the same rate can be computed with."},
             {"#0-#1", {"Force.Fz", "Torque"}, "The units of #0-#1 do not go together: N and N·m."},
         })
    {
        const auto pChannel = Compute(rCase.pExpression, rCase.Inputs);
        ASSERT_TRUE(pChannel) << rCase.pExpression;
        EXPECT_EQ(pChannel->GetOutput(), nullptr) << rCase.pExpression;
        EXPECT_EQ(ErrorOf(pChannel), rCase.pError) << rCase.pExpression;
        GraphPlotState state = SaveState();
        state.PinnedChannels = {pChannel};
        EXPECT_EQ(ApplyState(state), TQL::Result::Ok);
        Settle();
        EXPECT_EQ(Subplots(), before);
        EXPECT_EQ(Key().substr(0, 4), "Mine") << rCase.pExpression;
    }
}

TEST_F(BadInput, MarksInNamesAndUnitsAreShownAndNotObeyed)
{
    Select({"<img src='http://127.0.0.1/name'>"});
    Settle();
    const QModelIndex subplot = pSystem->GetSubplotManager()->GetSubplotModel()->index(0);
    for (const int role : {TQL::SubplotModelRoles::SubplotYAxisUnits, TQL::SubplotModelRoles::SubplotYAxisToolTip})
    {
        const std::string text = subplot.data(role).toString().toStdString();
        EXPECT_EQ(text.find("<img"), std::string::npos) << text;
        EXPECT_NE(text.find("&lt;img src='http://127.0.0.1/unit'&gt;"), std::string::npos) << text;
    }
}

TEST_F(BadInput, WhatATypeCannotTakeIsToldInTheLog)
{
    PickType("_DistanceBetween");
    Select({"Anna:LASI", "Anna:RASI", "Anna:C7"});
    EXPECT_EQ(Values(3), "Distance Between - Anna:LASI ➞ Anna:RASI: 50\n") << "the third has no partner";
    EXPECT_TRUE(Log.Take().empty());

    Select({"Anna:LASI", "Fast"});
    EXPECT_EQ(Plotted(), "");
    std::string told;
    for (const auto& rEntry : Log.Take())
        told += rEntry.Text + "\n";
    EXPECT_EQ(told,
              "Channel AlgebraicExpression Error \"Anna:LASI\" has 120 samples a second and \"Fast\" has 240; only "
              "channels of the same rate can be computed with.\n");
    Select({"Anna:LASI", "Anna:RASI"});
    Settle();
    EXPECT_EQ(Subplots(), "Distance Between (mm): Distance Between - Anna:LASI ➞ Anna:RASI#0\n");
}

TEST_F(BadInput, AStateOfAnotherVersionGivesThePlotAsFarAsItIsKnown)
{
    Select({"Anna:Pelvis"});
    GraphPlotState state;
    state.ActiveChannels.SelectedChannelType = "_MomentAbout";
    state.ActiveChannels.GlobalChannelType = "Weather";
    state.ActiveChannels.RotationFormat = 77;
    state.ActiveChannels.RotationUnits = 5;
    state.ActiveChannels.LengthUnits = 9;
    state.ActiveChannels.DerivativeOrder = 7;
    state.ActiveChannels.DisabledComponents[1234567] = {0, 99};
    EXPECT_EQ(ApplyState(state), TQL::Result::OkButModified);
    EXPECT_EQ(Plotted(), "Pose - Anna:Pelvis | RX,RY,RZ,TX,TY,TZ | rad[3] m[3]\n");
    EXPECT_EQ(Values(3), "Pose - Anna:Pelvis: 0 0 0.3 0.1 0 0.9\n");
    Choose("");
    Settle();
    EXPECT_EQ(Subplots().substr(0, 24), "Pose (Helical) : RX (°)") << "and everything can be chosen again";
}

} // namespace
