#include "GraphPlotSystem/ChannelTypeHost.h"
#include "GraphPlotSystem/Channels/EChannelTypeModelRoles.h"
#include "GraphPlotSystem/Channels/PrimaryChannelType.h"
#include "GraphPlotSystem/Channels/SelectionHelpTexts.h"
#include "GraphPlotSystem/Channels/VChannelSelectionHelp.h"
#include "GraphPlotSystem/Channels/VChannelTypeModel.h"
#include "GraphPlotSystem/ModelJournal.h"

#include <gtest/gtest.h>

using namespace GraphPlotUI;
using namespace TQL::ChannelTypeModelRoles;
using ChannelTypeHost::MakeHost;

namespace
{

/// One word a row: "[Header]", "name" with "*" for developers and "-" for unavailable; the current one in "<>".
std::string Names(const VChannelTypeModel& i_rModel)
{
    std::string text;
    for (int row = 0; row < i_rModel.rowCount(); ++row)
    {
        const auto read = [&](int i_Role)
        {
            return i_rModel.data(i_rModel.index(row, 0), i_Role);
        };
        std::string word = read(ChannelTypeInternalName).toString().toStdString();
        if (read(ChannelTypeCategoryHeader).toBool())
            word += "[" + read(ChannelTypeDisplayName).toString().toStdString() + "]";
        else if (word.empty())
            word = "''";
        word += read(ChannelTypeDeveloperOnly).toBool() ? "*" : "";
        word += !read(ChannelTypeCategoryHeader).toBool() && !read(ChannelTypeAvailable).toBool() ? "-" : "";
        text += (row == 0 ? "" : " ") + (row == i_rModel.GetCurrentRowIndex() ? "<" + word + ">" : word);
    }
    return text;
}

struct Models
{
    explicit Models(bool i_bDeveloper = false, bool i_bRegistry = true)
        : Selected(i_bRegistry ? pHost : nullptr, pHost, i_bDeveloper, true)
        , Global(i_bRegistry ? pHost : nullptr, pHost, i_bDeveloper, false)
    {
    }
    void Rebuild()
    {
        Selected.Rebuild("Live");
        Global.Rebuild("Live");
    }

    const std::shared_ptr<ChannelTypeHost::Host> pHost = MakeHost();
    VChannelTypeModel Selected;
    VChannelTypeModel Global;
};

TEST(ChannelTypeModel, ListsTheTypesOfItsSide)
{
    struct Case
    {
        bool bDeveloper;
        bool bRegistry;
        const char* pSelected;
        const char* pGlobal;
        const char* pAsked;
    };
    const Case cases[] = {
        {false, true,
         "<Auto> Force [Labels] _Cluster Marker [Relative Measurements] _DistanceBetween [Segments] "
         "_PositionAndRotation SubjectSegmentPose",
         "<None> [Time] Clock _World", "types 6 of 'Live'\ntypes 6 of 'Live'\n"},
        {true, true,
         "<Auto> Force [Developer] ''* Raw* _Trial* [Labels] _Cluster _Debug* Marker [Relative Measurements] "
         "_DistanceBetween [Segments] _PositionAndRotation SubjectSegmentPose",
         "<None> [Labels] Auto [Time] Clock _World", "types 2 of 'Live'\ntypes 2 of 'Live'\n"},
        {false, false, "<Auto> Force [Labels] Marker [Segments] SubjectSegmentPose", "<None> [Time] Clock",
         "types 6 of 'Live'\ntypes 6 of 'Live'\n"},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pSelected);
        Models models(rCase.bDeveloper, rCase.bRegistry);
        const ModelJournal selected(models.Selected);
        const ModelJournal global(models.Global);
        if (rCase.bDeveloper) // what is named as the other side's start row is a type like any other there
            models.pHost->Listed.back().Kind = TQL::ESelectionKind::Global;
        models.Rebuild();
        EXPECT_EQ(Names(models.Selected), rCase.pSelected);
        EXPECT_EQ(Names(models.Global), rCase.pGlobal);
        EXPECT_EQ(models.pHost->Asked, rCase.pAsked);
    }
}

TEST(ChannelTypeModel, ShowsNamesWithoutPlaceholders)
{
    Models models;
    models.Rebuild();
    std::string text;
    for (int row = 0; row < models.Selected.rowCount(); ++row)
        text +=
            models.Selected.data(models.Selected.index(row, 0), ChannelTypeDisplayName).toString().toStdString() + "|";
    EXPECT_EQ(text, "Auto|%1% Force|Labels|Cluster|Position|Relative Measurements|Distance Between|Segments|"
                    " Position and Rotation|Pose|");
    EXPECT_EQ(models.Selected.roleNames().value(ChannelTypeDisplayName), "channelTypeDisplayName");
    const std::pair<const char*, const char*> names[] = {
        {"%1% (Magnitude)", " (Magnitude)"}, {"%1 and %%", "%1 and %%"}, {"%1%2%", "2%"}, {"%12%", "%12%"}, {"", ""}};
    for (const auto& [pGiven, pShown] : names)
        EXPECT_EQ(RemovePlaceholders(pGiven), pShown);
}

TEST(ChannelTypeModel, MarksWhatTheSelectionCanGive)
{
    Models models(true);
    models.Rebuild();
    ModelJournal journal(models.Selected);
    const auto select = [&](std::map<std::string, std::vector<std::string>> i_Selected)
    {
        models.pHost->Selected = std::move(i_Selected);
        models.Selected.UpdateAvailability();
        models.Global.UpdateAvailability();
        return Names(models.Selected);
    };
    EXPECT_EQ(select({}), "<Auto> Force- [Developer] ''* Raw*- _Trial*- [Labels] _Cluster- _Debug*- Marker- "
                          "[Relative Measurements] _DistanceBetween- [Segments] _PositionAndRotation- "
                          "SubjectSegmentPose-");
    journal.Take();
    EXPECT_EQ(select({{"Marker", {"a"}}}),
              "<Auto> Force- [Developer] ''* Raw*- _Trial* [Labels] _Cluster _Debug* Marker "
              "[Relative Measurements] _DistanceBetween- [Segments] "
              "_PositionAndRotation- SubjectSegmentPose-");
    EXPECT_EQ(journal.Take(), "change 5 259; change 7 259; change 8 259; change 9 259; ");
    EXPECT_EQ(select({{"Marker", {"a"}}, {"SubjectSegmentPose", {"s"}}}),
              "<Auto> Force- [Developer] ''* Raw*- _Trial* [Labels] _Cluster _Debug* Marker [Relative Measurements] "
              "_DistanceBetween [Segments] _PositionAndRotation SubjectSegmentPose");
    EXPECT_EQ(Names(models.Global), "<None> [Time] Clock _World");
    journal.Take();

    models.Rebuild();
    EXPECT_EQ(journal.Take(), "") << "the same types: views need not know";
    models.pHost->Listed.erase(models.pHost->Listed.begin() + 2);
    models.pHost->Selected.clear();
    models.Rebuild();
    EXPECT_EQ(journal.Take(), "reset; ");
    EXPECT_EQ(Names(models.Selected), "<Auto> [Developer] ''* Raw*- _Trial* [Labels] _Cluster _Debug* Marker "
                                      "[Relative Measurements] _DistanceBetween [Segments] _PositionAndRotation "
                                      "SubjectSegmentPose")
        << "what was known stays until it is asked for again";
}

TEST(ChannelTypeModel, KeepsTheCurrentType)
{
    Models models;
    VChannelTypeModel& rModel = models.Selected;
    std::string signals;
    QObject::connect(&rModel, &VChannelTypeModel::currentRowIndexChanged, [&signals] { signals += "current "; });
    QObject::connect(&rModel, &VChannelTypeModel::autoChannelTypeChanged, [&signals] { signals += "auto "; });
    const auto expect = [&](int i_Index, const char* i_pType, const char* i_pSignals)
    {
        EXPECT_EQ(rModel.GetCurrentRowIndex(), i_Index);
        EXPECT_EQ(rModel.GetCurrentChannelType().toStdString(), i_pType);
        EXPECT_EQ(std::exchange(signals, {}), i_pSignals);
    };
    expect(-1, "Auto", "");
    EXPECT_EQ(models.Global.GetCurrentChannelType(), "");
    EXPECT_EQ(models.Global.SaveState(), "None");
    EXPECT_EQ(rModel.LoadState("Marker"), TQL::Result::Ok) << "to be found when there are rows";
    expect(-1, "Marker", "current ");
    EXPECT_EQ(rModel.SaveState(), "Marker");
    rModel.Rebuild("Live");
    expect(4, "Marker", "current ");
    for (const int refused : {2, 10, -1, 4})
        rModel.SetCurrentRowIndex(refused);
    expect(4, "Marker", "");

    models.pHost->Listed.insert(models.pHost->Listed.begin(), {"Aaa", ChannelTypeHost::MakeParameters("", ""), {}});
    rModel.Rebuild("Live");
    expect(5, "Marker", "current ");
    EXPECT_EQ(rModel.LoadState("Gone"), TQL::Result::OkButModified);
    expect(0, "Auto", "current ");

    rModel.SetAutoChannelType("Marker");
    rModel.SetAutoChannelType("Marker");
    expect(0, "Marker", "auto current ");
    EXPECT_EQ(rModel.GetAutoDisplayChannelType(), "Position");
    rModel.SetAutoChannelType("NotListed");
    expect(0, "NotListed", "auto current ");
    EXPECT_EQ(rModel.GetAutoDisplayChannelType(), "Position");
    EXPECT_EQ(rModel.SaveState(), "Auto");
    rModel.SetAutoChannelType("");
    expect(0, "Auto", "auto current ");

    rModel.SetCurrentRowIndex(7);
    expect(7, "_DistanceBetween", "current ");
    models.pHost->Listed.clear();
    models.pHost->Specifiers.clear();
    rModel.Rebuild("Live");
    expect(0, "Auto", "current ");
    models.Global.SetAutoChannelType("Marker");
    EXPECT_FALSE(models.Global.IsAuto());
}

TEST(SelectionHelp, SaysWhatToSelect)
{
    using Kind = TQL::ESelectionKind;
    const auto pHost = MakeHost();
    const std::pair<const char*, Kind> kinds[] = {{"k1", Kind::Global},      {"k2", Kind::Camera},
                                                  {"k3", Kind::Net},         {"k4", Kind::AnalogueDeviceOutput},
                                                  {"k5", Kind::Device},      {"k6", Kind::Subject},
                                                  {"k7", Kind::Label},       {"k8", Kind::ReconstructionTrack},
                                                  {"k10", Kind::Segment},    {"k11", Kind::SegmentSolve},
                                                  {"k13", Kind::Joint},      {"k14", Kind::Monitor},
                                                  {"k15", Kind::ModelOutput}};
    for (const auto& [pType, kind] : kinds)
        pHost->Listed.push_back({pType, nullptr, kind});
    pHost->Create("one", 1, {"k4"}, "", "");
    pHost->Create("two", 2, {"k14", "k10", "k11", "unknown"}, "", "");
    pHost->Create("some", -1, {"k13", "k7"}, "", "");
    pHost->Create("none", 3, {"unknown"}, "", "");
    const std::tuple<const char*, const char*, const char*> cases[] = {
        {"Auto", "Select any channel source to plot its primary channel type.", nullptr},
        {"unknown", "", nullptr},
        {"k1", "Select a  to plot this channel type.", nullptr},
        {"k2", "Select a camera to plot this channel type.", nullptr},
        {"k3", "Select an analog sampler to plot this channel type.", nullptr},
        {"k4", "Select an analog device to plot this channel type.", nullptr},
        {"k5", "Select a  to plot this channel type.", nullptr},
        {"k6", "Select a subject to plot this channel type.", "Select an object to plot this channel type."},
        {"k7", "Select a labeled marker to plot this channel type.", nullptr},
        {"k8", "Select an unlabeled reconstruction to plot this channel type.", nullptr},
        {"k11", "Select a segment to plot this channel type. You can also select a subject to use its root segment.",
         "Select an object to plot this channel type. "},
        {"k13", "Select a joint with at least one degree of freedom to plot this channel type.", nullptr},
        {"k15", "Select a model output to plot this channel type.", nullptr},
        {"one", "Select a analog device to plot this channel type.", nullptr},
        {"two",
         "Select 2 segments or monitors to plot this channel type. You can also select a subject to use its root "
         "segment.",
         "Select 2 objects or monitors to plot this channel type. "},
        {"some", "Select some labeled marker or joint with at least one degree of freedom to plot this channel type.",
         nullptr},
        {"none", "Select 3  to plot this channel type.", nullptr},
    };
    const VChannelSelectionHelp subjects(pHost, pHost, false);
    const VChannelSelectionHelp objects(pHost, pHost, true);
    for (const auto& [pType, pText, pObjectText] : cases)
    {
        EXPECT_EQ(subjects.selectionHelpText(pType).toStdString(), pText) << pType;
        EXPECT_EQ(objects.selectionHelpText(pType).toStdString(), pObjectText ? pObjectText : pText) << pType;
    }
    EXPECT_EQ(VChannelSelectionHelp(pHost, nullptr, false).selectionHelpText("one"), "");
}

TEST(PrimaryType, IsTheFirstPrimaryOneOfTheSelection)
{
    const std::pair<std::set<std::string>, const char*> cases[] = {
        {{}, ""},
        {{"Bananas"}, "Bananas"},
        {{"Apples", "Monitor"}, "Monitor"},
        {{"Apples", "Bananas"}, "Apples"},
        {{"SubjectSegmentPoseRetarget", "SubjectSegmentVelocity"}, "_PositionAndRotation"},
        {{"SubjectSegmentPose", "Joint Kinematics"}, "Joint Kinematics"},
        {{"SubjectSegmentPoseOfMyOwn"}, "_PositionAndRotation"},
        {{"CalibratedCameraPose 2"}, "_CameraPosition"},
        {{"CentroidCount", "CalibratedCameraPose"}, "CentroidCount"},
    };
    for (const auto& [rTypes, pPrimary] : cases)
        EXPECT_EQ(PrimaryChannelType(rTypes), pPrimary);
}

TEST(PrimaryType, ALoopOfInputsEnds)
{
    const auto pA = ActiveChannelHost::MakeChannel("Live", "A", "a");
    const auto pB = ActiveChannelHost::MakeChannel("Live", "B", "b");
    pA->Inputs = {pB, nullptr};
    pB->Inputs = {pA};
    EXPECT_TRUE(IsMadeOfType(pA, "B"));
    EXPECT_FALSE(IsMadeOfType(pA, "C"));
    pB->Inputs.clear();
}

} // namespace
