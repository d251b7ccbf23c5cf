#include "Store/VStore.h"
#include "Store/VThreadSlots.h"
#include "Store/VTicketGate.h"
#include "StoreInterface/ScopedAccess.h"
#include "StoreInterface/TypedValue.h"

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

/// Two entries whose sum every commit keeps, and one that holds the number of the commit that wrote it.
struct Account
{
    std::shared_ptr<VStore> pStore = TQL::MakeShared<VStore>();
    EntryHandle First = pStore->GetEntry(EntryPath("Account/First"));
    EntryHandle Second = pStore->GetEntry(EntryPath("Account/Second"));
    EntryHandle Commit = pStore->GetEntry(EntryPath("Account/Commit"));

    static std::int64_t Number(const TQL::IStoreReader& i_rReader, EntryHandle i_Entry)
    {
        std::int64_t number = 0;
        (void)DecodeValue(i_rReader.GetVerifiedValue(i_Entry), number);
        return number;
    }
    bool IsWhole(const TQL::IStoreReader& i_rReader, std::uint64_t i_Commit) const
    {
        return Number(i_rReader, First) + Number(i_rReader, Second) == 0 &&
               Number(i_rReader, Commit) == static_cast<std::int64_t>(i_Commit);
    }
    bool Write(TQL::IStoreWriter& io_rWriter, std::int64_t i_Amount) const
    {
        const auto commit = static_cast<std::int64_t>(io_rWriter.GetChangeId().Value());
        return io_rWriter.SetValue(First, MakeValue(i_Amount)).IsSuccess() &&
               io_rWriter.SetValue(Second, MakeValue(-i_Amount)).IsSuccess() &&
               io_rWriter.SetValue(Commit, MakeValue(commit)).IsSuccess();
    }
};

TEST(TicketGate, EightThreadsNeverSeeHalfACommit)
{
    constexpr unsigned s_Threads = 8;
    constexpr int s_Rounds = 10000;
    const Account account;
    std::atomic<int> faults = 0;
    std::atomic<std::uint64_t> commits = 0;
    const auto expect = [&](bool i_bTrue)
    {
        faults += i_bTrue ? 0 : 1;
    };
    const auto work = [&](unsigned i_Seed)
    {
        for (int round = 0; round < s_Rounds; ++round)
        {
            i_Seed = i_Seed * 1664525u + 1013904223u;
            if ((i_Seed >> 16) % 3 != 0)
            {
                const TQL::ScopedRead outer(*account.pStore);
                const std::uint64_t commit = outer->GetChangeId().Value();
                expect(account.IsWhole(*outer, commit));
                std::this_thread::yield();
                const TQL::ScopedRead inner(*account.pStore);
                expect(account.IsWhole(*inner, commit) && inner->GetChangeId().Value() == commit);
                continue;
            }
            const TQL::ScopedWrite writer(*account.pStore);
            expect(account.IsWhole(*writer, writer->GetChangeId().Value() - 1));
            expect(account.Write(*writer, i_Seed >> 24));
            ++commits;
        }
    };
    std::vector<std::thread> threads;
    for (unsigned i = 0; i < s_Threads; ++i)
        threads.emplace_back(work, i + 1);
    for (std::thread& rThread : threads)
        rThread.join();
    EXPECT_EQ(faults, 0);
    const TQL::ScopedRead reader(*account.pStore);
    EXPECT_TRUE(account.IsWhole(*reader, commits));
}

TEST(ThreadSlots, ANewStoreNeverFindsWhatAnEarlierOneLeft)
{
    auto pFirst = std::make_unique<VThreadSlots>();
    const VThreadSlots second;
    ThreadSlot& rOther = second.OfThisThread();
    rOther.bCalling = true;
    pFirst->OfThisThread().Hold.Depth = 3;
    pFirst->OfThisThread().Deferred.emplace_back([] {});
    std::thread([&] { EXPECT_EQ(pFirst->OfThisThread().Hold.Depth, 0u); }).join();

    pFirst.reset();
    const VThreadSlots third;
    EXPECT_EQ(third.OfThisThread().Hold.Depth, 0u);
    EXPECT_TRUE(third.OfThisThread().Deferred.empty());
    EXPECT_EQ(&second.OfThisThread(), &rOther);
    EXPECT_TRUE(rOther.bCalling);
}

} // namespace
