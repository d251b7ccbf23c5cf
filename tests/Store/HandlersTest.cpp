#include "StoreInterface/IHandlerCallbackProxy.h"
#include "StoreScript.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <gtest/gtest.h>

#include <atomic>
#include <thread>

namespace
{

using Store::EntryPath;
using Store::HandlerKey;
using StoreTest::Names;
using StoreTest::StoreScript;
using TQL::ChangeFlags;
using TQL::ChangeId;
using Token = TQL::IHandlerCallback::Token;

/// Runs jobs at once: services must not, but a store has to live through it.
class InlineService : public TQL::IPostalService
{
public:
    void Post(Job i_Job, std::uint64_t) override { i_Job(); }
    void GetDispatchTraits(TQL::DispatchTraits&) const override {}
};

struct HandlersTest : testing::Test
{
    std::shared_ptr<TQL::IHandlerCallback> Handler(const HandlerKey& i_rKey)
    {
        return Script.Get().GetHandlerCallback(i_rKey);
    }
    /// A handler for patterns whose direct calls are noted as "name(bits) ".
    std::shared_ptr<TQL::IHandlerCallback> Noting(const std::string& i_rName, std::vector<const char*> i_Patterns)
    {
        HandlerKey key;
        for (const char* const pPattern : i_Patterns)
            key.Patterns.emplace_back(pPattern);
        auto pHandler = Handler(key);
        Token token = 0;
        EXPECT_EQ(pHandler->SubscribeDirect(token, Note(i_rName)), TQL::Result::Ok);
        return pHandler;
    }
    TQL::IHandlerCallback::Callback Note(std::string i_Name)
    {
        return [this, i_Name](ChangeFlags i_What, ChangeId)
        {
            Log += i_Name + '(' + Names(i_What) + ") ";
        };
    }
    std::string Take() { return std::exchange(Log, {}); }

    TestSupport::LogGuard Guard;
    StoreScript Script;
    std::string Log;
};

TEST_F(HandlersTest, OneKeyHasOneHandlerAtATime)
{
    const auto a = Script.Entry("A");
    const auto b = Script.Entry("B");
    const EntryPath p("*/X");
    const auto pHandler = Handler({{b, a, a}, {p}});
    EXPECT_EQ(Handler({{a, b}, {p, p}}), pHandler);
    EXPECT_NE(Handler({{a}, {p}}), pHandler);
    Token token = 0;
    {
        auto pOther = Handler({{a}, {}});
        EXPECT_TRUE(pOther->SubscribeDirect(token, Note("gone")).IsSuccess());
        const TQL::IHandlerCallbackProxy proxy = pOther->GetProxy();
        pOther.reset();
        EXPECT_EQ(proxy.GetTotalSubscriptionCount(), 1u) << "a proxy keeps its handler";
        EXPECT_EQ(Handler({{a}, {}})->GetSubscriptionCount(token), 1u);
        EXPECT_EQ(proxy.RemoveSubscription(token), 1u);
    }
    EXPECT_EQ(Handler({{a}, {}})->GetTotalSubscriptionCount(), 0u) << "a new one after the last was let go";
    Script.Write("A=1");
    EXPECT_EQ(Take(), "");
}

TEST_F(HandlersTest, PatternsMatchWhatComesLater)
{
    Script.Write("A/X=1");
    const auto pAny = Noting("any", {"*/X"});
    const auto pExact = Noting("exact", {"B/X"});
    const auto pDeep = Noting("deep", {"*/*/Y", "B/*/Y"});
    const auto pEvery = Noting("every", {"*"});
    Script.Write("A/X=2");
    EXPECT_EQ(Take(), "any(Verified) every(Verified) ");
    Script.Write("B/X=1");
    EXPECT_EQ(Take(), "any(Verified Created) exact(Verified Created) every(Verified Created ChildCreated) ");
    Script.Write("B/X/Y=1");
    EXPECT_EQ(Take(), "deep(Verified Created) any(Verified ChildCreated) exact(Verified ChildCreated) "
                      "every(Verified DescendantCreated) ");
    Script.Write("remove B");
    EXPECT_EQ(Take(), "deep(Removed) any(Removed ChildRemoved) exact(Removed ChildRemoved) "
                      "every(Removed ChildRemoved DescendantRemoved) ");
    Script.Write("B/X=1");
    EXPECT_EQ(Take(), "any(Verified Created) exact(Verified Created) every(Verified Created ChildCreated) ");
    Script.Write("Speed*=1 /X=1");
    EXPECT_EQ(Take(), "every(Verified Created) ") << "\"/X\" is a child of the root";
}

TEST_F(HandlersTest, DirectCallsRunOneAfterAnother)
{
    Token token = 0;
    const auto pFirst = Handler({{Script.Entry("A")}, {}});
    const auto pSecond = Noting("B", {"B"});
    const auto pRoot = Noting("root", {""});
    EXPECT_TRUE(pFirst
                    ->SubscribeDirect(token,
                                      [&](ChangeFlags, ChangeId i_Commit)
                                      {
                                          Log += "begin ";
                                          if (i_Commit.Value() < 3)
                                          {
                                              TQL::ScopedWrite writer(Script.Get());
                                              writer->Defer([&] { Log += "deferred "; });
                                              (void)writer->SetValue(Script.Entry("B"), Store::MakeValue(1));
                                          }
                                          Log += "end ";
                                      })
                    .IsSuccess());
    Script.Write("A=1");
    EXPECT_EQ(Take(), "begin end root(Verified Created ChildCreated) B(Verified Created) root(Verified ChildCreated) "
                      "deferred ");
    Script.Write("A=2");
    EXPECT_EQ(Take(), "begin end root(Verified) ");
}

TEST_F(HandlersTest, PostedCallsComeInTheOrderOfCommits)
{
    const auto pService = std::make_shared<TestSupport::ManualPostalService>();
    const auto pOther = std::make_shared<TestSupport::ManualPostalService>();
    const auto pHandler = Handler({{Script.Entry("A")}, {}});
    Token token = 0;
    EXPECT_EQ(pHandler->Subscribe(token, Note("default"), 0), TQL::Result::NotSet);
    EXPECT_EQ(pHandler->SubscribePostal(token, nullptr, Note("null"), 0), TQL::Result::InvalidPointer);
    EXPECT_EQ(pHandler->SubscribeDirect(token, nullptr), TQL::Result::InvalidPointer);
    pHandler->SetDefaultPostalService(pService);
    EXPECT_EQ(pHandler->Subscribe(
                  token, [this](ChangeFlags, ChangeId i_Id) { Log += std::to_string(i_Id.Value()); }, 0),
              TQL::Result::Ok);
    Token gone = 0;
    EXPECT_EQ(pHandler->SubscribePostal(gone, pOther, Note("gone"), 0), TQL::Result::Ok);
    EXPECT_EQ(pHandler->GetTotalSubscriptionCount(), 2u);
    EXPECT_EQ(pHandler->UnsubscribeCallback(gone), TQL::Result::Ok);
    EXPECT_EQ(pHandler->UnsubscribeCallback(gone), TQL::Result::NotFound);
    EXPECT_EQ(pHandler->GetSubscriptionCount(gone), 0u);
    EXPECT_EQ(pHandler->GetSubscriptionCount(token), 1u);
    Script.Write("A=1");
    Script.Write("A=2");
    EXPECT_EQ(pOther->Pending(), 0u);
    EXPECT_EQ(Take(), "");
    pService->RunAll();
    EXPECT_EQ(Take(), "12");
    EXPECT_EQ(pHandler->Clear(), 1u);
    Script.Write("A=3");
    EXPECT_EQ(pService->Pending(), 0u);
}

TEST_F(HandlersTest, ADeadTargetIsDroppedAndAnInlineServiceMayWrite)
{
    const auto pHandler = Handler({{Script.Entry("A")}, {}});
    Token token = 0;
    EXPECT_TRUE(
        pHandler->SubscribeDirect(token, [](ChangeFlags, ChangeId) { throw TQL::VDeregisterWeakCallbackException(); })
            .IsSuccess());
    Token posted = 0;
    EXPECT_TRUE(pHandler
                    ->SubscribePostal(
                        posted, std::make_shared<InlineService>(),
                        [&](ChangeFlags, ChangeId i_Id)
                        {
                            Log += std::to_string(i_Id.Value()) + ' ';
                            if (i_Id.Value() < 3)
                                Script.Write("A=" + std::to_string(i_Id.Value()) + "0");
                            pHandler->RemoveSubscription(i_Id.Value() == 3 ? posted : 0);
                        },
                        0)
                    .IsSuccess());
    Script.Write("A=1");
    EXPECT_EQ(Take(), "1 2 3 ");
    EXPECT_EQ(pHandler->GetTotalSubscriptionCount(), 0u);
}

TEST_F(HandlersTest, WhatGoesWithASubscriptionMayComeBackToItsHandler)
{
    struct Service : TestSupport::ManualPostalService
    {
        std::shared_ptr<void> pOwned;
    };
    const auto pHandler = Handler({{Script.Entry("A")}, {}});
    const auto owned = [&]
    {
        return std::shared_ptr<void>(nullptr,
                                     [&](void*) { Log += std::to_string(pHandler->GetTotalSubscriptionCount()); });
    };
    for (const bool bClear : {false, true})
    {
        auto pService = std::make_shared<Service>();
        pService->pOwned = owned();
        Token direct = 0;
        Token posted = 0;
        EXPECT_TRUE(pHandler->SubscribeDirect(direct, [pOwned = owned()](ChangeFlags, ChangeId) {}).IsSuccess());
        EXPECT_TRUE(pHandler->SubscribePostal(posted, std::move(pService), Note("posted"), 0).IsSuccess());
        if (bClear)
            EXPECT_EQ(pHandler->Clear(), 2u);
        else
            for (const Token token : {direct, posted})
                EXPECT_EQ(pHandler->RemoveSubscription(token), 1u);
        EXPECT_EQ(Take(), "10");
    }
}

TEST_F(HandlersTest, WhoThrowsCostsNobodyElseANotice)
{
    struct FullService : InlineService
    {
        void Post(Job, std::uint64_t) override { throw std::runtime_error("no room"); }
    };
    const auto pService = std::make_shared<TestSupport::ManualPostalService>();
    const auto pThrowing = Handler({{Script.Entry("A")}, {}});
    Token token = 0;
    const auto fail = [](ChangeFlags, ChangeId)
    {
        throw std::runtime_error("a fault");
    };
    EXPECT_TRUE(pThrowing->SubscribeDirect(token, fail).IsSuccess());
    EXPECT_TRUE(pThrowing->SubscribeDirect(token, Note("beside")).IsSuccess());
    EXPECT_TRUE(pThrowing->SubscribePostal(token, std::make_shared<FullService>(), fail, 0).IsSuccess());
    EXPECT_TRUE(pThrowing->SubscribePostal(token, pService, Note("posted"), 0).IsSuccess());
    const auto pOther = Noting("other", {"B"});
    EXPECT_TRUE(pOther->SubscribePostal(token, pService, Note("posted"), 0).IsSuccess());
    for (const bool bNew : {true, false})
    {
        const std::string what = bNew ? "(Verified Created) " : "(Verified) ";
        EXPECT_THROW(
            {
                TQL::ScopedWrite writer(Script.Get());
                writer->Defer([&] { Log += "deferred "; });
                for (const char* const pPath : {"A", "B"})
                    (void)writer->SetValue(Script.Entry(pPath), Store::MakeValue(bNew ? 1 : 2));
            },
            std::runtime_error);
        EXPECT_EQ(Take(), "beside" + what + "other" + what + "deferred ");
        pService->RunAll();
        EXPECT_EQ(Take(), "posted" + what + "posted" + what);
        EXPECT_EQ(Guard.Take().size(), 1u) << "the second of two faults is in the log";
    }
    EXPECT_THROW(
        {
            const TQL::ScopedRead reader(Script.Get());
            reader->Defer([] { throw std::runtime_error("a fault"); });
            reader->Defer([&] { Log += "deferred"; });
        },
        std::runtime_error);
    EXPECT_EQ(Take(), "deferred");
}

TEST_F(HandlersTest, AWriteEndsWithItsNoticesPosted)
{
    /// While it takes a job another thread commits.
    struct SlowService : InlineService
    {
        void Post(Job, std::uint64_t) override { Meanwhile(); }
        std::function<void()> Meanwhile;
    };
    const auto pFirst = std::make_shared<SlowService>();
    const auto pSecond = std::make_shared<TestSupport::ManualPostalService>();
    Token token = 0;
    const auto pA = Handler({{Script.Entry("A")}, {}});
    const auto pB = Handler({{Script.Entry("B")}, {}});
    EXPECT_TRUE(pA->SubscribePostal(token, pFirst, Note("A"), 0).IsSuccess());
    EXPECT_TRUE(pB->SubscribePostal(token, pSecond, Note("B"), 0).IsSuccess());
    for (int i = 1; i <= 20; ++i)
    {
        std::size_t posted = 0;
        std::jthread other;
        const std::string value = std::to_string(i);
        pFirst->Meanwhile = [&]
        {
            other = std::jthread(
                [&]
                {
                    {
                        TQL::ScopedWrite writer(Script.Get());
                        (void)writer->SetValue(Script.Entry("B"), Store::MakeValue(i));
                    }
                    posted = pSecond->Pending();
                });
            while (Script.State("B") != value + " - - 0")
                std::this_thread::yield();
        };
        Script.Write("A=" + value);
        other.join();
        EXPECT_EQ(posted, 1u);
        pSecond->RunAll();
    }
}

TEST_F(HandlersTest, NothingIsToldAfterClose)
{
    const auto pHandler = Noting("A", {"A"});
    {
        TQL::ScopedWrite writer(Script.Get());
        (void)writer->SetValue(Script.Entry("A"), Store::MakeValue(1));
        Script.Get().Close();
    }
    Script.Write("A=2 notice A");
    EXPECT_EQ(Take(), "");
    EXPECT_EQ(Script.State("A"), "2 - - 0");
    StoreScript reading;
    {
        const TQL::ScopedRead reader(reading.Get());
        reading.Get().Close();
    }
    reading.Watch({"A"});
    EXPECT_EQ(reading.Write("A=1"), "");
}

TEST_F(HandlersTest, DeferredCallsRunWhenNothingIsHeld)
{
    {
        const TQL::ScopedRead outer(Script.Get());
        {
            const TQL::ScopedRead reader(Script.Get());
            reader->Defer(
                [&]
                {
                    Log += Script.Get().BeginWrite() ? "free " : "held ";
                    Script.Get().EndWrite();
                });
        }
        Log += "still reading ";
    }
    EXPECT_EQ(Take(), "still reading free ");
}

TEST_F(HandlersTest, EndsThatDoNotMatchHarmNothing)
{
    Script.Watch({"A"});
    Store::VStore& rStore = Script.Get();
    TQL::IStoreWriter* const pWriter = rStore.BeginWrite();
    (void)rStore.BeginRead();
    EXPECT_TRUE(pWriter->SetValue(Script.Entry("A"), Store::MakeValue(std::int32_t{1})).IsSuccess());
    rStore.EndWrite();
    EXPECT_EQ(Script.State("A"), "1 - - 0") << "still inside the write, which sees what is staged";
    rStore.EndRead();
    rStore.EndRead();
    rStore.EndWrite();
    {
        const TQL::ScopedRead reader(rStore);
        rStore.EndWrite();
    }
    EXPECT_EQ(Guard.Take().size(), 3u) << "each end without a begin is logged";
    EXPECT_EQ(Script.State("A"), "1 - - 0");
    EXPECT_NE(Script.Write("A=2"), "") << "the gate is as it was";
}

TEST_F(HandlersTest, TheLastOwnerMayLetGoInsideACallable)
{
    auto pStore = TQL::MakeShared<Store::VStore>(Script.GetShared());
    EXPECT_EQ(pStore->GetOwner(), Script.GetShared());
    auto pHandler = pStore->GetHandlerCallback({{pStore->GetRoot()}, {}});
    Token token = 0;
    Store::VStore& rStore = *pStore;
    EXPECT_TRUE(pHandler
                    ->SubscribeDirect(token,
                                      [&](ChangeFlags, ChangeId)
                                      {
                                          pStore.reset();
                                          pHandler.reset();
                                          Log += "called";
                                      })
                    .IsSuccess());
    EXPECT_TRUE(rStore.BeginWrite()->SetCategory(rStore.GetRoot(), "c").IsSuccess());
    rStore.EndWrite();
    EXPECT_EQ(Take(), "called");
    pStore = TQL::MakeShared<Store::VStore>();
    pHandler = pStore->GetHandlerCallback({{pStore->GetRoot()}, {EntryPath("*")}});
    pStore.reset();
    pHandler.reset(); // its store is gone
}

TEST_F(HandlersTest, ComeAndGoWhileOthersCommit)
{
    std::atomic<bool> bDone = false;
    std::atomic<std::uint64_t> told = 0;
    const auto comeAndGo = [&](const HandlerKey& i_rKey)
    {
        while (!bDone)
        {
            const auto pHandler = Handler(i_rKey);
            Token token = 0;
            (void)pHandler->SubscribeDirect(token,
                                            [&, pKept = pHandler->GetProxy()](ChangeFlags, ChangeId) { ++told; });
            pHandler->RemoveSubscription(token);
        }
    };
    const HandlerKey key{{Script.Entry("A")}, {EntryPath("*/X")}};
    std::thread first(comeAndGo, key);
    std::thread second(comeAndGo, key);
    std::thread third(comeAndGo, HandlerKey{{}, {EntryPath("*/X")}});
    const auto pSteady = Handler({{Script.Entry("A")}, {}});
    std::uint64_t lastCommit = 0;
    Token token = 0;
    EXPECT_TRUE(
        pSteady->SubscribeDirect(token, [&](ChangeFlags, ChangeId i_Id) { lastCommit = i_Id.Value(); }).IsSuccess());
    for (int i = 0; i < 2000; ++i)
        Script.Write(i % 2 == 0 ? "A/X=1 A=1" : "remove A");
    bDone = true;
    first.join();
    second.join();
    third.join();
    EXPECT_EQ(lastCommit, 2000u);
    const auto pAfter = Noting("after", {"*/X"});
    Script.Write("A/X=5");
    EXPECT_EQ(Take(), "after(Verified Created) ") << "no handler that went is left attached";
}

} // namespace
