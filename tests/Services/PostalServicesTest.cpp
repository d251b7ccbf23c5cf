#include "NotificationSystem/VAsioPostalServiceStrand.h"
#include "NotificationSystem/VDelayedPostalService.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "Services/Postal/VUiPostalService.h"
#include "Services/Postal/VWorkerPostalService.h"
#include "TQL/IMultiCallback.h"
#include "support/LogGuard.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QEventLoop>

#include <atomic>
#include <future>
#include <set>
#include <stdexcept>
#include <thread>

namespace Services
{
namespace
{

/// Turns the event loop until nothing waits.
void Spin(const VUiPostalService& i_rService)
{
    while (i_rService.Pending() != 0)
        QCoreApplication::processEvents();
}

TEST(VUiPostalService, RunsInOrderFromTheEventLoopAndNeverInsidePost)
{
    VUiPostalService service;
    std::string trace;
    service.Post(
        [&]
        {
            trace += "a(";
            service.Post([&] { trace += "c"; });
            trace += ")";
        });
    service.Post([&] { trace += "b"; });
    EXPECT_EQ(trace, "");
    EXPECT_EQ(service.Pending(), 2u);
    Spin(service);
    EXPECT_EQ(trace, "a()bc");

    TQL::DispatchTraits traits;
    service.GetDispatchTraits(traits);
    EXPECT_TRUE(traits.IsStrand());
}

TEST(VUiPostalService, KeepsTheOrderOfEachOfManyThreadsAndRunsOnTheUiThread)
{
    VUiPostalService service;
    constexpr int threadCount = 4;
    constexpr int jobCount = 500;
    std::vector<std::vector<int>> seen(threadCount);
    const std::thread::id uiThread = std::this_thread::get_id();
    bool bAlwaysOnUi = true;
    std::vector<std::thread> threads;
    for (int thread = 0; thread < threadCount; ++thread)
        threads.emplace_back(
            [&, thread]
            {
                for (int job = 0; job < jobCount; ++job)
                    service.Post(
                        [&, thread, job]
                        {
                            bAlwaysOnUi = bAlwaysOnUi && std::this_thread::get_id() == uiThread;
                            seen[static_cast<std::size_t>(thread)].push_back(job);
                        });
            });
    for (std::thread& rThread : threads)
        rThread.join();
    QCoreApplication::processEvents();
    EXPECT_TRUE(bAlwaysOnUi);
    for (const std::vector<int>& rJobs : seen)
    {
        EXPECT_EQ(rJobs.size(), static_cast<std::size_t>(jobCount));
        EXPECT_TRUE(std::ranges::is_sorted(rJobs));
    }
}

TEST(VUiPostalService, GoesOnInsideANestedEventLoop)
{
    VUiPostalService service;
    std::string trace;
    service.Post(
        [&]
        {
            QEventLoop loop;
            service.Post([&] { loop.quit(); });
            trace += "in ";
            loop.exec();
            trace += "out";
        });
    service.Post([&] { trace += "next "; });
    QCoreApplication::processEvents();
    EXPECT_EQ(trace, "in next out");
}

TEST(VUiPostalService, SurvivesJobsThatThrowAndSaysSo)
{
    TestSupport::LogGuard log;
    VUiPostalService service;
    int ran = 0;
    service.Post([] { throw std::runtime_error("broken"); });
    service.Post([] { throw TQL::VDeregisterWeakCallbackException(); });
    service.Post([&] { ++ran; });
    QCoreApplication::processEvents();
    EXPECT_EQ(ran, 1);
    const auto entries = log.Take();
    ASSERT_EQ(entries.size(), 1u) << "a dead weak target is no error";
    EXPECT_NE(entries[0].Text.find("broken"), std::string::npos);
}

TEST(VUiPostalService, DrainRunsWhatWaitsAndWhatThatPosts)
{
    VUiPostalService service;
    int depth = 0;
    const std::function<void()> post = [&]
    {
        if (++depth < 5)
            service.Post(post);
    };
    service.Post(post);
    EXPECT_EQ(service.Drain(), 5u);
    EXPECT_EQ(depth, 5);
    const std::function<void()> forEver = [&]
    {
        service.Post(forEver);
    };
    service.Post(forEver);
    EXPECT_EQ(service.Drain(10), 10u) << "a job that posts itself does not hang the unloading";
}

TEST(VUiPostalService, DropsWhatWaitsWhenItGoes)
{
    auto pService = std::make_shared<VUiPostalService>();
    const auto pHeld = std::make_shared<int>(1);
    int ran = 0;
    for (int i = 0; i < 3; ++i)
        pService->Post([&ran, pHeld] { ++ran; });
    // Released on another thread, while events wait in the UI thread.
    std::thread([&] { pService.reset(); }).join();
    EXPECT_EQ(pHeld.use_count(), 1) << "the dropped jobs let go of what they hold";
    QCoreApplication::processEvents();
    EXPECT_EQ(ran, 0);

    pService = std::make_shared<VUiPostalService>();
    pService->Post([&] { pService.reset(); });
    pService->Post([&] { ++ran; });
    QCoreApplication::processEvents();
    EXPECT_EQ(ran, 0) << "the last owner may be a job";
}

TEST(VUiPostalService, CarriesACollapserThatPostsUnderItsMutex)
{
    const auto pService = std::make_shared<VUiPostalService>();
    const auto pCollapser = NotificationSystem::MakeCollapserDontPost(pService);
    int ran = 0;
    for (int i = 0; i < 10; ++i)
        pCollapser->Post([&] { ++ran; });
    QCoreApplication::processEvents();
    EXPECT_EQ(ran, 1);
}

TEST(VWorkerPostalService, RunsOnAtLeastTwoThreadsAtATime)
{
    VWorkerPostalService service(0);
    EXPECT_GE(service.ThreadCount(), 2u);
    TQL::DispatchTraits traits;
    traits.Kind = 7;
    service.GetDispatchTraits(traits);
    EXPECT_FALSE(traits.IsStrand());
    EXPECT_EQ(traits.Kind, 0u);

    // Each job waits for the other, so both are under way at the same time.
    std::promise<void> first;
    std::promise<void> second;
    service.Post(
        [&]
        {
            first.set_value();
            second.get_future().wait();
        });
    service.Post(
        [&]
        {
            second.set_value();
            first.get_future().wait();
        });
    EXPECT_TRUE(service.Drain());
}

TEST(VWorkerPostalService, DrainWaitsForStrandsTimersAndFollowers)
{
    const auto pService = std::make_shared<VWorkerPostalService>();
    const auto pStrand = NotificationSystem::MakeStrand(pService);
    for (int round = 0; round < 20; ++round)
    {
        std::atomic<int> ran = 0;
        for (int job = 0; job < 50; ++job)
            pStrand->Post(
                [&]
                {
                    ++ran;
                    pService->Post([&] { ++ran; });
                });
        const auto pDelayed = NotificationSystem::MakeDelayedCollapsed(pStrand, pService->GetContext(), 1);
        pDelayed->Post([&] { ++ran; });
        ASSERT_TRUE(pService->Drain());
        ASSERT_EQ(ran, 101) << "round " << round;
    }
}

TEST(VWorkerPostalService, DrainGivesUpOnAJobThatPostsItself)
{
    const auto pService = std::make_shared<VWorkerPostalService>();
    std::atomic<bool> bGoOn = true;
    const std::function<void()> forEver = [&]
    {
        if (bGoOn)
            pService->Post(forEver);
    };
    pService->Post(forEver);
    EXPECT_FALSE(pService->Drain(std::chrono::milliseconds(0)));
    bGoOn = false;
    EXPECT_TRUE(pService->Drain()) << "the pool is still of use after a drain that failed";
}

TEST(VWorkerPostalService, GoesOnAfterAJobThatThrows)
{
    TestSupport::LogGuard log;
    VWorkerPostalService service;
    for (int i = 0; i < 4; ++i)
        service.Post([] { throw std::runtime_error("broken"); });
    std::atomic<int> ran = 0;
    for (int i = 0; i < 4; ++i)
        service.Post([&] { ++ran; });
    EXPECT_TRUE(service.Drain());
    EXPECT_EQ(ran, 4);
    EXPECT_EQ(log.Take().size(), 4u);
}

TEST(VWorkerPostalService, StopEndsTheThreadsAndRefusesWhatFollows)
{
    VWorkerPostalService service;
    std::atomic<int> ran = 0;
    service.Post([&] { ++ran; });
    EXPECT_TRUE(service.Drain());
    service.Stop();
    const auto pHeld = std::make_shared<int>(1);
    service.Post([&ran, pHeld] { ++ran; });
    EXPECT_EQ(pHeld.use_count(), 1);
    EXPECT_TRUE(service.Drain());
    EXPECT_EQ(ran, 1);
}

TEST(VWorkerPostalService, MayBeLetGoByItsOwnJob)
{
    auto pService = std::make_shared<VWorkerPostalService>();
    std::promise<void> released;
    std::promise<void> done;
    pService->Post(
        [pKept = pService, &released, &done]() mutable
        {
            released.get_future().wait();
            pKept.reset();
            done.set_value();
        });
    pService.reset();
    released.set_value();
    done.get_future().wait();
}

} // namespace
} // namespace Services
