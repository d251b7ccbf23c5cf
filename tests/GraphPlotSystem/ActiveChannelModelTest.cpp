#include "GraphPlotSystem/ActiveChannelHost.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Channels/VActiveChannelModelFiltered.h"
#include "support/ManualPostalService.h"

#include <QtTest/QAbstractItemModelTester>
#include <gtest/gtest.h>

#include <sstream>

using namespace GraphPlotUI;
using namespace ActiveChannelHost;

namespace
{

using Tester = QAbstractItemModelTester;

/// Runs words as commands and tells the rows: "name", "+" pinned, "?" without data, the context where it is not Live.
class Rows : public ::testing::Test
{
protected:
    Rows()
    {
        QObject::connect(&Model, &VActiveChannelModel::pinStateChanged, [this] { Events += " pins"; });
        QObject::connect(&Model, &VActiveChannelModel::haveActiveChannelsChanged, [this] { Events += " have"; });
        QObject::connect(&Model, &VActiveChannelModel::channelRemoved,
                         [this](const std::shared_ptr<TQL::IChannel>& i_rp)
                         { Events += " removed:" + i_rp->GetInstanceId().Text; });
        Model.ChannelsChanged()->AddDirect([this] { Events += " changed"; });
    }

    std::shared_ptr<Channel> Get(const std::string& i_rWord)
    {
        return pHost->Get(i_rWord.find('/') == std::string::npos ? "Live/" + i_rWord : i_rWord);
    }

    std::string RowsText() const
    {
        std::string text;
        for (int row = 0; row < Model.rowCount(); ++row)
        {
            const auto read = [&](int i_Role)
            {
                return Model.data(Model.index(row), i_Role);
            };
            const auto id =
                read(TQL::ActiveChannelModelRoles::ActiveChannelInstanceId).value<TQL::IChannelInstanceId>();
            text += (row == 0 ? "" : " ") + (id.DataContextName == "Live" ? "" : id.DataContextName + "/") + id.Text;
            text += read(TQL::ActiveChannelModelRoles::ActiveChannelPinned).toBool() ? "+" : "";
            text += read(TQL::ActiveChannelModelRoles::ActiveChannelMissingData).toBool() ? "?" : "";
            EXPECT_EQ(Model.FindRow(id), row);
        }
        return text;
    }

    /// The rows, the result where there is one, and what was raised.
    std::string Run(const std::string& i_rCommand)
    {
        std::istringstream words(i_rCommand);
        std::string verb;
        words >> verb;
        std::vector<std::string> names;
        for (std::string word; words >> word;)
            names.push_back(word);
        Events.clear();
        const std::string result = Do(verb, names);
        return RowsText() + " |" + (result.empty() ? "" : " " + result) + Events;
    }

    std::string Do(const std::string& i_rVerb, const std::vector<std::string>& i_rNames)
    {
        VActiveChannelModel::ChannelList channels;
        for (const std::string& rName : i_rNames)
            channels.push_back(Get(rName));
        const auto index = [&]
        {
            return Model.index(Model.FindRow(channels.at(0)->GetInstanceId()));
        };
        if (i_rVerb == "set")
            return std::string(Model.SetChannels(channels).Name());
        if (i_rVerb == "restore")
            Model.Restore(channels);
        else if (i_rVerb == "pin" || i_rVerb == "unpin")
            Model.setData(index(), i_rVerb == "pin", TQL::ActiveChannelModelRoles::ActiveChannelPinned);
        else if (i_rVerb == "rename")
            Model.setData(index(), QString::fromStdString(i_rNames.at(1)), Qt::DisplayRole);
        else if (i_rVerb == "lose" || i_rVerb == "find")
            Get(i_rNames.at(0))->SetData(i_rVerb == "find");
        else if (i_rVerb == "new")
            pHost->Known.erase("Live/" + i_rNames.at(0)); // the host makes another object of the same id
        else if (i_rVerb == "pinall" || i_rVerb == "unpinall")
            Model.setAllPinned(i_rVerb == "pinall");
        else if (i_rVerb == "remove")
            return std::string(Model.removeChannel(channels.at(0)->GetInstanceId()).Name());
        else if (i_rVerb == "cut")
            return Model.removeRows(std::stoi(i_rNames.at(0)), std::stoi(i_rNames.at(1))) ? "true" : "false";
        else if (i_rVerb == "clear")
            Model.clear();
        else if (i_rVerb == "switch")
            return std::string(Model.SwitchContext(i_rNames.at(0), {i_rNames.begin() + 1, i_rNames.end()}).Name());
        else
            ADD_FAILURE() << "unknown command " << i_rVerb;
        return {};
    }

    void Expect(const std::vector<std::pair<const char*, const char*>>& i_rSteps)
    {
        for (const auto& [pCommand, pExpected] : i_rSteps)
            EXPECT_EQ(Run(pCommand), pExpected) << pCommand;
    }

    std::shared_ptr<Host> pHost = std::make_shared<Host>();
    VActiveChannelModel Model{nullptr, pHost->pTexts, pHost, nullptr};
    Tester ModelTester{&Model, Tester::FailureReportingMode::Fatal};
    std::string Events;
};

} // namespace

TEST_F(Rows, FollowTheListOfTheBuilder)
{
    Expect({
        {"set b a c", "a b c | Ok changed have"},
        {"set b a c", "a b c | OkButNoEffect"},
        {"set b c a", "a b c | Ok changed"},
        {"pin b", "a b+ c | pins"},
        {"set d", "b+ d | Ok changed"},
        {"lose b", "b+? d |"},
        {"set d", "b+? d | Ok changed"},
        {"find b", "b+ d |"},
        {"unpin b", "b d | pins"},
        {"set d", "d | Ok changed"},
        {"set", " | Ok changed have"},
    });
}

TEST_F(Rows, SortByNameAndKeepEqualNamesInOrder)
{
    Expect({
        {"set b~2 B b~1 a", "B a b~2 b~1 | Ok changed have"},
        {"rename a z", "B a b~2 b~1 |"},
        {"set b~2 B b~1 a c", "B b~2 b~1 c a | Ok changed"},
        {"rename B b", "B b~2 b~1 c a |"},
        {"rename a b", "B b~2 b~1 c a |"},
        {"set b~2 B b~1 a", "B b~2 b~1 a | Ok changed"},
    });
}

TEST_F(Rows, SortKeepsWhatViewsPointAt)
{
    Run("set a b c");
    const QPersistentModelIndex first = Model.index(0);
    Run("rename a z");
    EXPECT_EQ(Run("set b c a"), "b c a | Ok changed");
    EXPECT_EQ(first.row(), 2);
}

TEST_F(Rows, TellOneThingAndOneIdApart)
{
    Expect({
        {"set a #rec/a", "a | Ok changed have"}, // the same marker in two contexts is one row
        {"set a #rec/a", "a | OkButNoEffect"},
        {"set #rec/a", " | Ok changed have"},
        {"set #rec/a", "#rec/a | Ok changed have"},
        {"set a", " | Ok changed have"},
        {"set a b", "a b | Ok changed have"},
        {"pin a", "a+ b | pins"},
        {"new a", "a+ b |"},
        {"new b", "a+ b |"},
        {"set a b", "a+ b | Ok changed"}, // the rows go on with the new objects
        {"lose a", "a+? b |"},
    });
    const auto pOther = MakeChannel("Live", "Marker", "a");
    (void)Model.SetChannels({Get("a"), pOther, nullptr});
    EXPECT_EQ(Model.SetChannels({Get("a"), pOther, nullptr}), TQL::Result::OkButNoEffect); // two objects, one id
    EXPECT_EQ(RowsText(), "a+?");
}

TEST_F(Rows, PinAndRemove)
{
    Expect({
        {"set a b c", "a b c | Ok changed have"},
        {"lose b", "a b? c |"},
        {"pinall", "a+ b? c+ | pins"},
        {"pinall", "a+ b? c+ |"},
        {"find b", "a+ b c+ |"},
        {"pinall", "a+ b+ c+ | pins"},
        {"unpinall", "a b c | pins"},
        {"remove d", "a b c | NotFound"},
        {"remove a", "b c | Ok changed removed:a"},
        {"set a b c", "a b c | Ok changed"}, // still in the builder's list
        {"cut 3 1", "a b c | false"},
        {"cut 1 0", "a b c | false"},
        {"pin b", "a b+ c | pins"},
        {"cut 1 9", "a | true changed pins removed:b removed:c"},
        {"clear", " | changed have removed:a"},
        {"clear", " |"},
        {"set b", "b | Ok changed have"},
        {"lose b", "b? |"},
        {"pinall", "b? |"}, // nothing with data: no pin
    });
    EXPECT_EQ(Model.GetPinState(), ESubplotPinState::AllUnpinned);
    EXPECT_FALSE(Model.setData(Model.index(0), true, TQL::ActiveChannelModelRoles::ActiveChannelMissingData));
    EXPECT_FALSE(Model.setData({}, true, TQL::ActiveChannelModelRoles::ActiveChannelPinned));
}

TEST_F(Rows, RestoreAStoredPlot)
{
    Expect({
        {"set a b", "a b | Ok changed have"},
        {"restore d c c", "c+ d+ | changed pins"},
        {"set a c", "a c+ d+ | Ok changed pins"},
        {"restore", " | changed have pins"},
        {"restore", " | changed"},
    });
    EXPECT_TRUE(Model.GetPinnedChannels().empty());
}

TEST_F(Rows, FollowTheContext)
{
    Expect({
        {"set #A/a #A/x #A/y #A/z b GlobalItems/g", "#A/a b GlobalItems/g #A/x #A/y #A/z | Ok changed have"},
        {"pin #A/a", "#A/a+ b GlobalItems/g #A/x #A/y #A/z | pins"},
        // Present contexts keep their channels, but the global ones always follow.
        {"switch #B #A #B Live", "#A/a+ b #B/g #A/x #A/y #A/z | Ok changed"},
        // Live is gone and not special: its channel leaves. A failure leaves the row as it was.
        {"switch #C #C", "#C/a+ #C/g #A/x #A/y #C/fallback | OkButPartial changed"},
        {"set #C/a #C/g #A/x #A/y #C/fallback", "#C/a+ #C/g #A/x #A/y #C/fallback | Ok changed"},
        {"cut 0 2", "#A/x #A/y #C/fallback | true changed pins removed:a removed:g"},
        {"switch #C #C", "#A/x #A/y #C/fallback | NotConnected changed"},
        {"switch Live #C", "#C/fallback | Ok changed"}, // to a context that is not special
        {"set #A/a #B/a~ GlobalItems/g *C/g", "#A/a #B/a~ GlobalItems/g | Ok changed"},
    });
}

TEST_F(Rows, ComeBackWhenTheirContextWasReadAgain)
{
    Run("set a b x y z");
    const auto pBefore = Get("a");
    Expect({
        {"pinall", "a+ b+ x+ y+ z+ | pins"},
        {"set b", "a+ b+ x+ y+ z+ | Ok changed"},
    });
    for (const char* pName : {"a", "x", "y", "z"})
    {
        Get(pName)->SetData(false);
        Run(std::string("new ") + pName);
    }
    // Nothing else takes the place of the three that cannot be found.
    Expect({{"switch Live Live", "a+ b+ x+? y+? z+? | Ok changed"}});
    Model.Restore({pBefore, Get("b")});
    EXPECT_EQ(RowsText(), "a+ b+") << "a stored plot of what was there before";
    Get("a")->SetData(false); // and nothing new in its place
    EXPECT_EQ(Run("switch Live Live"), "a+? b+ | Ok changed");
}

TEST_F(Rows, MergeWhenTwoBecomeOne)
{
    Expect({
        {"set #A/z #A/z~2 #A/za", "#A/z #A/z~2 #A/za | Ok changed have"},
        {"pin #A/z~2", "#A/z #A/z~2+ #A/za | pins"},
        {"switch #B", "#B/fallback+ | Ok changed pins"},
        {"set #B/fallback", "#B/fallback+ | Ok changed"},
    });
}

TEST_F(Rows, FindTheContextOfADerivedChannel)
{
    const auto pDerived = MakeChannel("", "Derivative", "d");
    const auto pEmpty = MakeChannel("", "Empty", "e");
    pEmpty->Inputs = {nullptr, pEmpty, Get("#A/a")};
    pDerived->Inputs = {pEmpty, Get("#B/b")};
    (void)Model.SetChannels({pDerived});
    EXPECT_EQ(Run("switch Live #B"), " | Ok changed have");
    (void)Model.SetChannels({pDerived});
    EXPECT_EQ(Run("switch Live #A"), "/d | Ok changed");
    pEmpty->Inputs.clear(); // itself among them
}

TEST_F(Rows, ShareOfASubplot)
{
    VActiveChannelModelFiltered filtered(&Model, nullptr);
    const Tester tester(&filtered, Tester::FailureReportingMode::Fatal);
    const auto shown = [&]
    {
        QStringList names;
        for (int row = 0; row < filtered.rowCount(); ++row)
            names += filtered.index(row, 0).data(Qt::DisplayRole).toString();
        return names.join(' ').toStdString();
    };
    Run("set a b c");
    EXPECT_EQ(shown(), "");
    filtered.SetFilter([](const TQL::IChannelInstanceId& i_rId) { return i_rId.Text != "b"; });
    EXPECT_EQ(shown(), "a c");
    Run("set d b a");
    EXPECT_EQ(shown(), "a d");
    Run("rename a z");
    Run("set d b");
    Run("restore a");
    EXPECT_EQ(shown(), "a");
    EXPECT_EQ(filtered.roleNames().value(TQL::ActiveChannelModelRoles::ActiveChannelInstanceId),
              "activeChannelInstanceId");
}
