#include "GraphPlotSystem/Subplots/VSubplotManager.h"
#include "Scenarios/PlotScenario.h"
#include "Scenarios/SmallTake.h"

using namespace GraphPlotUI;
using namespace TQL::SubplotLayoutModes;

namespace
{

/// A line a component of a position, each with these traces.
std::string Positions(const std::string& i_rTraces)
{
    std::string text;
    for (const char* pComponent : {"TX", "TY", "TZ"})
        text += std::string("Position : ") + pComponent + " (mm): " + i_rTraces + "\n";
    return text;
}

/// Of a key: a line a component of a position.
std::string KeyOf(const std::string& i_rChannel, const std::string& i_rMarks)
{
    std::string text;
    for (const char* pComponent : {" TX", " TY", " TZ"})
        text += i_rChannel + pComponent + i_rMarks + "\n";
    return text;
}

constexpr const char* s_pLeft = "Position - Anna:LASI";
constexpr const char* s_pRight = "Position - Anna:RASI";
constexpr const char* s_pBoth = "Position - Anna:LASI#0, Position - Anna:RASI#1";

class Following : public PlotScenario
{
protected:
    void SetUp() override
    {
        if (!BeginDrawing())
            GTEST_SKIP() << "no desktop OpenGL context here: traces are not tested";
        AddRecording("Take", SmallTake::MakeRecording());
        Show("Take");
        Select({"Anna:LASI", "Anna:RASI"});
        Settle();
        ASSERT_EQ(Subplots(), Positions(s_pBoth));
    }
};

TEST_F(Following, ChannelsAreLostAndFoundAgain)
{
    Pin(s_pRight);
    EXPECT_EQ(Key(), KeyOf(s_pLeft, "#0") + KeyOf(s_pRight, "#1*"));

    RemoveContext("Take");
    Settle();
    EXPECT_EQ(Subplots(), Positions("Position - Anna:RASI#1")) << "the trace of what is pinned stays";
    EXPECT_EQ(Key(), "Position - Anna:RASI TX#1*?\n") << "without data it is not known what the channel consists of";

    AddRecording("Take", SmallTake::MakeRecording());
    Show("Take");
    Settle();
    EXPECT_EQ(Subplots(), Positions(s_pBoth));
    EXPECT_EQ(Key(), KeyOf(s_pLeft, "#0") + KeyOf(s_pRight, "#1")) << "another recording begins without pins";

    Pin(s_pRight);
    auto pChanged = SmallTake::MakeRecording();
    pChanged->Channels[1].Samples.assign(pChanged->Channels[1].Samples.size(), 7.0f);
    AddRecording("Take", pChanged); // in place of the other
    Settle();
    EXPECT_EQ(Subplots(), Positions(s_pBoth));
    EXPECT_EQ(Key(), KeyOf(s_pLeft, "#0") + KeyOf(s_pRight, "#1")) << "and so does the same one";
    EXPECT_EQ(Values(3), "Position - Anna:LASI: 30 100 300\nPosition - Anna:RASI: 7 7 7\n");

    Pin(s_pRight);
    Select({});
    Settle();
    EXPECT_EQ(Subplots(), Positions("Position - Anna:RASI#1"));
    Pin(s_pRight, false);
    Select({"Anna:C7"});
    Settle();
    EXPECT_EQ(Key(), KeyOf("Position - Anna:C7", "#0"));
}

TEST_F(Following, FindsWhatIsPinnedOfARecordingThatIsReadAgain)
{
    AddRecording("Other", SmallTake::MakeRecording("Berta"));
    Show("Other");
    Select({"Berta:LASI", "Berta:RASI"});
    Pin("Position - Berta:RASI");
    PickType("_DistanceBetween");
    Pin("Distance Between - Berta:LASI ➞ Berta:RASI");
    const GraphPlotState state = SaveState();
    Show("Take");
    (void)ApplyState(state);
    Select({});
    Settle();
    const std::string seen = Subplots();
    EXPECT_EQ(Values(3), "Distance Between - Berta:LASI ➞ Berta:RASI: 50\nPosition - Berta:RASI: 30 60 330\n");

    auto pChanged = SmallTake::MakeRecording("Berta");
    pChanged->Channels[1].Samples.assign(pChanged->Channels[1].Samples.size(), 300.0f);
    AddRecording("Other", pChanged);
    Settle();
    EXPECT_EQ(Subplots(), seen) << "with the colours that they had";
    EXPECT_EQ(Key().find('?'), std::string::npos) << Key();
    EXPECT_EQ(Values(2), "Distance Between - Berta:LASI ➞ Berta:RASI: 344.093\nPosition - Berta:RASI: 300 300 300\n");
}

TEST_F(Following, ColoursStayWithTheirChannelsInBothLayouts)
{
    Select({"Anna:RASI", "Anna:C7"});
    Settle();
    EXPECT_EQ(Subplots(), Positions("Position - Anna:C7#0, Position - Anna:RASI#1"));

    pSystem->GetSubplotManager()->SetSubplotLayoutMode(SingleSubplot);
    Settle();
    EXPECT_EQ(Subplots(), ": Position - Anna:C7 : TX#0, Position - Anna:C7 : TY#1, Position - Anna:C7 : TZ#2, "
                          "Position - Anna:RASI : TX#3, Position - Anna:RASI : TY#4, Position - Anna:RASI : TZ#5\n");
    SwitchComponent(s_pRight, 1, false);
    Settle();
    EXPECT_EQ(Subplots(), ": Position - Anna:C7 : TX#0, Position - Anna:C7 : TZ#2, "
                          "Position - Anna:RASI : TX#3, Position - Anna:RASI : TZ#5\n");
    EXPECT_EQ(Key(), "Position - Anna:C7 TX#0\nPosition - Anna:C7 TZ#2\n"
                     "Position - Anna:RASI TX#3\nPosition - Anna:RASI TZ#5\n");

    pSystem->GetSubplotManager()->SetSubplotLayoutMode(SubplotPerTraceType);
    Select({"Anna:RASI"});
    Settle();
    EXPECT_EQ(Subplots(), "Position : TX (mm): Position - Anna:RASI#1\nPosition : TZ (mm): Position - Anna:RASI#1\n");
    SwitchComponent(s_pRight, 1, true);
    Settle();
    EXPECT_EQ(Subplots(), Positions("Position - Anna:RASI#1"));
}

TEST_F(Following, EachSubplotTellsWhatIsInIt)
{
    EXPECT_EQ(ToolTip(1), "<b>Channels:</b><br>Position - Anna:LASI (TY)<br>Position - Anna:RASI (TY)<br>"
                          "<b>Units:</b><br>mm<br><b>Data contexts:</b><br>Take");
    PickType("_DifferenceBetween");
    Choose("d2 mag");
    Settle();
    EXPECT_EQ(Subplots(), "Acceleration Between (Magnitude) (mm/s<sup>2</sup>): "
                          "Acceleration Between (Magnitude) - Anna:LASI (reference) ➞ Anna:RASI#0\n");
    EXPECT_EQ(ToolTip(0), "<b>Channels:</b><br>Acceleration Between (Magnitude) - Anna:LASI (reference) ➞ Anna:RASI<br>"
                          "<b>Units:</b><br>mm/s<sup>2</sup><br><b>Data contexts:</b><br>Take");
}

TEST_F(Following, GoesFromARecordingToACaptureAndOnToAnother)
{
    Pin(s_pRight);
    AddCapture("#Live");
    Show("#Live");
    Settle();
    EXPECT_EQ(Subplots(), Positions(s_pBoth)) << "of the capture; the pin was of the view that was left";
    EXPECT_EQ(Key(), KeyOf(s_pLeft, "#0") + KeyOf(s_pRight, "#1"));

    Pin(s_pLeft);
    PickType("_DistanceBetween");
    Settle();
    Pin("Distance Between - Anna:LASI ➞ Anna:RASI");
    const GraphPlotState state = SaveState();
    Select({});
    RemoveContext("#Live");
    AddRecording("#Next", SmallTake::MakeRecording("Berta"));
    Show("#Next");
    EXPECT_EQ(Plotted(), "");
    (void)ApplyState(state);
    AddRecording("Plain", SmallTake::MakeRecording()); // a notice
    Settle();
    EXPECT_EQ(Plotted(), "Distance Between - Berta:LASI ➞ Berta:RASI |  | mm\n"
                         "Position - Berta:LASI | TX,TY,TZ | mm[3]\n")
        << "what a stored plot has pinned follows: the same markers of another subject";
    EXPECT_EQ(Values(3), "Distance Between - Berta:LASI ➞ Berta:RASI: 50\nPosition - Berta:LASI: 30 100 300\n");

    Show("Plain");
    (void)ApplyState(state);
    RemoveContext("#Next"); // another notice
    Settle();
    EXPECT_EQ(Key(), "") << "nothing goes to a recording that is opened by itself";
}

TEST_F(Following, TakesItsStateBack)
{
    PickType("_DifferenceBetween");
    Choose("d1 cm rad f4");
    pSystem->GetSubplotManager()->SetSubplotLayoutMode(SingleSubplot);
    SwitchComponent("Velocity Between - Anna:LASI (reference) ➞ Anna:RASI", 2, false);
    Pin("Velocity Between - Anna:LASI (reference) ➞ Anna:RASI");
    Settle();
    const std::string seen = Subplots();
    EXPECT_EQ(seen, ": Velocity Between - Anna:LASI (reference) ➞ Anna:RASI : TX#0, "
                    "Velocity Between - Anna:LASI (reference) ➞ Anna:RASI : TY#1\n");
    const GraphPlotState state = SaveState();

    EXPECT_EQ(ApplyState(GraphPlotState()), TQL::Result::Ok);
    Settle();
    EXPECT_EQ(Subplots(), Positions(s_pBoth));
    Select({});
    EXPECT_EQ(ApplyState(state), TQL::Result::Ok);
    Settle();
    EXPECT_EQ(Subplots(), seen);
    const GraphPlotState again = SaveState();
    EXPECT_EQ(again.ActiveChannels, state.ActiveChannels);
    EXPECT_EQ(again.PinnedChannels, state.PinnedChannels);
    EXPECT_EQ(again.Trace, state.Trace);
    ASSERT_FALSE(again.Subplots.Configurations.empty()); // those of subplots that came in between are kept behind it
    EXPECT_EQ(again.Subplots.Configurations.front(), state.Subplots.Configurations.front());
}

} // namespace
