#include "Channels/Contexts/VLiveContext.h"
#include "Channels/VChannelService.h"
#include "Simulation/RecordWalk.h"
#include "Studio/Commands/ChannelTable.h"
#include "Studio/Common/Paths.h"
#include "Studio/Common/TimeText.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/LiveInput.h"
#include "Studio/Session/VContextSelection.h"
#include "Studio/Session/VFrameClock.h"
#include "Studio/Session/VLiveCapture.h"
#include "Studio/Session/VSimulatedFeed.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <QtCore/QJsonArray>
#include <QtCore/QJsonDocument>
#include <QtCore/QJsonObject>
#include <QtCore/QTemporaryDir>

#include <chrono>
#include <cmath>
#include <filesystem>
#include <fstream>
#include <future>
#include <limits>
#include <map>
#include <set>
#include <string>
#include <vector>

namespace
{

using namespace std::chrono_literals;

TEST(FrameClock, FramesFollowTheRunningTimeAndPausesDoNotCount)
{
    Studio::VFrameClock clock(120.0);
    EXPECT_EQ(clock.FramesDue(5s), 0);
    clock.Run(10s);
    static const struct
    {
        std::chrono::nanoseconds Now;
        std::int64_t Frames;
    } rows[] = {{10s, 0}, {10s + 8333200ns, 0}, {10s + 8333400ns, 1}, {11s, 120}, {1h + 10s, 432000}};
    for (const auto& rRow : rows)
        EXPECT_EQ(clock.FramesDue(rRow.Now), rRow.Frames) << rRow.Now.count();

    clock.Pause(11s);
    EXPECT_FALSE(clock.IsRunning());
    EXPECT_EQ(clock.FramesDue(500s), 120);
    clock.Run(501s);
    clock.Run(505s); // runs already
    EXPECT_EQ(clock.FramesDue(502s), 240);
    for (const std::int64_t frame : {120, 121, 1000, 999'999})
    {
        const auto due = clock.TimeOfFrame(frame);
        EXPECT_EQ(clock.FramesDue(due), frame + 1) << "woken up in time";
        EXPECT_EQ(clock.FramesDue(due - 10us), frame) << "and not too early";
    }
}

TEST(LiveStatus, MessagesSilenceAndTheEndAreTold)
{
    Studio::VLiveStatus status;
    Studio::LiveInput input;
    std::string told;
    const auto tell = [&](std::chrono::milliseconds i_Now)
    {
        const Studio::LiveStatusText text = status.Tell(input, i_Now);
        return text.Text + (text.bWarning ? " !" : "") + (text.bEnded ? " ended" : "");
    };
    EXPECT_EQ(tell(0s), "");
    input = {Studio::ELiveInput::Osc, 1, true, false, "127.0.0.1", 9000, 0};
    EXPECT_EQ(tell(1s), "127.0.0.1:9000: no message yet");
    EXPECT_EQ(tell(4s), "127.0.0.1:9000: no message for 3 s !");
    for (int i = 0; i < 20; ++i)
    {
        input.Messages += 30;
        told = tell(5s + i * 250ms);
    }
    EXPECT_EQ(told, "127.0.0.1:9000: 600 messages, 120 a second");
    EXPECT_EQ(tell(9750ms + 2999ms).find('!'), std::string::npos);
    EXPECT_EQ(tell(9750ms + 75s), "127.0.0.1:9000: no message for 1 min 15 s !");
    input.bPaused = true;
    EXPECT_EQ(tell(90s), "127.0.0.1:9000: 600 messages, paused") << "nobody waits for messages then";
    input.bRunning = input.bPaused = false;
    EXPECT_EQ(tell(91s), "Stopped after 600 messages ended");
    EXPECT_EQ(tell(92s), "Stopped after 600 messages");
    input = {Studio::ELiveInput::Replay, 2, true};
    EXPECT_EQ(tell(93s), "");
    input.bRunning = false;
    EXPECT_EQ(tell(94s), "The replay has ended ended");
}

TEST(LiveCapture, FramesComeInOrderWithoutHolesAndAnErrorEndsThem)
{
    TestSupport::LogGuard log;
    std::promise<void> enough;
    std::int64_t next = 1000, calls = 0;
    {
        Studio::VLiveCapture capture(
            [&](std::int64_t i_First, std::int64_t i_Count)
            {
                EXPECT_EQ(i_First, next);
                EXPECT_GT(i_Count, 0);
                next = i_First + i_Count;
                if (++calls == 5)
                    enough.set_value();
                return calls < 5 ? TQL::Result::Ok : TQL::Result::Stopping;
            },
            100'000.0, 1000);
        ASSERT_EQ(enough.get_future().wait_for(30s), std::future_status::ready);
        capture.SetPaused(true);
        EXPECT_TRUE(capture.IsPaused());
    }
    EXPECT_EQ(calls, 5);
    const auto entries = log.Take();
    ASSERT_EQ(entries.size(), 1u);
    EXPECT_EQ(entries[0].Text, "The live capture has stopped: Stopping: The service requested is stopping");
}

TEST(SimulatedFeed, TheLiveContextHoldsWhatTheSimulatorGives)
{
    Channels::VChannelService service;
    const auto pContext =
        std::make_shared<Channels::VLiveContext>("Live", service.GetSubTypes(), Channels::VLiveContext::Options());
    Studio::VSimulatedFeed feed({2, 4}, pContext);
    ASSERT_TRUE(feed.Produce(0, 250).IsSuccess());
    ASSERT_TRUE(feed.Produce(250, 3).IsSuccess());
    EXPECT_TRUE(feed.Produce(100, 1).IsError()) << "frames that are there already";
    EXPECT_EQ(pContext->GetTickRange(), (TQL::TickRange{0, 253 * TQL::DefaultFramePeriod}));
    EXPECT_EQ(pContext->GetChannels()->size(), 2u * (53 + 20) + 16 + 8 + 1);

    // The recording of the same frames has the same samples under the same names.
    const Simulation::VWalkSimulator simulator({2, 4});
    const auto recording = Simulation::RecordWalk(simulator, 0, 253);
    std::map<std::string, const Recordings::RecordedChannel*> recorded;
    for (const auto& rChannel : recording.Channels)
        recorded[rChannel.Name] = &rChannel;
    std::size_t compared = 0;
    for (const auto& rpChannel : *pContext->GetChannels())
    {
        TQL::ParameterValue name;
        ASSERT_TRUE(rpChannel->GetParameters()->Read("", "InstanceDisplayName", name).IsSuccess());
        const auto found = recorded.find(std::get<std::string>(name));
        if (found == recorded.end())
            continue;
        const auto pBlock = rpChannel->GetOutput()->GetBlock();
        TQL::TickRange range;
        pBlock->GetRange(range);
        std::vector<float> samples(found->second->Samples.size());
        ASSERT_TRUE(pBlock->ReadSamples(range, samples).IsSuccess()) << found->first;
        for (std::size_t i = 0; i < samples.size(); ++i)
            ASSERT_TRUE(samples[i] == found->second->Samples[i] ||
                        (std::isnan(samples[i]) && std::isnan(found->second->Samples[i])))
                << found->first << " " << i;
        ++compared;
    }
    EXPECT_EQ(compared, recording.Channels.size());

    std::vector<float> seen(253, 0.0f);
    for (const auto& rChannel : recording.Channels)
        for (std::size_t row = 0; row < 253 && rChannel.Kind == Recordings::EChannelKind::Marker; ++row)
            seen[row] += std::isnan(rChannel.Samples[3 * row]) ? 0.0f : 1.0f;
    std::vector<float> counted(253);
    const auto pCount = pContext->FindChannel({"Live", "SampleCount", 0, 0, ""});
    ASSERT_NE(pCount, nullptr);
    ASSERT_TRUE(pCount->GetOutput()->GetBlock()->ReadSamples(pContext->GetTickRange(), counted).IsSuccess());
    EXPECT_EQ(counted, seen);
}

TEST(TimeText, TicksBecomeAClock)
{
    constexpr std::int64_t second = TQL::DefaultTickRate;
    static const struct
    {
        std::int64_t Ticks;
        const char* pText;
    } rows[] = {{0, "0:00:00.000"},
                {second - 1, "0:00:00.999"},
                {62 * second + second / 4, "0:01:02.250"},
                {-second / 2, "-0:00:00.500"},
                {240 * 3600 * second, "240:00:00.000"}};
    for (const auto& rRow : rows)
        EXPECT_EQ(Studio::FormatTime(rRow.Ticks), rRow.pText);
}

TEST(Paths, TheSampleIsFoundBesideAnInstalledProgramAndInTheTree)
{
    for (const char* pPlace : {"share/graphplots/samples", "samples"})
    {
        const QTemporaryDir temporary;
        const std::filesystem::path root = temporary.path().toStdString();
        const bool bInstalled = std::string(pPlace) != "samples";
        const auto program = root / (bInstalled ? "lib/graphplots" : "build/dev/bin");
        std::filesystem::create_directories(program);
        EXPECT_EQ(Studio::FindSample(program), std::filesystem::path());
        std::filesystem::create_directories(root / pPlace / "walk.c3d"); // a folder of that name is no sample
        EXPECT_EQ(Studio::FindSample(program), std::filesystem::path());
        std::filesystem::remove(root / pPlace / "walk.c3d");
        std::ofstream(root / pPlace / "walk.c3d") << "sample";
        EXPECT_EQ(Studio::FindSample(program), root / pPlace / "walk.c3d");
    }
}

TEST(ContextNames, AreUniqueAndNeverReserved)
{
    const std::set<std::string> taken{"Live", "walk", "walk (2)", "Recording Live"};
    static const struct
    {
        const char* pName;
        const char* pExpected;
    } rows[] = {{"run", "run"},
                {"walk", "walk (3)"},
                {"Live", "Recording Live (2)"},
                {"GlobalItems", "Recording GlobalItems"},
                {"#3", "Recording #3"},
                {"*", "Recording *"},
                {"", "Recording "}};
    for (const auto& rRow : rows)
        EXPECT_EQ(
            Studio::MakeContextName(rRow.pName, [&](const std::string& i_rName) { return taken.contains(i_rName); }),
            rRow.pExpected)
            << rRow.pName;
}

TQL::SelectionItem Item(std::uint64_t i_Number)
{
    return {TQL::ESelectionKind::Label, 0, i_Number, ""};
}

TEST(ContextSelection, EachContextFindsItsOwnAgain)
{
    using Items = std::vector<TQL::SelectionItem>;
    const Items live{Item(0), Item(1), Item(2)}, walk{Item(0), Item(1)}, other{Item(7), Item(8)};
    Studio::VContextSelection selection;
    EXPECT_EQ(selection.Show("Live", live), Items{Item(0)}) << "the first channel to begin with";
    selection.Remember({Item(2), Item(1)});
    EXPECT_EQ(selection.Show("walk", walk), Items{Item(1)}) << "what it knows of the selection before";
    EXPECT_EQ(selection.Show("other", other), Items{Item(7)});
    selection.Remember({});
    EXPECT_EQ(selection.Show("Live", live), (Items{Item(2), Item(1)}));
    EXPECT_EQ(selection.Show("other", other), Items{}) << "cleared by the operator";
    EXPECT_EQ(selection.Show("none", {}), Items{});
}

TEST(ChannelTable, ListsAndJsonTellTheSame)
{
    Recordings::VRecording recording;
    Recordings::RecordedChannel marker;
    marker.Kind = Recordings::EChannelKind::Marker;
    marker.Name = "Knöchel\t1";
    marker.ComponentNames = {"X", "Y", "Z"};
    marker.Units = "mm";
    marker.Rate = 59.94;
    marker.Samples = {1, 2, 3, std::numeric_limits<float>::quiet_NaN(), 0, 0};
    Recordings::RecordedChannel force;
    force.Kind = Recordings::EChannelKind::Analog;
    force.Name = "Fz";
    force.ComponentNames = {""};
    force.Rate = 1000;
    force.Samples = {1, 2, 3};
    recording.Channels = {marker, force};

    EXPECT_EQ(Studio::FormatChannelTable(recording), "name       type    components  units   rate  samples  missing\n"
                                                     "Knöchel 1  Marker  X Y Z       mm     59.94        2        1\n"
                                                     "Fz         Analog  -           -       1000        3        0\n");
    const auto json = QJsonDocument::fromJson(QByteArray::fromStdString(Studio::FormatChannelJson(recording))).array();
    ASSERT_EQ(json.size(), 2);
    const QJsonObject first = json[0].toObject();
    EXPECT_EQ(first["name"].toString().toStdString(), marker.Name);
    EXPECT_EQ(first["components"].toArray(), (QJsonArray{"X", "Y", "Z"}));
    EXPECT_EQ(first["rate"].toDouble(), 59.94);
    EXPECT_EQ(first["missing"].toInt(), 1);
    EXPECT_EQ(json[1].toObject()["units"].toString(), "");
    EXPECT_EQ(json[1].toObject()["samples"].toInt(), 3);
    EXPECT_EQ(Studio::FormatChannelJson({}), "[\n]\n");
}

} // namespace
