#include "NotificationSystem/VDispatchCollapsers.h"
#include "TQL/IMultiCallback.h"
#include "support/ManualPostalService.h"

#include <gtest/gtest.h>

#include <string>

namespace
{

using NotificationSystem::MakeCollapserDontDispatch;
using NotificationSystem::MakeCollapserDontPost;
using TestSupport::ManualPostalService;

TEST(Collapser, DontPostRunsTheFirstOfABurst)
{
    const auto pService = std::make_shared<ManualPostalService>();
    const auto pCollapser = MakeCollapserDontPost(pService);
    std::string log;
    for (int i = 0; i < 10; ++i)
        pCollapser->Post([&log, i] { log += std::to_string(i); }, 42);
    EXPECT_EQ(pService->Pending(), 1u);
    EXPECT_EQ(pService->RunAll(), 1u);
    EXPECT_EQ(log, "0");
    EXPECT_EQ(pService->LastTag(), 42u) << "the tag travels through";
    pCollapser->Post(
        [&]
        {
            log += 'x';
            pCollapser->Post([&] { log += 'y'; });
        });
    EXPECT_EQ(pService->RunAll(), 2u);
    EXPECT_EQ(log, "0xy") << "a post from inside a collapsed job is accepted";
}

TEST(Collapser, DontDispatchRunsTheLastOfABurst)
{
    const auto pService = std::make_shared<ManualPostalService>();
    const auto pCollapser = MakeCollapserDontDispatch(pService);
    std::string log;
    for (int i = 0; i < 10; ++i)
        pCollapser->Post([&log, i] { log += std::to_string(i); });
    EXPECT_EQ(pService->RunAll(), 10u) << "nine empty shells and one job";
    EXPECT_EQ(log, "9");
    pCollapser->Post(
        [&]
        {
            log += 'x';
            pCollapser->Post([&] { log += 'y'; });
        });
    pService->RunAll();
    EXPECT_EQ(log, "9xy");
}

TEST(Collapser, QueuedJobsKeepItAliveAndDeadTargetsPassQuietly)
{
    const auto pService = std::make_shared<ManualPostalService>();
    EXPECT_EQ(MakeCollapserDontPost(nullptr), nullptr);
    EXPECT_EQ(MakeCollapserDontDispatch(nullptr), nullptr);
    bool bRan = false;
    MakeCollapserDontPost(pService)->Post([&] { bRan = true; });
    MakeCollapserDontDispatch(pService)->Post([] { throw TQL::VDeregisterWeakCallbackException(); });
    EXPECT_NO_THROW(pService->RunAll());
    EXPECT_TRUE(bRan);
    NotificationSystem::VDispatchCollapserDontPostIfAnotherQueued onStack(pService);
    EXPECT_THROW(onStack.Post([] {}), std::bad_weak_ptr);
    TQL::DispatchTraits traits;
    onStack.GetDispatchTraits(traits);
    EXPECT_TRUE(traits.IsStrand()) << "traits come from the wrapped service";
}

TEST(Collapser, AJobThatIsDroppedMayPostAsItGoes)
{
    struct ClosedService : ManualPostalService
    {
        void Post(Job, std::uint64_t) override {}
    };
    const auto pCollapser = MakeCollapserDontPost(std::make_shared<ClosedService>());
    bool bGone = false;
    const auto comeBack = [&](void*)
    {
        pCollapser->Post([] {});
        bGone = true;
    };
    pCollapser->Post([pOwned = std::shared_ptr<void>(nullptr, comeBack)] {});
    EXPECT_TRUE(bGone);
}

} // namespace
