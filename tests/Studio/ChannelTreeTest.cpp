#include "Channels/Common/VSubTypeTable.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Recordings/Tables/CsvReader.h"
#include "Studio/Tree/ChannelLeaves.h"
#include "Studio/Tree/VChannelTreeModel.h"

#include <gtest/gtest.h>

#include <QtCore/QAbstractItemModel>
#include <QtTest/QAbstractItemModelTester>

#include <algorithm>
#include <memory>
#include <span>
#include <string>
#include <utility>
#include <vector>

namespace
{

using Studio::ChannelTreeLeaf;
using Studio::VChannelTreeModel;
using TQL::ESelectionKind;
using TQL::SelectionItem;

SelectionItem Marker(std::uint64_t i_Subject, std::uint64_t i_Marker)
{
    return {ESelectionKind::Label, i_Subject, i_Marker, ""};
}

std::vector<ChannelTreeLeaf> TwoWalkers()
{
    return {{{"A", "Markers"}, "C7", Marker(0, 0)},
            {{"A", "Markers"}, "T10", Marker(0, 1)},
            {{"A", "Segments"}, "Pelvis", {ESelectionKind::Segment, 0, 0, ""}},
            {{"B", "Markers"}, "C7", Marker(1, 0)},
            {{"Device outputs"}, "Fz1", {ESelectionKind::AnalogueDeviceOutput, 0, 2, ""}}};
}

/// The whole tree in one line: [x] ticked, [~] partly, [ ] not; children in braces.
std::string Picture(const QAbstractItemModel& i_rModel, const QModelIndex& i_rParent = {})
{
    std::string text;
    for (int row = 0; row < i_rModel.rowCount(i_rParent); ++row)
    {
        const QModelIndex index = i_rModel.index(row, 0, i_rParent);
        const int state = index.data(Qt::CheckStateRole).toInt();
        text += row > 0 ? " " : "";
        text += state == Qt::Checked ? "[x]" : state == Qt::PartiallyChecked ? "[~]" : "[ ]";
        text += index.data().toString().toStdString();
        if (i_rModel.rowCount(index) > 0)
            text += "{" + Picture(i_rModel, index) + "}";
    }
    return text;
}

QModelIndex Find(const QAbstractItemModel& i_rModel, const std::vector<int>& i_rRows)
{
    QModelIndex index;
    for (const int row : i_rRows)
        index = i_rModel.index(row, 0, index);
    return index;
}

TEST(ChannelTree, TickingGoesDownAndShowsUpwards)
{
    VChannelTreeModel model;
    const QAbstractItemModelTester tester(&model, QAbstractItemModelTester::FailureReportingMode::Fatal);
    model.SetLeaves(TwoWalkers());
    int ticked = 0;
    QObject::connect(&model, &VChannelTreeModel::TickedChanged, [&ticked] { ++ticked; });
    EXPECT_EQ(model.FirstItem(), Marker(0, 0));

    static const struct
    {
        std::vector<int> Rows;
        bool bTick;
        const char* pPicture;
    } steps[] = {
        {{0, 0, 0},
         true,
         "[~]A{[~]Markers{[x]C7 [ ]T10} [ ]Segments{[ ]Pelvis}} [ ]B{[ ]Markers{[ ]C7}} [ ]Device outputs{[ ]Fz1}"},
        {{0, 0, 1},
         true,
         "[~]A{[x]Markers{[x]C7 [x]T10} [ ]Segments{[ ]Pelvis}} [ ]B{[ ]Markers{[ ]C7}} [ ]Device outputs{[ ]Fz1}"},
        {{1},
         true,
         "[~]A{[x]Markers{[x]C7 [x]T10} [ ]Segments{[ ]Pelvis}} [x]B{[x]Markers{[x]C7}} [ ]Device outputs{[ ]Fz1}"},
        {{0},
         true,
         "[x]A{[x]Markers{[x]C7 [x]T10} [x]Segments{[x]Pelvis}} [x]B{[x]Markers{[x]C7}} [ ]Device outputs{[ ]Fz1}"},
        {{0, 0},
         false,
         "[~]A{[ ]Markers{[ ]C7 [ ]T10} [x]Segments{[x]Pelvis}} [x]B{[x]Markers{[x]C7}} [ ]Device outputs{[ ]Fz1}"},
    };
    int step = 0;
    for (const auto& rStep : steps)
    {
        int announced = 0;
        const auto connection = QObject::connect(&model, &QAbstractItemModel::dataChanged,
                                                 [&](const QModelIndex& i_rFirst, const QModelIndex& i_rLast)
                                                 {
                                                     EXPECT_EQ(i_rFirst.parent(), i_rLast.parent());
                                                     ++announced;
                                                 });
        EXPECT_TRUE(
            model.setData(Find(model, rStep.Rows), rStep.bTick ? Qt::Checked : Qt::Unchecked, Qt::CheckStateRole));
        QObject::disconnect(connection);
        EXPECT_EQ(Picture(model), rStep.pPicture);
        EXPECT_GE(announced, static_cast<int>(rStep.Rows.size()));
        EXPECT_EQ(ticked, ++step);
    }
    const std::vector<SelectionItem> expected{Marker(1, 0), {ESelectionKind::Segment, 0, 0, ""}};
    EXPECT_EQ(model.Ticked(), expected) << "in the order of ticking";
    EXPECT_FALSE(model.setData(Find(model, {0}), QStringLiteral("other"), Qt::EditRole));
}

TEST(ChannelTree, ASelectionFromOutsideIsTakenOverWithoutAnEcho)
{
    VChannelTreeModel model;
    const QAbstractItemModelTester tester(&model, QAbstractItemModelTester::FailureReportingMode::Fatal);
    model.SetLeaves(TwoWalkers());
    int ticked = 0;
    QObject::connect(&model, &VChannelTreeModel::TickedChanged, [&ticked] { ++ticked; });
    model.SetTicked({Marker(1, 0), Marker(7, 7), Marker(0, 1)});
    EXPECT_EQ(model.Ticked(), (std::vector<SelectionItem>{Marker(1, 0), Marker(0, 1)}));

    // Another context with one of the channels keeps that one ticked.
    model.SetLeaves({{{"B", "Markers"}, "C7", Marker(1, 0)}, {{"B", "Markers"}, "T10", Marker(1, 1)}});
    EXPECT_EQ(Picture(model), "[~]B{[~]Markers{[x]C7 [ ]T10}}");
    model.SetLeaves({});
    EXPECT_EQ(Picture(model), "");
    EXPECT_EQ(model.FirstItem().Kind, ESelectionKind::None);
    EXPECT_EQ(ticked, 0);
}

TEST(ChannelLeaves, WhatCountsRowsIsNeverTheFirstPicture)
{
    const std::string text = "time,Sub Frame,Fz,A.X,A.Y,A.Z,Time (ms)\n0,0,1,2,3,4,5\n0.01,1,2,3,4,5,6\n";
    Recordings::VRecording recording;
    std::string error;
    ASSERT_TRUE(Recordings::ReadCsv(std::as_bytes(std::span(text)), {}, recording, error).IsSuccess()) << error;
    const auto add = [&](Recordings::EChannelKind i_Kind, const char* i_pName, const char* i_pQuantity)
    {
        recording.Channels.push_back(recording.Channels[1]);
        recording.Channels.back().Kind = i_Kind;
        recording.Channels.back().Name = i_pName;
        recording.Channels.back().Quantity = i_pQuantity;
    };
    add(Recordings::EChannelKind::Analog, "EMG", "");
    add(Recordings::EChannelKind::ModelOutput, "Power", "Power");
    add(Recordings::EChannelKind::JointAngles, "Knee", "");
    const Channels::VRecordedContext context("A", std::make_shared<Channels::VSubTypeTable>(),
                                             std::make_shared<const Recordings::VRecording>(std::move(recording)));
    const auto things = Studio::ListThings(context, nullptr);
    std::string order;
    for (const SelectionItem& rItem : Studio::ItemsByRank(things))
        order += std::ranges::find(things, rItem, &Studio::SelectableThing::Item)->Name + "; ";
    EXPECT_EQ(order, "A; Knee; Power; EMG; Fz; Sub Frame; Time (ms); ");
}

TEST(ChannelLeaves, NamesMakeTheBranchesAndPatternsFindThem)
{
    std::vector<Studio::SelectableThing> channels{
        {"Walker1:LFHD", "Labelled Reconstructions", Marker(0, 0)},
        {"Walker1:Pelvis", "SubjectSegmentPose", {ESelectionKind::Segment, 0, 0, ""}},
        {"RSHO", "Labelled Reconstructions", Marker(1, 0)},
        {"Fz1", "DeviceOutput", {ESelectionKind::AnalogueDeviceOutput, 0, 2, ""}},
        {"Walker1", "", {ESelectionKind::Subject, 0, 0, ""}},
        {"ax", "ModelOutput", {ESelectionKind::ModelOutput, 0, 0, "ax"}, {}, {}, "Column"}};
    channels[4].Components = {"Pelvis"};
    std::string text;
    for (const ChannelTreeLeaf& rLeaf : Studio::MakeLeaves(channels))
        text += rLeaf.Branches.join("/").toStdString() + "=" + rLeaf.Text.toStdString() + "; ";
    EXPECT_EQ(text, "Walker1/Markers=LFHD; Walker1/Segments=Pelvis; Markers=RSHO; Device outputs=Fz1; "
                    "Walker1=Subject (root segment Pelvis); Columns=ax; ");

    static const struct
    {
        std::vector<std::string> Patterns;
        std::size_t Count;
        const char* pUnmatched;
    } rows[] = {{{"Walker1:*"}, 2, ""},     {{"*"}, 6, ""}, {{"Fz?", "*"}, 6, ""}, {{"Walker1"}, 1, ""},
                {{"Fz1", "Fx1"}, 0, "Fx1"}, {{}, 0, ""}};
    for (const auto& rRow : rows)
    {
        std::string unmatched;
        EXPECT_EQ(Studio::FindItems(channels, rRow.Patterns, unmatched).size(), rRow.Count);
        EXPECT_EQ(unmatched, rRow.pUnmatched);
    }
}

} // namespace
