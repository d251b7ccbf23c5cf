#include "NotificationSystem/VMultiCallbackPostal.h"
#include "NotificationSystem/VSubscriptions.h"
#include "NotificationSystem/WeakCallback.h"
#include "TQL/VShared.h"
#include "support/ManualPostalService.h"

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <thread>
#include <vector>

namespace
{

using NotificationSystem::VMultiCallbackPostal;
using TestSupport::ManualPostalService;

using Signal = VMultiCallbackPostal<void(int)>;

class Target : public TQL::VShared
{
public:
    void OnValue(int i_Value) { m_Values.push_back(i_Value); }
    std::vector<int> m_Values;
};

TEST(MultiCallback, RoutesByPostalService)
{
    const auto pDefault = std::make_shared<ManualPostalService>();
    const auto pOther = std::make_shared<ManualPostalService>();
    Signal signal(pDefault);
    std::string log;
    EXPECT_FALSE(signal.Invoke(0)) << "nobody listens";
    signal.Add([&](int i) { log += "d" + std::to_string(i); });
    signal.Add([&](int i) { log += "o" + std::to_string(i); }, pOther);
    signal.AddDirect([&](int i) { log += "n" + std::to_string(i); });
    EXPECT_EQ(signal.Count(), 3u);

    EXPECT_TRUE(signal.Invoke(1));
    EXPECT_TRUE(signal.Invoke(2));
    EXPECT_EQ(log, "n1n2") << "only the direct one has run";
    pOther->RunAll();
    EXPECT_EQ(log, "n1n2o1o2") << "each service keeps the order of its calls";
    pDefault->RunAll();
    EXPECT_EQ(log, "n1n2o1o2d1d2") << "every Invoke reaches every subscriber";

    signal.Invoke(3);
    signal.Add([&](int i) { log += "l" + std::to_string(i); });
    log.clear();
    pDefault->RunAll();
    EXPECT_EQ(log, "d3l3") << "one added before the posted job runs is called too";
    EXPECT_EQ(signal.RemoveAll(), 4u);
    EXPECT_FALSE(signal.Invoke(4));
}

TEST(MultiCallback, RemovesByHandle)
{
    const auto pService = std::make_shared<ManualPostalService>();
    Signal signal(pService);
    int calls = 0;
    const auto first = signal.AddDirect([&](int) { ++calls; });
    const auto second = signal.Add([&](int) { ++calls; });
    EXPECT_NE(first, second);
    EXPECT_EQ(signal.Remove(first + 1), 0u);
    EXPECT_EQ(signal.Remove(first), 1u);
    EXPECT_EQ(signal.Remove(first), 0u);
    signal.Invoke(1);
    EXPECT_EQ(signal.Remove(second), 1u);
    pService->RunAll();
    EXPECT_EQ(calls, 0) << "removed before its posted call ran";
    EXPECT_FALSE(signal.Invoke(1));
}

TEST(MultiCallback, ADeadWeakTargetGoesAfterOneCall)
{
    Signal signal;
    auto pTarget = TQL::MakeShared<Target>();
    const std::weak_ptr<Target> pWeak = pTarget;
    signal.AddDirect(NotificationSystem::MakeWeakCallback(pWeak, &Target::OnValue));
    int others = 0;
    signal.AddDirect([&](int) { ++others; });
    signal.Invoke(5);
    EXPECT_EQ(pTarget->m_Values, std::vector<int>{5});
    pTarget.reset();
    EXPECT_EQ(signal.Count(), 2u);
    signal.Invoke(6);
    EXPECT_EQ(signal.Count(), 1u);
    EXPECT_EQ(others, 2) << "the others are called all the same";
}

TEST(MultiCallback, TheLastDeadTargetLeavesTheSignalEmpty)
{
    Signal signal;
    signal.AddDirect([](int) { throw TQL::VDeregisterWeakCallbackException(); });
    EXPECT_TRUE(signal.Invoke(1));
    EXPECT_FALSE(signal.Invoke(2));
    EXPECT_EQ(signal.Count(), 0u);
    signal.AddDirect([](int) { throw std::runtime_error("a fault"); });
    EXPECT_THROW(signal.Invoke(3), std::runtime_error) << "other exceptions pass through";
    EXPECT_EQ(signal.Count(), 1u);
}

TEST(MultiCallback, SubscribersMayChangeTheListWhileItRuns)
{
    Signal signal;
    std::string log;
    Signal::Handle own = 0;
    own = signal.AddDirect(
        [&](int)
        {
            log += 'a';
            signal.Remove(own);
            signal.AddDirect([&](int) { log += 'c'; });
            if (log == "a")
                signal.Invoke(0);
        });
    signal.AddDirect([&](int) { log += 'b'; });
    signal.Invoke(1);
    EXPECT_EQ(log, "abcb") << "the inner call runs the list as it stands then, the outer one the list that it took";
    log.clear();
    signal.Invoke(2);
    EXPECT_EQ(log, "bc");
}

/// What a subscriber may own: as it goes it comes back to where it was held.
std::shared_ptr<void> AtTheEnd(std::function<void()> i_Call)
{
    return {nullptr, [call = std::move(i_Call)](void*)
            {
                call();
            }};
}

TEST(MultiCallback, WhatGoesMayUnsubscribeFromTheSameSignal)
{
    using End = void (*)(Signal&, Signal::Handle);
    const End ends[] = {[](Signal& io_rSignal, Signal::Handle i_Handle) { io_rSignal.Remove(i_Handle); },
                        [](Signal& io_rSignal, Signal::Handle) { io_rSignal.RemoveAll(); },
                        [](Signal& io_rSignal, Signal::Handle)
                        {
                            io_rSignal.Invoke(1);
                        }};
    for (const End end : ends)
    {
        Signal signal;
        const auto other = signal.AddDirect([](int) {});
        const auto handle = signal.AddDirect([pOwned = AtTheEnd([&] { signal.Remove(other); })](int)
                                             { throw TQL::VDeregisterWeakCallbackException(); });
        end(signal, handle);
        EXPECT_EQ(signal.Count(), 0u);
    }
    struct Service : ManualPostalService
    {
        std::shared_ptr<void> pOwned;
    };
    Signal signal;
    auto pService = std::make_shared<Service>();
    const auto other = signal.AddDirect([](int) {});
    pService->pOwned = AtTheEnd([&] { signal.Remove(other); });
    const auto handle = signal.Add([](int) {}, std::move(pService));
    EXPECT_EQ(signal.Remove(handle), 1u);
    EXPECT_EQ(signal.Count(), 0u) << "the service went with its last subscriber";
}

TEST(MultiCallback, SubscriptionsEndWithTheirHolder)
{
    auto pSignal = std::make_shared<Signal>();
    const std::weak_ptr<Signal> pWeak = pSignal;
    int calls = 0;
    {
        NotificationSystem::VSubscriptions subscriptions;
        const auto pService = std::make_shared<ManualPostalService>();
        subscriptions.Subscribe<void(int)>(
            pSignal, [&](int) { ++calls; }, nullptr);
        subscriptions.Subscribe<void(int)>(
            pSignal, [&](int) { ++calls; }, pService);
        pSignal->Invoke(1);
        pService->RunAll();
        EXPECT_EQ(calls, 2);
        subscriptions.Drain();
        EXPECT_EQ(pSignal->Count(), 0u);
        subscriptions.Subscribe<void(int)>(
            pSignal, [&](int) { ++calls; }, nullptr);
        pSignal.reset();
        EXPECT_FALSE(pWeak.expired()) << "a subscription keeps its signal until it has been ended";
    }
    EXPECT_TRUE(pWeak.expired());
    EXPECT_EQ(calls, 2);
}

TEST(MultiCallback, AnyThreadMayAddRemoveAndInvoke)
{
    const auto pService = std::make_shared<ManualPostalService>();
    Signal signal(pService);
    std::atomic<int> calls = 0;
    std::vector<std::jthread> threads;
    for (int t = 0; t < 4; ++t)
        threads.emplace_back(
            [&, t]
            {
                for (int i = 0; i < 300; ++i)
                {
                    const auto handle =
                        t % 2 == 0 ? signal.AddDirect([&](int) { ++calls; }) : signal.Add([&](int) { ++calls; });
                    signal.Invoke(i);
                    EXPECT_EQ(signal.Remove(handle), 1u);
                }
            });
    threads.clear();
    pService->RunAll(100000);
    EXPECT_EQ(signal.Count(), 0u);
    EXPECT_GE(calls.load(), 600) << "each thread of direct subscribers hears its own calls at least";
}

} // namespace
