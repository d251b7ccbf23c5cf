#include "GraphPlotSystem/MemoryBlock.h"
#include "GraphPlotSystem/RingText.h"

#include "GraphPlotSystem/Traces/TraceRingFill.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <random>
#include <string>
#include <utility>
#include <vector>

// Random sequences of what a window does to a ring, each step compared with rows computed anew from the block.

using GraphPlotUI::TraceTexel;
using GraphPlotUI::TraceTexelRing;
using TestSupport::ExtentText;
using TestSupport::Gap;
using TestSupport::MemoryBlock;
using TQL::TickRange;

namespace
{

constexpr std::int64_t Period = 10;
constexpr std::int64_t GridOffset = 3;
constexpr TickRange Everything = {-1'000'000'000, 1'000'000'000};

class RingModel
{
public:
    RingModel(unsigned i_Seed, std::uint32_t i_Components)
        : m_Random(i_Seed), m_Components(i_Components), m_Block(i_Components, Period, 4, GridOffset)
    {
        m_Block.Append(MakeSamples(0, 3000));
        m_Window = {1000, 2200};
    }

    void Step()
    {
        m_Log.clear();
        Change();
        const bool bFree = Chance(0.2);
        m_Block.bFail = Chance(0.05);
        const std::string before = ExtentText(m_Ring);
        const TickRange request = m_Block.Ticks(m_Window.First, m_Window.Last);
        const TickRange limit = bFree ? Everything : request;
        m_Log += "request [" + std::to_string(m_Window.First) + ", " + std::to_string(m_Window.Last) + ") level " +
                 std::to_string(m_Level) + (bFree ? " free" : "") + (m_Block.bFail ? " fails" : "") + "\nbefore " +
                 before + "\n";
        GraphPlotUI::UpdateRing(m_Ring, m_Scratch, m_Block, m_Block.Range(), request, limit, m_Level);
        m_Log += "after " + ExtentText(m_Ring);
        EXPECT_EQ(m_Block.Store().Open, 0);
        const TickRange available = m_Block.Range();
        const TickRange allowed = {std::max(available.First, limit.First), std::min(available.Last, limit.Last)};
        const TickRange wanted = {std::max(request.First, allowed.First), std::min(request.Last, allowed.Last)};
        const bool bFailed = m_Block.bFail;
        m_Block.bFail = false;
        if (wanted.First >= wanted.Last)
            EXPECT_EQ(ExtentText(m_Ring), before);
        else if (!bFailed)
        {
            CheckExtent(allowed, wanted);
            CheckRows();
        }
        if (Chance(0.7))
            UploadAndCompare();
    }

    const std::string& Log() const { return m_Log; }

private:
    std::int64_t Between(std::int64_t i_Low, std::int64_t i_High)
    {
        return std::uniform_int_distribution<std::int64_t>(i_Low, i_High)(m_Random);
    }
    bool Chance(double i_Probability) { return std::bernoulli_distribution(i_Probability)(m_Random); }

    /// Some number that always comes with a sample, a component and the present series.
    std::uint32_t Hash(std::int64_t i_Sample, std::uint32_t i_Component) const
    {
        std::uint32_t hash = static_cast<std::uint32_t>(i_Sample) * 0x9e3779b1u + i_Component * 0x85ebca6bu + m_Series;
        hash = (hash ^ (hash >> 15)) * 0x2c1b3c6du;
        return hash ^ (hash >> 13);
    }

    /// A wave a component with noise on it and holes of up to 40 samples. What a block has lost comes back the same.
    std::vector<float> MakeSamples(std::int64_t i_First, std::int64_t i_End) const
    {
        constexpr std::int64_t cell = 64; // may have one hole
        std::vector<float> samples;
        for (std::int64_t n = i_First; n < i_End; ++n)
            for (std::uint32_t c = 0; c < m_Components; ++c)
            {
                const std::uint32_t hash = Hash(TQL::FloorDivide(n, cell), c);
                const std::int64_t place = TQL::AlignDown(n, cell) + (hash >> 8) % cell - 20;
                const bool bHole = hash % 2 == 0 && n >= place && n < place + (hash >> 16) % 40;
                const float noise = static_cast<float>(Hash(n, c) % 1000) * 0.001f;
                samples.push_back(bHole ? Gap : std::sin(0.01f * static_cast<float>(n)) + noise);
            }
        return samples;
    }

    void Append(std::int64_t i_Samples) { m_Block.Append(MakeSamples(m_Block.End(), m_Block.End() + i_Samples)); }
    void Prepend(std::int64_t i_Samples) { m_Block.Prepend(MakeSamples(m_Block.First() - i_Samples, m_Block.First())); }

    /// At most i_Samples, so that one is left.
    std::int64_t Spared(std::int64_t i_Samples) const
    {
        return std::min(i_Samples, m_Block.End() - m_Block.First() - 1);
    }

    void MoveWindow(std::int64_t i_By)
    {
        m_Window.First += i_By;
        m_Window.Last += i_By;
    }

    void Change()
    {
        switch (Between(0, 13))
        {
        case 0:
        case 1:
        case 2: // live: new samples, and the window follows
        {
            const std::int64_t count = Between(1, 60);
            Append(count);
            MoveWindow(count);
            break;
        }
        case 3:
            Append(Between(1, 700));
            break;
        case 4:
        case 5:
            MoveWindow(Between(-300, 300));
            break;
        case 6:
            MoveWindow(Between(-4000, 4000));
            break;
        case 7:
            m_Window.First -= Between(-200, 400);
            m_Window.Last = std::max(m_Window.First, m_Window.Last + Between(-200, 400));
            break;
        case 8:
            m_Level = static_cast<std::uint8_t>(Between(0, 4));
            break;
        case 9:
            m_Block.TrimHead(Spared(Between(0, 320)));
            break;
        case 10:
            m_Block.TrimEnd(Spared(Between(0, 50)));
            break;
        case 11:
        case 12: // history that comes after the newest, and a window on all there is of it
            Prepend(Between(1, 900));
            if (Chance(0.5))
                m_Window.First = m_Block.First() - Between(0, 40);
            break;
        default:
            if (Chance(0.3))
            {
                m_Series = static_cast<std::uint32_t>(Between(0, 1'000'000));
                const std::int64_t first = Between(-300, 600);
                m_Block.Replace(first, MakeSamples(first, first + Between(500, 6000)));
            }
            m_Window = {m_Block.First() + Between(-100, 500), m_Block.First() + Between(600, 6500)};
            break;
        }
    }

    void CheckExtent(const TickRange& i_rAllowed, const TickRange& i_rWanted)
    {
        const std::int64_t stride = m_Ring.Source.Stride();
        const GraphPlotUI::RingExtent& rExtent = m_Ring.Extent;
        const TickRange rows = {TQL::AlignDown(i_rWanted.First, stride, GridOffset),
                                TQL::AlignUp(i_rWanted.Last, stride, GridOffset)};
        EXPECT_EQ(m_Ring.Source.Level, m_Level);
        EXPECT_EQ(TQL::AlignDown(rExtent.FirstTick, stride, GridOffset), rExtent.FirstTick);
        EXPECT_EQ(TQL::AlignUp(rExtent.EndTick, stride, GridOffset), m_Ring.RowTick(rExtent.RowCount));
        EXPECT_LE(rExtent.RowCount, TraceTexelRing::Capacity);
        EXPECT_GE(rExtent.FirstTick, TQL::AlignDown(i_rAllowed.First, stride, GridOffset));
        EXPECT_LE(rExtent.EndTick, TQL::AlignUp(i_rAllowed.Last, stride, GridOffset));
        if (rows.Last - rows.First > std::int64_t{TraceTexelRing::Capacity} * stride)
            EXPECT_EQ(rExtent.RowCount, TraceTexelRing::Capacity);
        else
        {
            EXPECT_LE(rExtent.FirstTick, i_rWanted.First);
            EXPECT_GE(rExtent.EndTick, i_rWanted.Last);
        }
    }

    void CheckRows()
    {
        const std::int64_t stride = m_Ring.Source.Stride();
        for (std::uint32_t c = 0; c < m_Components; ++c)
        {
            std::int64_t previous = -1;
            for (std::uint32_t row = 0; row < m_Ring.Extent.RowCount; ++row)
            {
                const std::int64_t tick = m_Ring.RowTick(row);
                const auto record = m_Block.Record({tick, std::min(tick + stride, m_Ring.Extent.EndTick)}, c);
                const TraceTexel& rTexel = m_Ring.At(row, c);
                const bool bSame = rTexel.Maximum == record.Maximum && rTexel.Minimum == record.Minimum &&
                                   (record.Count == 0 || rTexel.Value == record.Mean);
                const std::int64_t distance = row - previous;
                const bool bCounted = previous < 0 ? rTexel.Distance >= static_cast<float>(distance)
                                                   : rTexel.Distance == static_cast<float>(distance);
                ASSERT_TRUE(bSame && bCounted)
                    << "component " << c << " row " << row << ": " << TestSupport::RowsText(m_Ring, c, row, row + 1)
                    << ", data at row " << previous << " before, should be " << record.Mean;
                if (record.Count == 0)
                    continue;
                if (previous >= 0)
                {
                    ASSERT_GE(GraphPlotUI::LongestStep(m_Ring, c), static_cast<std::uint32_t>(distance));
                }
                previous = row;
            }
        }
    }

    /// What a texture would hold that only ever got the dirty rows.
    void UploadAndCompare()
    {
        m_Texture.resize(m_Ring.Texels.size());
        for (GraphPlotUI::DirtyRows* pRows : {&m_Ring.Dirty, &m_Ring.DirtyHead})
        {
            const auto rows = std::exchange(*pRows, {});
            const auto begin = static_cast<std::ptrdiff_t>(rows.First * m_Components);
            std::copy_n(m_Ring.Texels.begin() + begin, (rows.End - rows.First) * m_Components,
                        m_Texture.begin() + begin);
        }
        for (std::uint32_t row = 0; row < m_Ring.Extent.RowCount; ++row)
        {
            const std::size_t first = std::size_t{m_Ring.TextureRow(row)} * m_Components;
            ASSERT_EQ(std::memcmp(&m_Texture[first], &m_Ring.Texels[first], m_Components * sizeof(TraceTexel)), 0)
                << "row " << row << " changed without being dirty";
        }
    }

    std::mt19937 m_Random;
    const std::uint32_t m_Components;
    MemoryBlock m_Block;
    TraceTexelRing m_Ring;
    GraphPlotUI::RingScratch m_Scratch;
    std::vector<TraceTexel> m_Texture;
    TickRange m_Window; ///< samples
    std::uint8_t m_Level = 0;
    std::uint32_t m_Series = 0;
    std::string m_Log;
};

} // namespace

TEST(RingModel, RandomUseHoldsTheRowsOfTheBlock)
{
    for (unsigned seed = 1; seed <= 10; ++seed)
    {
        RingModel model(seed, 1 + seed % 5);
        for (int step = 0; step < 120; ++step)
        {
            model.Step();
            ASSERT_FALSE(HasFailure()) << "seed " << seed << " step " << step << "\n" << model.Log();
        }
    }
}
