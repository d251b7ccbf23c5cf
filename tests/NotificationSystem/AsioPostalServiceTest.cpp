#include "NotificationSystem/VAsioPostalServiceStrand.h"
#include "NotificationSystem/VDelayedPostalService.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "support/ManualPostalService.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <limits>
#include <string>
#include <thread>
#include <vector>

namespace
{

using NotificationSystem::MakeStrand;
using NotificationSystem::Detail::SaturatedExpiry;
using NotificationSystem::Detail::VDelayedPostalService;
using TestSupport::ManualPostalService;

/// A pool whose threads are those of the test that runs the context.
class PoolPostalService : public TQL::IAsioPostalService
{
public:
    void Post(Job i_Job, std::uint64_t = 0) override { boost::asio::post(*m_pExecutor, std::move(i_Job)); }
    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override { o_rTraits = {}; }
    const std::shared_ptr<NotificationSystem::Executor>& GetExecutor() const override { return m_pExecutor; }
    const std::shared_ptr<boost::asio::io_context>& GetContext() const override { return m_pContext; }

    std::shared_ptr<boost::asio::io_context> m_pContext = std::make_shared<boost::asio::io_context>();
    std::shared_ptr<NotificationSystem::Executor> m_pExecutor =
        std::make_shared<NotificationSystem::Executor>(m_pContext->get_executor());
};

TEST(Strand, RunsJobsInOrderAndNeverTwoAtOnce)
{
    const auto pPool = std::make_shared<PoolPostalService>();
    const auto pStrand = MakeStrand(pPool);
    TQL::DispatchTraits traits;
    pStrand->GetDispatchTraits(traits);
    EXPECT_TRUE(traits.IsStrand());
    EXPECT_EQ(MakeStrand(pStrand)->GetExecutor(), pStrand->GetExecutor()) << "a strand on a strand adds nothing";

    std::vector<int> order;
    std::atomic<int> inside = 0;
    int overlaps = 0;
    for (int i = 0; i < 2000; ++i)
        pStrand->Post(
            [&, i]
            {
                overlaps += ++inside > 1 ? 1 : 0;
                order.push_back(i);
                --inside;
            });
    std::vector<std::jthread> threads;
    for (int t = 0; t < 4; ++t)
        threads.emplace_back([&] { pPool->m_pContext->run(); });
    threads.clear();
    EXPECT_EQ(overlaps, 0);
    ASSERT_EQ(order.size(), 2000u);
    EXPECT_TRUE(std::is_sorted(order.begin(), order.end()));
}

TEST(Strand, AJobPostedFromAJobRunsAfterIt)
{
    const auto pPool = std::make_shared<PoolPostalService>();
    const auto pStrand = MakeStrand(pPool);
    std::string log;
    pStrand->Post(
        [&]
        {
            pStrand->Post([&] { log += 'c'; });
            log += 'a';
        });
    pStrand->Post([&] { log += 'b'; });
    pPool->m_pContext->run();
    EXPECT_EQ(log, "abc");
}

TEST(DelayedPost, ASecondPostSendsTheFirstOnAtOnce)
{
    const auto pService = std::make_shared<ManualPostalService>();
    const auto pContext = std::make_shared<boost::asio::io_context>();
    std::string log;
    auto pDelayed = std::make_unique<VDelayedPostalService>(pService, pContext, 3'600'000);
    pDelayed->Post([&] { log += '1'; }, 7);
    EXPECT_EQ(pService->Pending(), 0u);
    pDelayed->Post([&] { log += '2'; });
    pContext->poll();
    EXPECT_EQ(pService->RunAll(), 1u);
    EXPECT_EQ(log, "1") << "the first at once, the second only after its delay";
    EXPECT_EQ(pService->LastTag(), 7u);
    pDelayed.reset();
    pContext->poll();
    pService->RunAll();
    EXPECT_EQ(log, "12") << "destruction loses no job";
}

TEST(DelayedPost, ADelayOfZeroIsStillAsynchronous)
{
    const auto pService = std::make_shared<ManualPostalService>();
    const auto pContext = std::make_shared<boost::asio::io_context>();
    const auto pLoop = NotificationSystem::MakeDelayedCollapsed(pService, pContext, 0);
    std::string log;
    pLoop->Post([&] { log += 'a'; });
    pLoop->Post([&] { log += 'b'; });
    EXPECT_EQ(pService->Pending(), 0u);
    pContext->run();
    pService->RunAll();
    EXPECT_EQ(log, "b") << "the collapser runs only the latest job";
}

TEST(DelayedPost, TheExpirySaturates)
{
    using Clock = std::chrono::system_clock;
    const Clock::time_point now = Clock::time_point(std::chrono::hours(24));
    EXPECT_EQ(SaturatedExpiry(now, 1500), now + std::chrono::milliseconds(1500));
    EXPECT_EQ(SaturatedExpiry(now, -1500), now - std::chrono::milliseconds(1500));
    EXPECT_EQ(SaturatedExpiry(now, std::numeric_limits<std::int64_t>::max()), Clock::time_point::max());
    EXPECT_EQ(SaturatedExpiry(now, std::numeric_limits<std::int64_t>::min()), Clock::time_point::min());
    EXPECT_EQ(SaturatedExpiry(Clock::time_point::max(), 1), Clock::time_point::max());
}

} // namespace
