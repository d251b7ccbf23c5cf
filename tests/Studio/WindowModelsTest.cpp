#include "ChannelSystem/ISelectionSource.h"
#include "OrvanePluginInterface/IWorkspaceContent.h"
#include "StoreInterface/EntryFlag.h"
#include "StoreInterface/IStore.h"
#include "StoreInterface/IStoreWriter.h"
#include "StoreInterface/TypedAccess.h"
#include "StoreInterface/TypedValue.h"
#include "Studio/Common/VMainActions.h"
#include "Studio/Log/VLogModel.h"
#include "Studio/Log/VLogPanel.h"
#include "Studio/Plots/PlotStates.h"
#include "Studio/Transport/EventRows.h"
#include "Studio/Transport/VEventListModel.h"
#include "Studio/Tree/VChannelFilterModel.h"
#include "Studio/Tree/VChannelTreeModel.h"
#include "Studio/Window/VShortcutsDialog.h"
#include "TQL/Log.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <QtCore/QCoreApplication>
#include <QtCore/QFile>
#include <QtCore/QTemporaryDir>
#include <QtGui/QAction>
#include <QtGui/QClipboard>
#include <QtGui/QGuiApplication>
#include <QtTest/QAbstractItemModelTester>
#include <QtTest/QTest>
#include <QtWidgets/QComboBox>
#include <QtWidgets/QMenu>
#include <QtWidgets/QMenuBar>
#include <QtWidgets/QPushButton>

#include <map>
#include <set>
#include <string>
#include <thread>

namespace
{

using FailureMode = QAbstractItemModelTester::FailureReportingMode;
using TQL::ESelectionKind;
using TQL::SelectionItem;

Studio::ChannelTreeLeaf Marker(const char* i_pSubject, const char* i_pName, std::uint64_t i_Subject,
                               std::uint64_t i_Marker)
{
    const QString subject = QString::fromLatin1(i_pSubject), name = QString::fromLatin1(i_pName);
    return {{subject, "Markers"},
            name,
            {ESelectionKind::Label, i_Subject, i_Marker, ""},
            {subject + ":" + name, "Markers", {"mm"}, {"X", "Y", "Z"}}};
}

/// The tree in one line: [x] ticked, [~] partly, [ ] not.
std::string Picture(const QAbstractItemModel& i_rModel, const QModelIndex& i_rParent = {})
{
    std::string text;
    for (int row = 0; row < i_rModel.rowCount(i_rParent); ++row)
    {
        const QModelIndex index = i_rModel.index(row, 0, i_rParent);
        const int state = index.data(Qt::CheckStateRole).toInt();
        text += state == Qt::Checked ? "[x]" : state == Qt::Unchecked ? "[ ]" : "[~]";
        text += index.data().toString().toStdString();
        if (i_rModel.hasChildren(index))
            text += "{" + Picture(i_rModel, index) + "}";
        text += row + 1 < i_rModel.rowCount(i_rParent) ? " " : "";
    }
    return text;
}

TEST(ChannelFilter, TickingABranchTicksWhatIsShownOfIt)
{
    Studio::VChannelTreeModel tree;
    const QAbstractItemModelTester treeTester(&tree, FailureMode::Fatal);
    Studio::VChannelFilterModel shown(tree);
    const QAbstractItemModelTester tester(&shown, FailureMode::Fatal);
    tree.SetLeaves(
        {Marker("A", "LKNE", 0, 0), Marker("A", "RKNE", 0, 1), Marker("A", "LANK", 0, 2), Marker("B", "LKNE", 1, 0)});
    int changes = 0;
    QObject::connect(&tree, &Studio::VChannelTreeModel::TickedChanged, [&changes] { ++changes; });

    shown.SetSearch("kne");
    EXPECT_EQ(Picture(shown), "[ ]A{[ ]Markers{[ ]LKNE [ ]RKNE}} [ ]B{[ ]Markers{[ ]LKNE}}");
    EXPECT_TRUE(shown.setData(shown.index(0, 0), Qt::Checked, Qt::CheckStateRole));
    EXPECT_EQ(Picture(shown), "[x]A{[x]Markers{[x]LKNE [x]RKNE}} [ ]B{[ ]Markers{[ ]LKNE}}");
    EXPECT_EQ(Picture(tree), "[~]A{[~]Markers{[x]LKNE [x]RKNE [ ]LANK}} [ ]B{[ ]Markers{[ ]LKNE}}");
    EXPECT_EQ(changes, 1) << "one change for all";

    // A branch and a row below it: each channel once; mixed ones are ticked first, then cleared.
    const QModelIndexList rows{shown.index(0, 0), shown.index(1, 0, shown.index(0, 0, shown.index(0, 0))),
                               shown.index(1, 0)};
    shown.Toggle(rows);
    EXPECT_EQ(Picture(shown), "[x]A{[x]Markers{[x]LKNE [x]RKNE}} [x]B{[x]Markers{[x]LKNE}}");
    shown.Toggle(rows);
    EXPECT_EQ(Picture(shown), "[ ]A{[ ]Markers{[ ]LKNE [ ]RKNE}} [ ]B{[ ]Markers{[ ]LKNE}}");

    shown.SetSearch("b kne");
    shown.Tick(shown.AllLeaves(), true);
    shown.SetSearch("");
    EXPECT_EQ(Picture(shown), "[ ]A{[ ]Markers{[ ]LKNE [ ]RKNE [ ]LANK}} [x]B{[x]Markers{[x]LKNE}}");
    EXPECT_EQ(shown.AllLeaves().size(), 4);
    shown.SetSearch("nobody");
    EXPECT_EQ(Picture(shown), "");
    EXPECT_EQ(shown.AllLeaves().size(), 0);
    tree.SetLeaves({Marker("C", "nobody", 0, 0)});
    EXPECT_EQ(Picture(shown), "[ ]C{[ ]Markers{[ ]nobody}}") << "the search holds for the next recording";
}

TEST(EventList, TheLastEventReachedIsBold)
{
    Studio::VEventListModel model;
    const QAbstractItemModelTester tester(&model, FailureMode::Fatal);
    model.SetEvents({{10, 0, "On", ""}, {20, 0, "Off", ""}, {20, 0, "Other", ""}});
    for (const auto& [frame, row] : std::map<int, int>{{0, -1}, {10, 0}, {19, 0}, {20, 2}, {500, 2}})
    {
        model.SetCurrentFrame(frame);
        for (int i = 0; i < 3; ++i)
            EXPECT_EQ(model.index(i, 1).data(Qt::FontRole).isValid(), i == row) << frame;
    }
    model.SetEvents({});
    model.SetCurrentFrame(20);
    EXPECT_EQ(model.CurrentRow(), -1);
}

void Log(TQL::ELogSeverity i_Severity, const std::string& i_rText)
{
    TQL::Log::Write(TQL::Log::GetCategory("WindowModelsTest"), i_Severity, i_rText);
}

TEST(LogModel, KeepsTheNewestOfManyThreads)
{
    TestSupport::LogGuard guard;
    constexpr int limit = 50;
    Studio::VLogModel model(limit);
    Studio::VSeverityFilter filter;
    filter.setSourceModel(&model);
    filter.SetMostDetail(static_cast<int>(TQL::ELogSeverity::Error));
    const QAbstractItemModelTester tester(&model, FailureMode::Fatal);
    const QAbstractItemModelTester filterTester(&filter, FailureMode::Fatal);
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 4; ++thread)
        threads.emplace_back(
            []
            {
                for (int i = 0; i < 200; ++i)
                    Log(TQL::ELogSeverity::Warning, "burst");
            });
    for (std::thread& rThread : threads)
        rThread.join();
    EXPECT_EQ(model.rowCount(), 0) << "only the UI thread changes the model";
    QCoreApplication::processEvents();
    EXPECT_EQ(model.rowCount(), limit);
    for (int i = 0; i < 30; ++i)
        Log(TQL::ELogSeverity::Error, "late " + std::to_string(i));
    QCoreApplication::processEvents();
    EXPECT_EQ(model.rowCount(), limit);
    EXPECT_EQ(model.index(limit - 1, 3).data().toString(), "late 29");
    EXPECT_EQ(model.index(limit - 31, 3).data().toString(), "burst");
    EXPECT_EQ(filter.rowCount(), 30);

    // What waits when the model goes must not find it.
    {
        const Studio::VLogModel shortLived(limit);
        Log(TQL::ELogSeverity::Error, "too late");
    }
    QCoreApplication::processEvents();
    guard.Take(); // its own
}

TEST(LogPanel, FiltersCopiesAndClears)
{
    TestSupport::LogGuard guard;
    Studio::VLogModel model;
    Studio::VLogPanel panel(model);
    Log(TQL::ELogSeverity::Information, "plain");
    Log(TQL::ELogSeverity::Warning, "odd");
    Log(TQL::ELogSeverity::Error, "bad");
    QCoreApplication::processEvents();
    const auto copied = [&panel]
    {
        panel.findChild<QPushButton*>("logCopy")->click();
        std::string text;
        for (const QString& rLine : QGuiApplication::clipboard()->text().split('\n', Qt::SkipEmptyParts))
            text += rLine.section(' ', 1).toStdString() + "; "; // without the time
        return text;
    };
    auto* pSeverity = panel.findChild<QComboBox*>("logSeverity");
    pSeverity->setCurrentIndex(0);
    EXPECT_EQ(copied(), "info WindowModelsTest: plain; warning WindowModelsTest: odd; error WindowModelsTest: bad; ");
    panel.ShowProblems();
    EXPECT_EQ(copied(), "warning WindowModelsTest: odd; error WindowModelsTest: bad; ");
    pSeverity->setCurrentIndex(2);
    EXPECT_EQ(copied(), "error WindowModelsTest: bad; ");
    panel.findChild<QPushButton*>("logClear")->click();
    EXPECT_EQ(model.rowCount(), 0);
    guard.Take(); // its own
}

TEST(MainActions, EachHasAKeyOrAMnemonicOfItsOwn)
{
    const Studio::VMainActions actions;
    std::set<QString> keys, names;
    std::set<std::pair<Studio::EMenu, QChar>> mnemonics;
    std::size_t count = 0;
    for (const Studio::ActionRow& rRow : Studio::ActionTable())
    {
        ++count;
        const QAction* pAction = actions.Get(rRow.Action);
        ASSERT_TRUE(pAction);
        EXPECT_TRUE(names.insert(pAction->objectName()).second) << rRow.pName;
        const qsizetype mark = pAction->text().indexOf('&');
        ASSERT_GE(mark, 0) << rRow.pText;
        EXPECT_TRUE(mnemonics.emplace(rRow.Menu, pAction->text()[mark + 1].toLower()).second) << rRow.pText;
        for (const QKeySequence& rKey : pAction->shortcuts())
            EXPECT_TRUE(!rKey.isEmpty() && keys.insert(rKey.toString()).second) << rKey.toString().toStdString();
        const int wanted = *rRow.pKeys ? QString::fromLatin1(rRow.pKeys).split("; ").size() : 0;
        EXPECT_EQ(pAction->shortcuts().size(), wanted) << rRow.pName;
    }
    EXPECT_EQ(count, static_cast<std::size_t>(Studio::EAction::Count));

    QMenuBar bar;
    Studio::VMainActions listed;
    listed.AddMenus(bar);
    listed.Menu(Studio::EMenu::File)->addMenu("Sub")->addAction("In &sub", QKeySequence("Ctrl+Alt+J"), &bar, [] {});
    std::string text;
    for (const Studio::ShortcutRow& rRow : Studio::ListShortcuts(bar))
        text += (rRow.Group + "|" + rRow.Text + "|" + rRow.Keys + "\n").toStdString();
    for (const char* pLine : {"File|Open…|Ctrl+O\n", "File|Open the sample|\n", "File|In sub|Ctrl+Alt+J\n",
                              "Playback|Play or pause|Space or Ctrl+Space\n", "Channel tree|Leave the tree|Esc\n"})
        EXPECT_NE(text.find(pLine), std::string::npos) << pLine << text;
}

/// A content with a state, as a module could bring one.
class StatefulContent : public QWidget, public OrvanePluginInterface::IOrvaneWindowPersist
{
public:
    explicit StatefulContent(std::string i_Text) : m_Text(std::move(i_Text)) {}

    TQL::IResult SaveWindowState(TQL::IStoreWriter& i_rWriter, const Store::EntryPath& i_rPath) override
    {
        const auto entry = i_rWriter.GetStore().GetEntry(i_rPath / "Text");
        const TQL::IResult flags = i_rWriter.EnableFlags(entry, Store::EntryFlag::Persistable);
        return flags.IsError() ? flags : i_rWriter.SetValue(entry, Store::MakeValue(m_Text));
    }
    bool LoadWindowState(TQL::IStoreReader& i_rReader, const Store::EntryPath& i_rPath) override
    {
        const auto entry = i_rReader.GetStore().GetEntry(i_rPath / "Text");
        return i_rReader.HasValue(entry) && TQL::GetValue(i_rReader, entry, m_Text);
    }

    std::string m_Text;
};

TEST(PlotStates, EachWindowGetsItsOwnBack)
{
    TestSupport::LogGuard log;
    const QTemporaryDir folder;
    const std::filesystem::path file = folder.filePath("states.json").toStdString();
    QWidget plain;
    StatefulContent first("first"), second("second"), other("other");
    Studio::SavePlotStates(file, {&plain, nullptr});
    EXPECT_FALSE(std::filesystem::exists(file)) << "none of them has a state";
    EXPECT_FALSE(Studio::ReadPlotStates(file));
    Studio::SavePlotStates(file, {&first, &plain, &second});
    const auto pStates = Studio::ReadPlotStates(file);
    ASSERT_TRUE(pStates);
    EXPECT_TRUE(Studio::LoadPlotState(*pStates, 2, other));
    EXPECT_EQ(other.m_Text, "second");
    EXPECT_TRUE(Studio::LoadPlotState(*pStates, 0, other));
    EXPECT_EQ(other.m_Text, "first");
    EXPECT_FALSE(Studio::LoadPlotState(*pStates, 1, other));
    EXPECT_FALSE(Studio::LoadPlotState(*pStates, 0, plain));
    QFile broken(QString::fromStdString(file.string()));
    ASSERT_TRUE(broken.open(QIODevice::WriteOnly));
    broken.write("{ \"Version\"");
    broken.close();
    EXPECT_FALSE(Studio::ReadPlotStates(file));
    EXPECT_FALSE(log.Take().empty()) << "it is told";
}

} // namespace
