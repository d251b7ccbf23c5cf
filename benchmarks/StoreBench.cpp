#include "Bench.h"
#include "Store/VStore.h"
#include "StoreInterface/IHandlerCallback.h"
#include "StoreInterface/ScopedAccess.h"
#include "StoreInterface/TypedAccess.h"
#include "UtilsFileSystem/ProtectedFileIO.h"

#include <boost/signals2/signal.hpp>

#include <algorithm>
#include <any>
#include <atomic>
#include <chrono>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <functional>
#include <malloc.h>
#include <map>
#include <memory>
#include <mutex>
#include <shared_mutex>
#include <string>
#include <string_view>
#include <thread>
#include <unistd.h>
#include <unordered_map>
#include <utility>
#include <vector>

namespace Bench
{
namespace
{

using Store::EntryHandle;
using Store::EntryPath;

constexpr int s_Entries = 1000;
constexpr int s_ManyEntries = 100'000;

std::shared_ptr<TQL::IStore> MakeStore()
{
    return TQL::MakeShared<Store::VStore>();
}

std::string Name(int i_Index)
{
    return "Graph/Review/Settings/Value" + std::to_string(i_Index);
}

/// A store with numbers, and the plain map that would do instead.
struct Numbers
{
    Numbers()
    {
        const TQL::ScopedWrite write(*pStore);
        for (int i = 0; i < s_Entries; ++i)
        {
            Names.push_back(Name(i));
            Entries.push_back(pStore->GetEntry(EntryPath(Names.back())));
            if (write->SetValue(Entries.back(), Store::MakeValue(std::int32_t{i})).IsError())
                std::abort();
            Map[Names.back()] = std::int32_t{i};
        }
    }

    std::shared_ptr<TQL::IStore> pStore = MakeStore();
    std::vector<std::string> Names;
    std::vector<EntryHandle> Entries;
    std::unordered_map<std::string, std::any> Map;
    std::shared_mutex MapMutex;
};

double Nanoseconds(double i_Seconds, int i_Count)
{
    return i_Seconds * 1e9 / i_Count;
}

void AddTypedRead(Table& o_rTable)
{
    Numbers numbers;
    std::int64_t sum = 0;
    const auto ours = [&]
    {
        const TQL::ScopedRead read(*numbers.pStore);
        for (const EntryHandle entry : numbers.Entries)
        {
            std::int32_t value = 0;
            if (TQL::GetValue(*read, entry, value))
                Keep(sum += value);
        }
    };
    const auto theirs = [&]
    {
        for (const std::string& rName : numbers.Names)
        {
            const std::shared_lock lock(numbers.MapMutex);
            Keep(sum += std::any_cast<std::int32_t>(numbers.Map.find(rName)->second));
        }
    };
    const auto [store, map] = BestSecondsPaired(500, ours, theirs);
    o_rTable.push_back({"typed read of an Int32 by handle inside a read: map / store", Nanoseconds(store, s_Entries),
                        "ns", "unordered_map<string, any> look-up under a shared_mutex", Nanoseconds(map, s_Entries),
                        map / store, EGoal::AtLeast, 5.0});
}

void AddWrites(Table& o_rTable)
{
    Numbers numbers;
    std::int32_t next = 0;
    const auto setInStore = [&]
    {
        for (const EntryHandle entry : numbers.Entries)
            if (TQL::ScopedWrite(*numbers.pStore)->SetValue(entry, Store::MakeValue(++next)).IsError())
                std::abort();
    };
    boost::signals2::signal<void()> changed;
    const auto setInMap = [&](bool i_bTell)
    {
        for (const std::string& rName : numbers.Names)
        {
            {
                const std::unique_lock lock(numbers.MapMutex);
                numbers.Map.find(rName)->second = ++next;
            }
            if (i_bTell)
                changed();
        }
    };
    const auto [store, map] = BestSecondsPaired(100, setInStore, [&] { setInMap(false); });
    o_rTable.push_back({"write of one entry without handlers: store / map", Nanoseconds(store, s_Entries), "ns",
                        "the map's entry set under a unique lock", Nanoseconds(map, s_Entries), store / map,
                        EGoal::AtMost, 10.0});

    std::uint64_t calls = 0;
    const auto pHandler = numbers.pStore->GetHandlerCallback({{numbers.pStore->GetRoot()}, {}});
    for (int i = 0; i < 10; ++i)
    {
        TQL::IHandlerCallback::Token token = 0;
        if (pHandler->SubscribeDirect(token, [&](TQL::ChangeFlags, TQL::ChangeId) { Keep(++calls); }).IsError())
            std::abort();
        changed.connect([&] { Keep(++calls); });
    }
    const auto [told, signalled] = BestSecondsPaired(100, setInStore, [&] { setInMap(true); });
    o_rTable.push_back({"write of one entry that tells 10 direct subscribers: store / map",
                        Nanoseconds(told, s_Entries), "ns", "the same map and ten slots of boost::signals2",
                        Nanoseconds(signalled, s_Entries), told / signalled, EGoal::Report, 0.0});
}

std::size_t HeapBytes()
{
    const struct mallinfo2 info = mallinfo2();
    return info.uordblks + info.hblkhd;
}

std::shared_ptr<TQL::IStore> CommitAll(const std::vector<std::string>& i_rNames)
{
    auto pStore = MakeStore();
    const TQL::ScopedWrite write(*pStore);
    for (const std::string& rName : i_rNames)
        if (write->SetValue(pStore->GetEntry(EntryPath(rName)), Store::MakeValue(std::int32_t{1})).IsError())
            std::abort();
    return pStore;
}

void AddBigCommit(Table& o_rTable, const std::string& i_rShape, const std::function<std::string(int)>& i_rName)
{
    std::vector<std::string> names;
    for (int i = 0; i < s_ManyEntries; ++i)
        names.push_back(i_rName(i));
    // What is made is kept until after the clock has stopped: freeing it is not part of the figure.
    std::shared_ptr<TQL::IStore> pStore;
    std::map<std::string, std::string> map;
    double ours = 1e300;
    double theirs = 1e300;
    for (int i = 0; i < 5; ++i)
    {
        pStore.reset();
        ours = std::min(ours, BestSeconds(1, [&] { pStore = CommitAll(names); }));
        map.clear();
        theirs = std::min(theirs, BestSeconds(1,
                                              [&]
                                              {
                                                  for (const std::string& rName : names)
                                                      map.emplace(rName, "1");
                                              }));
    }
    o_rTable.push_back({"commit of 100,000 new entries, " + i_rShape + ": store / map", ours * 1e3, "ms",
                        "inserting them in a map<string, string>", theirs * 1e3, ours / theirs, EGoal::AtMost, 5.0});

    pStore.reset();
    const std::size_t before = HeapBytes();
    pStore = CommitAll(names);
    const double bytes = static_cast<double>(HeapBytes() - before) / s_ManyEntries;
    map.clear();
    const std::size_t beforeMap = HeapBytes();
    for (const std::string& rName : names)
        map.emplace(rName, "1");
    const double mapBytes = static_cast<double>(HeapBytes() - beforeMap) / s_ManyEntries;
    o_rTable.push_back({"heap bytes for one Int32 entry, " + i_rShape, bytes, "bytes", "one entry of the map", mapBytes,
                        bytes, EGoal::AtMost, 600.0});
}

struct Rates
{
    double Accesses = 0.0; ///< a second, of both readers together
    double Commits = 0.0;  ///< a second
};

/// Two readers, each access a read of two entries that the writer keeps equal. The writer commits as often as it is
/// told to (0: never).
Rates MeasureReaders(Numbers& io_rNumbers, int i_CommitsPerSecond)
{
    using Clock = std::chrono::steady_clock;
    constexpr auto s_Duration = std::chrono::milliseconds(1000);
    std::atomic<bool> bStop = false;
    std::atomic<std::uint64_t> accesses = 0;
    const auto read = [&]
    {
        std::uint64_t count = 0;
        while (!bStop.load(std::memory_order_relaxed))
        {
            const TQL::ScopedRead access(*io_rNumbers.pStore);
            std::int32_t first = 0;
            std::int32_t second = 0;
            if (!TQL::GetValue(*access, io_rNumbers.Entries[0], first) ||
                !TQL::GetValue(*access, io_rNumbers.Entries[1], second) || first != second)
                std::abort();
            ++count;
        }
        accesses += count;
    };
    std::thread readers[] = {std::thread(read), std::thread(read)};
    const auto start = Clock::now();
    auto next = start;
    std::int32_t commits = 0;
    while (Clock::now() < start + s_Duration)
    {
        next += i_CommitsPerSecond ? std::chrono::nanoseconds(1'000'000'000 / i_CommitsPerSecond) : s_Duration;
        std::this_thread::sleep_until(next);
        if (!i_CommitsPerSecond)
            continue;
        ++commits;
        const TQL::ScopedWrite write(*io_rNumbers.pStore);
        for (const EntryHandle entry : {io_rNumbers.Entries[0], io_rNumbers.Entries[1]})
            if (write->SetValue(entry, Store::MakeValue(commits)).IsError())
                std::abort();
    }
    bStop = true;
    for (std::thread& rReader : readers)
        rReader.join();
    const double seconds = std::chrono::duration<double>(Clock::now() - start).count();
    return {static_cast<double>(accesses) / seconds, static_cast<double>(commits) / seconds};
}

void AddReadersBesideWriter(Table& o_rTable)
{
    Numbers numbers;
    {
        const TQL::ScopedWrite write(*numbers.pStore);
        if (write->SetValue(numbers.Entries[1], Store::MakeValue(std::int32_t{0})).IsError())
            std::abort();
    }
    Rates alone;
    Rates beside;
    for (int i = 0; i < 3; ++i)
    {
        const auto keepBetter = [](Rates& io_rBest, const Rates& i_rNew)
        {
            io_rBest = i_rNew.Accesses > io_rBest.Accesses ? i_rNew : io_rBest;
        };
        keepBetter(alone, MeasureReaders(numbers, 0));
        keepBetter(beside, MeasureReaders(numbers, 1000));
    }
    const std::string commits = std::to_string(std::lround(beside.Commits));
    o_rTable.push_back({"reads on 2 threads beside " + commits + " commits a second: with / without",
                        beside.Accesses * 1e-6, "million/s", "the same without a writer", alone.Accesses * 1e-6,
                        beside.Accesses / alone.Accesses, EGoal::AtLeast, 0.5});
}

/// Both keys own their text, so the fair pairs are: both keys made from a text, and both keys at hand.
void AddFindByPath(Table& o_rTable)
{
    Numbers numbers;
    const std::vector<std::string_view> texts(numbers.Names.begin(), numbers.Names.end());
    const std::vector<EntryPath> paths(texts.begin(), texts.end());
    const auto storeByText = [&]
    {
        for (const std::string_view text : texts)
            Keep(numbers.pStore->GetEntry(EntryPath(text)));
    };
    const auto mapByText = [&]
    {
        for (const std::string_view text : texts)
            Keep(numbers.Map.find(std::string(text)));
    };
    const auto storeByPath = [&]
    {
        for (const EntryPath& rPath : paths)
            Keep(numbers.pStore->GetEntry(rPath));
    };
    const auto mapByKey = [&]
    {
        for (const std::string& rName : numbers.Names)
            Keep(numbers.Map.find(rName));
    };
    const auto add = [&](const char* i_pName, const char* i_pYardstick, auto i_Store, auto i_Map, EGoal i_Goal)
    {
        const auto [store, map] = BestSecondsPaired(500, i_Store, i_Map);
        o_rTable.push_back({i_pName, Nanoseconds(store, s_Entries), "ns", i_pYardstick, Nanoseconds(map, s_Entries),
                            store / map, i_Goal, 2.0});
    };
    add("path made from a text, hash and find: store / map", "unordered_map find, string made from the text",
        storeByText, mapByText, EGoal::AtMost);
    add("find by a path at hand: store / map", "unordered_map find, string at hand", storeByPath, mapByKey,
        EGoal::AtMost);
    add("path made from a text, hash and find: store / map, key at hand", "unordered_map find, string at hand",
        storeByText, mapByKey, EGoal::Report);
}

bool WritePlainly(const std::string& i_rPath, const std::string& i_rBytes, bool i_bSync)
{
    const int file = open(i_rPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0666);
    if (file < 0)
        return false;
    const bool bWritten = write(file, i_rBytes.data(), i_rBytes.size()) == static_cast<ssize_t>(i_rBytes.size()) &&
                          (!i_bSync || fsync(file) == 0);
    return close(file) == 0 && bWritten;
}

void SavePlainly(const std::string& i_rPath, const std::string& i_rBytes)
{
    const std::string side = i_rPath + ".side";
    const int folder = open(std::filesystem::path(i_rPath).parent_path().c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (!WritePlainly(side, i_rBytes, true) || std::rename(side.c_str(), i_rPath.c_str()) != 0 || fsync(folder) != 0)
        std::abort();
    close(folder);
}

/// Seconds of the median run of each, run in turn. The time of an fsync depends on the disk far more than on what is
/// asked of it; the fastest run would tell about luck.
std::pair<double, double> MedianSecondsPaired(int i_Repeats, const std::function<void()>& i_rFirst,
                                              const std::function<void()>& i_rSecond)
{
    std::vector<double> first;
    std::vector<double> second;
    for (int i = 0; i < i_Repeats; ++i)
    {
        first.push_back(BestSeconds(1, i_rFirst));
        second.push_back(BestSeconds(1, i_rSecond));
    }
    const auto median = [](std::vector<double>& io_rTimes)
    {
        const auto middle = io_rTimes.begin() + static_cast<std::ptrdiff_t>(io_rTimes.size() / 2);
        std::ranges::nth_element(io_rTimes, middle);
        return *middle;
    };
    return {median(first), median(second)};
}

void AddProtectedSave(Table& o_rTable)
{
    const std::string pattern = (std::filesystem::temp_directory_path() / "graphplots-bench-XXXXXX").string();
    std::vector<char> folder(pattern.c_str(), pattern.c_str() + pattern.size() + 1);
    if (!mkdtemp(folder.data()))
        std::abort();
    const std::string path = std::string(folder.data()) + "/settings.json";
    const std::string other = std::string(folder.data()) + "/plain.json";
    const std::string bytes(1'000'000, 'x');
    const auto ours = [&]
    {
        const auto writeAll = [&](const std::string& i_rPath)
        {
            return WritePlainly(i_rPath, bytes, false) ? TQL::Result::Ok : TQL::Result::FileIOFailure;
        };
        if (UtilsFileSystem::ProtectedSave(writeAll, path, UtilsFileSystem::EWriteMode::Overwrite).IsError())
            std::abort();
    };
    const auto [saved, plain] = MedianSecondsPaired(151, ours, [&] { SavePlainly(other, bytes); });
    o_rTable.push_back({"protected save of 1 MB: ours / plain", saved * 1e3, "ms",
                        "write, fsync of file and folder, rename", plain * 1e3, saved / plain, EGoal::AtMost, 1.3});
    std::filesystem::remove_all(folder.data());
}

} // namespace

void RunStore(Table& o_rTable)
{
    AddTypedRead(o_rTable);
    AddWrites(o_rTable);
    AddBigCommit(o_rTable, "100 children each",
                 [](int i_Index) { return "Tree/" + std::to_string(i_Index / 100) + "/" + std::to_string(i_Index); });
    AddBigCommit(o_rTable, "children of one entry", [](int i_Index) { return "List/" + std::to_string(i_Index); });
    AddReadersBesideWriter(o_rTable);
    AddFindByPath(o_rTable);
    AddProtectedSave(o_rTable);
}

} // namespace Bench
