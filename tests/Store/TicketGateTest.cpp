#include "Store/VThreadSlots.h"
#include "Store/VTicketGate.h"

#include <gtest/gtest.h>

#include <atomic>
#include <memory>
#include <thread>
#include <vector>

namespace
{

using namespace Store;

TEST(TicketGate, NestingStaysWithTheThread)
{
    std::mutex mutex;
    VTicketGate gate(mutex);
    GateHold hold;
    std::uint64_t committed = 0;
    const auto commit = [&](std::uint64_t i_ChangeId)
    {
        committed = i_ChangeId;
    };

    gate.BeginRead(hold);
    EXPECT_FALSE(gate.BeginWrite(hold)) << "there is no upgrade";
    gate.BeginRead(hold);
    EXPECT_FALSE(gate.EndRead(hold));
    EXPECT_TRUE(gate.EndRead(hold));

    ASSERT_TRUE(gate.BeginWrite(hold));
    EXPECT_EQ(hold.ChangeId, 1u);
    gate.BeginRead(hold);
    ASSERT_TRUE(gate.BeginWrite(hold));
    EXPECT_EQ(hold.Mode, EGateMode::Write);
    EXPECT_FALSE(gate.EndWrite(hold, commit));
    EXPECT_FALSE(gate.EndRead(hold));
    EXPECT_EQ(committed, 0u);
    EXPECT_TRUE(gate.EndWrite(hold, commit));
    EXPECT_EQ(committed, 1u);

    gate.BeginRead(hold);
    EXPECT_EQ(hold.ChangeId, 1u);
    EXPECT_TRUE(gate.EndRead(hold));
}

TEST(TicketGate, ReadersGoOnBesideAStagingWriterAndACommitWaitsForThem)
{
    std::mutex mutex;
    VTicketGate gate(mutex);
    GateHold early;
    gate.BeginRead(early);
    std::atomic<bool> bStaging = false;
    std::atomic<bool> bCommitted = false;
    std::thread writer(
        [&]
        {
            GateHold hold;
            ASSERT_TRUE(gate.BeginWrite(hold));
            bStaging = true;
            bStaging.notify_all();
            gate.EndWrite(hold, [&](std::uint64_t) { bCommitted = true; });
        });
    bStaging.wait(false);
    EXPECT_FALSE(bCommitted);
    gate.EndRead(early);
    writer.join();
    EXPECT_TRUE(bCommitted);
}

/// Plain numbers that only a commit changes: their sum never does, and Generation is the last commit's change id.
struct Account
{
    std::int64_t First = 500;
    std::int64_t Second = 500;
    std::uint64_t Generation = 0;

    bool IsWhole(std::uint64_t i_ChangeId) const { return First + Second == 1000 && Generation == i_ChangeId; }
};

TEST(TicketGate, EightThreadsNeverSeeHalfACommit)
{
    constexpr int s_Threads = 8;
    constexpr int s_Rounds = 4000;
    std::mutex mutex;
    VTicketGate gate(mutex);
    Account account;
    std::int64_t staged = 0; // only the thread that stages touches it
    std::atomic<int> faults = 0;
    std::atomic<std::uint64_t> commits = 0;
    const auto work = [&](unsigned i_Seed)
    {
        GateHold hold;
        for (int round = 0; round < s_Rounds; ++round)
        {
            i_Seed = i_Seed * 1664525u + 1013904223u;
            if ((i_Seed >> 16) % 3 != 0)
            {
                gate.BeginRead(hold);
                faults += account.IsWhole(hold.ChangeId) ? 0 : 1;
                gate.BeginRead(hold);
                std::this_thread::yield();
                faults += gate.EndRead(hold) ? 1 : 0;
                faults += account.IsWhole(hold.ChangeId) ? 0 : 1;
                gate.EndRead(hold);
                continue;
            }
            faults += gate.BeginWrite(hold) ? 0 : 1;
            faults += account.IsWhole(hold.ChangeId - 1) ? 0 : 1;
            staged = static_cast<std::int64_t>(i_Seed >> 24);
            gate.EndWrite(hold,
                          [&](std::uint64_t i_ChangeId)
                          {
                              account.First -= staged;
                              std::this_thread::yield();
                              account.Second += staged;
                              account.Generation = i_ChangeId;
                          });
            ++commits;
        }
    };
    std::vector<std::thread> threads;
    for (unsigned i = 0; i < s_Threads; ++i)
        threads.emplace_back(work, i + 1);
    for (std::thread& rThread : threads)
        rThread.join();
    EXPECT_EQ(faults, 0);
    EXPECT_EQ(account.Generation, commits);
    EXPECT_TRUE(account.IsWhole(commits));
}

TEST(ThreadSlots, ANewStoreNeverFindsWhatAnEarlierOneLeft)
{
    auto pFirst = std::make_unique<VThreadSlots>();
    const VThreadSlots second;
    ThreadSlot& rOther = second.OfThisThread();
    rOther.DirectNesting = 7;
    pFirst->OfThisThread().Hold.Depth = 3;
    pFirst->OfThisThread().Deferred.emplace_back([] {});
    std::thread([&] { EXPECT_EQ(pFirst->OfThisThread().Hold.Depth, 0u); }).join();

    pFirst.reset();
    const VThreadSlots third;
    EXPECT_EQ(third.OfThisThread().Hold.Depth, 0u);
    EXPECT_TRUE(third.OfThisThread().Deferred.empty());
    EXPECT_EQ(&second.OfThisThread(), &rOther);
    EXPECT_EQ(rOther.DirectNesting, 7u);
}

} // namespace
