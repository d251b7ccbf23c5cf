#include "Bench.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <boost/signals2/signal.hpp>

#include <atomic>
#include <deque>

namespace Bench
{
namespace
{

constexpr int s_Calls = 200'000;

/// Queues jobs and drops them: what posting costs, not what the jobs do.
class CountingPostalService : public TQL::IPostalService
{
public:
    void Post(Job i_Job, std::uint64_t = 0) override { m_Jobs.push_back(std::move(i_Job)); }
    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override { o_rTraits = {}; }
    void RunAll()
    {
        while (!m_Jobs.empty())
        {
            const Job job = std::move(m_Jobs.front());
            m_Jobs.pop_front();
            job();
        }
    }

private:
    std::deque<Job> m_Jobs;
};

template <typename TFunction>
void Repeat(const TFunction& i_rFunction)
{
    for (int i = 0; i < s_Calls; ++i)
        i_rFunction();
}

double Nanoseconds(double i_Seconds)
{
    return i_Seconds * 1e9 / s_Calls;
}

void AddWithoutSubscribers(Table& o_rTable)
{
    NotificationSystem::VChangeSignal signal;
    const std::atomic<std::uint64_t> word{1};
    std::uint64_t sum = 0;
    const auto [ours, load] = BestSecondsPaired(
        30, [&] { Repeat([&] { Keep(sum += signal.Invoke() ? 1 : 0); }); },
        [&] { Repeat([&] { Keep(sum += word.load(std::memory_order_acquire)); }); });
    o_rTable.push_back({"Invoke without subscribers / atomic load", Nanoseconds(ours), "ns", "an atomic load",
                        Nanoseconds(load), ours / load, EGoal::AtMost, 2.0});
}

void AddTenDirect(Table& o_rTable)
{
    NotificationSystem::VChangeSignal signal;
    boost::signals2::signal<void()> other;
    std::uint64_t count = 0;
    for (int i = 0; i < 10; ++i)
    {
        signal.AddDirect([&count] { Keep(++count); });
        other.connect([&count] { Keep(++count); });
    }
    const auto [ours, theirs] = BestSecondsPaired(
        10, [&] { Repeat([&] { signal.Invoke(); }); }, [&] { Repeat([&] { other(); }); });
    o_rTable.push_back({"Invoke with ten direct subscribers / boost::signals2", Nanoseconds(ours), "ns",
                        "boost::signals2 with ten slots", Nanoseconds(theirs), ours / theirs, EGoal::AtMost, 1.0});
}

void AddPostedThroughCollapser(Table& o_rTable)
{
    const auto pService = std::make_shared<CountingPostalService>();
    const auto pCollapser = NotificationSystem::MakeCollapserDontPost(pService);
    NotificationSystem::VChangeSignal signal;
    boost::signals2::signal<void()> other;
    std::uint64_t count = 0;
    signal.Add([&count] { Keep(++count); }, pCollapser);
    for (int i = 0; i < 10; ++i)
        other.connect([&count] { Keep(++count); });
    const auto burst = [&]
    {
        Repeat([&] { signal.Invoke(); });
        pService->RunAll();
    };
    const auto [ours, theirs] = BestSecondsPaired(10, burst, [&] { Repeat([&] { other(); }); });
    o_rTable.push_back({"Invoke posted through a collapser / boost::signals2", Nanoseconds(ours), "ns",
                        "boost::signals2 with ten slots", Nanoseconds(theirs), ours / theirs, EGoal::Report, 0.0});
}

} // namespace

void RunNotification(Table& o_rTable)
{
    AddWithoutSubscribers(o_rTable);
    AddTenDirect(o_rTable);
    AddPostedThroughCollapser(o_rTable);
}

} // namespace Bench
