#include "Store/VTicketGate.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <string>
#include <unordered_set>
#include <vector>

namespace
{

using Store::TicketGateState;

enum class EPhase
{
    Outside,
    AwaitsTurn,
    Inside,       // reads or stages
    AwaitsReaders // sleeps on the condition that the last reader of the group signals
};

struct Thread
{
    std::string Script; // one letter an operation: R reads, W writes
    std::size_t Next = 0;
    EPhase Phase = EPhase::Outside;
    std::uint64_t Ticket = 0;

    bool IsDone() const { return Next == Script.size(); }
    bool Writes() const { return Script[Next] == 'W'; }
};

/// The gate, its threads and what the checks remember. Every step stands for one critical section of the real gate.
struct Model
{
    TicketGateState Gate;
    std::vector<Thread> Threads;
    std::vector<std::size_t> WritersByArrival;
    bool bReadersLeftSignalled = false;

    std::string Key() const
    {
        std::string key{char(Gate.Ticket), char(Gate.bWriterInTail), char(Gate.bCommitting),
                        char(bReadersLeftSignalled)};
        for (const TicketGateState::Group& rGroup : Gate.Groups)
            key += {char(rGroup.Ticket), char(rGroup.MemberCount)};
        key += '|';
        for (const Thread& rThread : Threads)
            key += {char(rThread.Next), char(rThread.Phase), char(rThread.Ticket)};
        for (const std::size_t writer : WritersByArrival)
            key += char(writer);
        return key;
    }
};

/// Walks through every order of steps, each state once, and collects the first rule that breaks.
class Explorer
{
public:
    explicit Explorer(const std::vector<std::string>& i_rScripts)
    {
        Model start;
        for (const std::string& rScript : i_rScripts)
            start.Threads.push_back({rScript});
        Visit(start);
    }
    std::string Fault;

private:
    void Visit(const Model& i_rModel)
    {
        if (!Fault.empty() || !m_Seen.insert(i_rModel.Key()).second)
            return;
        bool bAnyStep = false;
        for (std::size_t i = 0; i < i_rModel.Threads.size(); ++i)
        {
            if (!CanStep(i_rModel, i_rModel.Threads[i]))
                continue;
            bAnyStep = true;
            Model next = i_rModel;
            Step(next, i);
            Visit(next);
        }
        if (!bAnyStep)
            CheckEnd(i_rModel);
    }

    bool CanStep(const Model& i_rModel, const Thread& i_rThread)
    {
        if (i_rThread.IsDone())
            return false;
        if (i_rThread.Phase == EPhase::AwaitsTurn)
        {
            Require(i_rModel.Gate.Ticket <= i_rThread.Ticket, "a waiting ticket was overtaken");
            return i_rModel.Gate.Ticket == i_rThread.Ticket;
        }
        return i_rThread.Phase != EPhase::AwaitsReaders || i_rModel.bReadersLeftSignalled;
    }

    void Step(Model& io_rModel, std::size_t i_Index)
    {
        Thread& rThread = io_rModel.Threads[i_Index];
        TicketGateState& rGate = io_rModel.Gate;
        switch (rThread.Phase)
        {
        case EPhase::Outside:
            rThread.Ticket = rThread.Writes() ? rGate.JoinAsWriter() : rGate.JoinAsReader();
            if (rThread.Writes())
                io_rModel.WritersByArrival.push_back(i_Index);
            rThread.Phase = rGate.Ticket == rThread.Ticket ? EPhase::Inside : EPhase::AwaitsTurn;
            break;
        case EPhase::AwaitsTurn:
            rThread.Phase = EPhase::Inside;
            break;
        case EPhase::Inside:
            if (!rThread.Writes())
            {
                io_rModel.bReadersLeftSignalled |= rGate.LeaveAsReader();
                Leave(rThread);
                break;
            }
            rGate.StartCommit();
            rThread.Phase = EPhase::AwaitsReaders;
            if (rGate.MayCommit())
                Commit(io_rModel, i_Index);
            break;
        case EPhase::AwaitsReaders:
            Require(rGate.MayCommit(), "the committing writer was woken before the readers had left");
            Commit(io_rModel, i_Index);
            break;
        }
        const auto stages = [](const Thread& i_rOther)
        {
            return !i_rOther.IsDone() && i_rOther.Writes() && i_rOther.Phase >= EPhase::Inside;
        };
        Require(std::count_if(io_rModel.Threads.begin(), io_rModel.Threads.end(), stages) <= 1, "two writers stage");
    }

    void Commit(Model& io_rModel, std::size_t i_Index)
    {
        for (const Thread& rOther : io_rModel.Threads)
            Require(rOther.IsDone() || rOther.Writes() || rOther.Phase != EPhase::Inside,
                    "a reader is inside during a commit");
        Require(io_rModel.WritersByArrival.front() == i_Index, "writers commit in another order than they came in");
        io_rModel.WritersByArrival.erase(io_rModel.WritersByArrival.begin());
        Require(io_rModel.Gate.TakeCommit() == io_rModel.Threads[i_Index].Ticket, "a commit has another number");
        io_rModel.bReadersLeftSignalled = false;
        Leave(io_rModel.Threads[i_Index]);
    }

    void CheckEnd(const Model& i_rModel)
    {
        std::uint64_t writes = 0;
        for (const Thread& rThread : i_rModel.Threads)
        {
            Require(rThread.IsDone(), "deadlock");
            writes += static_cast<std::uint64_t>(std::count(rThread.Script.begin(), rThread.Script.end(), 'W'));
        }
        Require(i_rModel.Gate.Ticket == writes + 1, "a ticket was lost");
        Require(i_rModel.Gate.Groups.empty() && !i_rModel.Gate.bWriterInTail && !i_rModel.Gate.bCommitting,
                "something is left in an empty gate");
    }

    static void Leave(Thread& io_rThread)
    {
        io_rThread.Phase = EPhase::Outside;
        io_rThread.Ticket = 0;
        ++io_rThread.Next;
    }
    void Require(bool i_bHolds, const char* i_pRule)
    {
        if (!i_bHolds && Fault.empty())
            Fault = i_pRule;
    }

    std::unordered_set<std::string> m_Seen;
};

/// Every choice of i_Count scripts where order does not matter.
void ForEachChoice(std::size_t i_Count, std::size_t i_First, std::vector<std::string>& io_rChosen,
                   const std::function<void(const std::vector<std::string>&)>& i_rUse)
{
    static const std::string s_Scripts[] = {"RR", "RW", "WR", "WW"};
    if (io_rChosen.size() == i_Count)
        return i_rUse(io_rChosen);
    for (std::size_t i = i_First; i < std::size(s_Scripts); ++i)
    {
        io_rChosen.push_back(s_Scripts[i]);
        ForEachChoice(i_Count, i, io_rChosen, i_rUse);
        io_rChosen.pop_back();
    }
}

TEST(TicketGateModel, NoOrderOfStepsBreaksARule)
{
    for (const std::size_t threadCount : {1, 2, 3, 4})
    {
        std::vector<std::string> chosen;
        ForEachChoice(threadCount, 0, chosen,
                      [](const std::vector<std::string>& i_rScripts)
                      {
                          std::string names;
                          for (const std::string& rScript : i_rScripts)
                              names += rScript + " ";
                          EXPECT_EQ(Explorer(i_rScripts).Fault, "") << names;
                      });
    }
}

} // namespace
