#include "GraphPlotSystem/ActiveChannelHost.h"
#include "GraphPlotSystem/Channels/VActiveChannelBuilder.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <gtest/gtest.h>

#include <sstream>

using namespace GraphPlotUI;
using namespace ActiveChannelHost;

namespace
{

class Built : public ::testing::Test
{
protected:
    Built()
    {
        for (const char* pName : {"a", "b", "c", "d", "e"})
            pHost->Get(std::string("Live/") + pName);
        pHost->Creatable = {{"One", 1},    {"Pair", 2},  {"Any", -1}, {"World", 0},
                            {"Broken", 1}, {"Empty", 1}, {"Null", 1}};
        pBuilder->SetContextName("Live");
    }

    std::string RowsText() const
    {
        std::string text;
        for (const auto& rpChannel : pModel->GetChannels())
            text += (text.empty() ? "" : " ") + rpChannel->GetInstanceId().Text;
        return text;
    }

    std::string Run(const std::string& i_rCommand)
    {
        std::istringstream words(i_rCommand);
        std::string verb;
        std::string name;
        words >> verb;
        if (verb == "select")
        {
            std::string type;
            words >> type;
            pHost->Selected[type].clear();
            while (words >> name)
                pHost->Selected[type].push_back(name);
            pBuilder->Refresh(false);
            return RowsText();
        }
        words >> name;
        if (verb == "type")
            pBuilder->SetSelectedChannelType(name);
        else if (verb == "global")
            pBuilder->SetGlobalChannelType(name);
        else if (verb == "context")
            pBuilder->SetContextName(name);
        else if (verb == "linked")
            pBuilder->SetLinked(name == "on");
        else if (verb == "magnitude")
            pBuilder->SetOptions({.bPlotMagnitude = name == "on"});
        else if (verb == "lose" || verb == "find")
            pHost->Get("Live/" + name)->SetData(verb == "find");
        else if (verb == "new")
            pHost->Known["Live/" + name] = MakeChannel("Live", "Marker", name);
        else if (verb == "refresh")
            pBuilder->Refresh(name == "force");
        else if (verb == "deliver")
            pQueue->RunAll();
        else
            ADD_FAILURE() << "unknown command " << verb;
        return RowsText();
    }

    void Expect(const std::vector<std::pair<const char*, const char*>>& i_rSteps)
    {
        for (const auto& [pCommand, pExpected] : i_rSteps)
            EXPECT_EQ(Run(pCommand), pExpected) << pCommand;
    }

    std::string Errors()
    {
        std::string text;
        for (const auto& rEntry : Log.Take())
            text += rEntry.Severity == TQL::ELogSeverity::Error ? rEntry.Text + "\n" : "";
        return text;
    }

    TestSupport::LogGuard Log;
    std::shared_ptr<Host> pHost = std::make_shared<Host>();
    std::shared_ptr<TestSupport::ManualPostalService> pQueue = std::make_shared<TestSupport::ManualPostalService>();
    std::unique_ptr<VActiveChannelModel> pModel =
        std::make_unique<VActiveChannelModel>(pQueue, pHost->pTexts, pHost, nullptr);
    std::shared_ptr<VActiveChannelBuilder> pBuilder =
        TQL::MakeShared<VActiveChannelBuilder>(pQueue, pHost, pHost, pModel.get());
};

} // namespace

TEST_F(Built, FollowSelectionAndSettings)
{
    Expect({
        {"select Marker a b a gone", ""}, // no type chosen yet
        {"type Marker", "a b"},           // of a type that cannot be created: as they are
        {"select Marker b c a d e", "a b c d e"},
        {"type One", "One(a) One(b) One(c) One(d) One(e)"},
        {"type Pair", "Pair(a+b) Pair(c+d)"}, // the odd one is left over
        {"type Any", "Any(a+b+c+d+e)"},
        {"linked off", ""},
        {"select Marker a", ""},
        {"linked on", "Any(a)"},
        {"global World", "Any(a) World"},
        {"type World", "World"},
        {"type Marker", "World a"},
        {"magnitude on", "World' a'"},
        {"magnitude off", "World a"},
        {"global Unknown", "a"},
        {"context Other", ""},
        {"context Live", "a"},
    });
    EXPECT_EQ(Errors(), "");
}

TEST_F(Built, GlobalInputsGoToTheGlobalType)
{
    pHost->GlobalType = "Marker"; // what is selected counts as global
    Expect({{"type One", ""}, {"select Marker a", ""}, {"global Pair", ""}, {"select Pair b", "Pair(a+b)"}});
}

TEST_F(Built, OutputsComeAndGo)
{
    Run("type Marker");
    Expect({
        {"select Marker a b c", "a b c"},
        {"lose b", "a b c"},
        {"deliver", "a c"},
        {"find b", "a c"},
        {"lose a", "a c"},
        {"deliver", "b c"},
        {"find a", "b c"},
        {"refresh", "b c"}, // what is followed waits for its notice
        {"select Marker b", "b"},
        {"deliver", "b"}, // the notice of a channel that has been let go
        {"new b", "b"},
        {"refresh", "b"},
        {"lose b", "b"},
        {"deliver", ""}, // of the new object
    });
    EXPECT_EQ(pHost->Get("Live/a")->pParameters->pOutputChanged->Count(), 0u);
}

TEST_F(Built, OneRebuildServesABurst)
{
    Run("type Marker");
    Run("select Marker a b c d e");
    int changes = 0;
    pModel->ChannelsChanged()->AddDirect([&changes] { ++changes; });
    for (const char* pName : {"a", "b", "c", "d"})
        pHost->Get(std::string("Live/") + pName)->SetData(false);
    pQueue->RunAll();
    EXPECT_EQ(RowsText(), "e");
    EXPECT_EQ(changes, 1);
}

TEST_F(Built, HostsThatFail)
{
    Run("select Marker a b");
    Expect({{"type Null", ""}, {"type Broken", ""}});
    const std::string refused(TQL::Result::NotSupported.Description());
    EXPECT_EQ(Errors(), "Channel Broken Error " + refused + "\nChannel Broken Error " + refused + "\n");
    EXPECT_EQ(Run("type Empty"), "");
    EXPECT_EQ(Errors(), "Channel Empty Error no sense in it\nChannel Empty Error no sense in it\n");

    const auto pPoor = TQL::MakeShared<VActiveChannelBuilder>(pQueue, pHost, nullptr, pModel.get()); // no registry
    pPoor->SetContextName("Live");
    pPoor->SetSelectedChannelType("Marker");
    EXPECT_EQ(RowsText(), "a b");
}

TEST_F(Built, LateNoticesDoNothing)
{
    Run("type Marker");
    Run("select Marker a b");
    Run("lose a");
    pQueue->RunOne(); // the notice; the rebuild waits
    pBuilder->Clear();
    EXPECT_EQ(Run("deliver"), "a b"); // cleared: the rows stay as they are
    EXPECT_EQ(Run("refresh force"), "b");
    Run("lose b");
    pBuilder.reset();
    EXPECT_EQ(Run("deliver"), "b"); // a notice on the way to a builder that is gone
    EXPECT_EQ(pHost->Get("Live/b")->pParameters->pOutputChanged->Count(), 0u);

    pBuilder = TQL::MakeShared<VActiveChannelBuilder>(pQueue, pHost, pHost, pModel.get());
    pBuilder->SetContextName("Live");
    pModel.reset();
    pBuilder->SetSelectedChannelType("Marker"); // a model that is gone
}
