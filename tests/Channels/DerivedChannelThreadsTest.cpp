#include "Channels/Contexts/VLiveContext.h"
#include "Channels/VChannelService.h"
#include "Reference.h"

#include <array>
#include <atomic>
#include <thread>

namespace ChannelsTest
{

namespace
{

using Channels::VLiveContext;
using TQL::TickRange;

constexpr std::int64_t Period = TQL::DefaultFramePeriod;

ChannelSystem::VDerivedChannelParameters Algebra(const std::string& i_rExpression)
{
    ChannelSystem::VDerivedChannelParameters record;
    record.Hash = std::hash<std::string>()(i_rExpression);
    record.OperationParameters.emplace_back("Expression", i_rExpression);
    return record;
}

/// Reads what the channel has; the number of rows that are wrong. Row n holds n / 10, or its derivative 120.
std::size_t CheckOnce(TQL::IChannel& i_rChannel, bool i_bDerivative)
{
    const auto pOutput = i_rChannel.GetOutput();
    const auto pBlock = pOutput ? pOutput->GetBlock() : nullptr;
    if (!pBlock)
        return 0;
    TickRange range;
    pBlock->GetRange(range);
    std::vector<float> rows(static_cast<std::size_t>((range.Last - range.First) / Period));
    if (pBlock->ReadSamples(range, rows).IsError() || pOutput->IsStale()) // trimmed or started anew meanwhile
        return 0;
    std::size_t wrong = 0;
    for (std::size_t i = 0; i < rows.size(); ++i)
    {
        const double row = static_cast<double>(range.First / Period) + static_cast<double>(i);
        const double expected = i_bDerivative ? 120.0 : 0.1 * row;
        wrong += std::abs(rows[i] - expected) > 0.5;
    }
    LodRecord record;
    if (pBlock->Summarise(range, std::span(&record, 1)).IsSuccess() && record.Count != 0)
        wrong += i_bDerivative && std::abs(record.Maximum - 120.0f) > 0.5f;
    return wrong;
}

} // namespace

TEST(DerivedChannelThreads, ReadersAskersAndRestartsMeetAppends)
{
    Channels::VChannelService service;
    VLiveContext::Options options;
    options.HistoryTicks = 2000 * Period;
    const auto pLive = std::make_shared<VLiveContext>("Live", service.GetSubTypes(), options);
    service.AddContext(pLive);
    std::uint32_t lane = 0;
    ASSERT_TRUE(pLive->AddChannel({"ModelSetSamplesOutput", 0, 0, "x", "x", "mm", {""}}, 0, lane).IsSuccess());
    const auto pSource = service.GetChannel({"Live", "ModelSetSamplesOutput", 0, 0, "x"});
    const auto makeScaled = [&]
    {
        return service.CreateDerivedChannel("AlgebraicExpression", Algebra("centimeter(#0)"), {pSource});
    };
    const auto pScaled = makeScaled();
    const auto pSpeed = service.CreateDerivedChannel("Derivative", {}, {pSource});
    const auto makeCache = [&](const std::shared_ptr<TQL::IChannel>& i_rpInput)
    {
        auto pCache = service.CreateDerivedChannel("Cache", {}, {i_rpInput});
        EXPECT_TRUE(pCache->GetParameters()->SetParameter("SupportLodding", true).IsSuccess());
        EXPECT_TRUE(pCache->GetParameters()->SetParameter("CacheRangeTicks", 300 * Period).IsSuccess());
        return pCache;
    };
    std::atomic<bool> bDone{false};
    std::atomic<std::size_t> wrong{0};
    std::atomic<std::size_t> notices{0};
    std::atomic<std::size_t> turns{0};
    const auto pSubscription =
        pSpeed->GetParameters()->GetChangeNotifier()->AddOutputChangedCallback([&] { ++notices; }, nullptr);
    std::vector<std::thread> threads;
    for (const auto& [pChannel, bDerivative] :
         {std::pair(makeCache(pScaled), false), std::pair(makeCache(pSpeed), true), std::pair(pSpeed, true),
          std::pair(pScaled, false), std::pair(makeCache(pSpeed), true)})
        threads.emplace_back(
            [&, pRead = pChannel, bRate = bDerivative]
            {
                for (; !bDone; ++turns)
                    wrong += CheckOnce(*pRead, bRate);
            });
    threads.emplace_back(
        [&] // asks, reads texts and lets go, as the windows do
        {
            for (; !bDone; ++turns)
            {
                wrong += makeScaled() != pScaled;
                const auto pOther =
                    service.CreateDerivedChannel("AlgebraicExpression", Algebra("meter(#0)"), {pScaled});
                (void)pOther->GetOutput();
                (void)pOther->GetRevision();
                std::vector<std::string> errors;
                pOther->GetParameters()->GetErrors(errors);
                (void)service.GetChannel(pOther->GetInstanceId());
            }
        });
    for (std::int64_t frame = 0; frame < 20000 || turns < 3000; frame += 4)
    {
        if (frame % 8000 == 7996)
            pLive->Restart(frame);
        std::array<float, 4> values{};
        for (std::size_t i = 0; i < values.size(); ++i)
            values[i] = static_cast<float>(frame) + static_cast<float>(i);
        const std::array<Channels::ChannelRows, 1> rows{{{lane, values}}};
        ASSERT_TRUE(pLive->AppendFrames(frame, 4, rows).IsSuccess());
    }
    bDone = true;
    for (std::thread& rThread : threads)
        rThread.join();
    EXPECT_EQ(wrong, 0u);
    EXPECT_GE(notices, 5u) << "the first samples, and at least two restarts with the samples that follow";
}

} // namespace ChannelsTest
