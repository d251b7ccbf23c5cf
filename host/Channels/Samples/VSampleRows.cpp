#include "Channels/Samples/VSampleRows.h"

#include <algorithm>
#include <limits>
#include <utility>
#include <vector>

namespace Channels
{

namespace
{

constexpr std::size_t ChunkValues = 4096; ///< at most, so that a channel with few samples is small however wide it is
constexpr std::int64_t FewestRows = 16;
constexpr float Missing = std::numeric_limits<float>::quiet_NaN();

std::int64_t RowsOfChunk(std::size_t i_Components)
{
    std::int64_t rows = VSampleRows::Chunks::ChunkRows;
    while (rows > FewestRows && static_cast<std::size_t>(rows) * i_Components > ChunkValues)
        rows /= 2;
    return rows;
}

} // namespace

VSampleRows::VSampleRows(std::uint32_t i_Components)
    : m_Components(i_Components), m_Chunks(i_Components, RowsOfChunk(i_Components))
{
}

/// A chunk of missing samples that all share.
const float* VSampleRows::MissingRows()
{
    static const std::vector<float> s_Rows(ChunkValues + 1, Missing);
    return s_Rows.data();
}

void VSampleRows::Ensure(std::int64_t i_First, std::int64_t i_End)
{
    m_Chunks.Ensure(
        i_First, i_End,
        [this](std::int64_t i_Row)
        { std::fill_n(m_Chunks.Row(i_Row), static_cast<std::size_t>(m_Chunks.RunLength(0)) * m_Components, Missing); });
}

void VSampleRows::EnsureMissing(std::int64_t i_First, std::int64_t i_End)
{
    if (static_cast<std::size_t>(m_Chunks.RunLength(0)) * m_Components <= ChunkValues)
        m_Chunks.EnsureVoid(i_First, i_End);
    else
        Ensure(i_First, i_End); // wider than what is shared
}

void VSampleRows::Clear()
{
    m_Chunks.Clear();
    m_pOwner = nullptr;
    m_pShared = nullptr;
}

void VSampleRows::Share(std::int64_t i_First, std::shared_ptr<const void> i_pOwner, std::span<const float> i_Samples)
{
    Clear();
    m_pOwner = std::move(i_pOwner);
    m_pShared = i_Samples.data();
    m_SharedFirst = i_First;
}

void VSampleRows::TakeOver(std::int64_t i_First, std::int64_t i_End)
{
    const std::shared_ptr<const void> pKept = std::exchange(m_pOwner, nullptr);
    Ensure(i_First, i_End);
    const float* pRows = m_pShared + static_cast<std::size_t>(i_First - m_SharedFirst) * m_Components;
    Write(i_First, i_End - i_First, pRows, m_Components);
    m_pShared = nullptr;
}

void VSampleRows::Write(std::int64_t i_Row, std::int64_t i_Count, const float* i_pValues, std::size_t i_Stride)
{
    while (i_Count > 0)
    {
        const std::int64_t run = std::min(m_Chunks.RunLength(i_Row), i_Count);
        float* pRow = m_Chunks.Row(i_Row);
        if (i_Stride == m_Components)
            std::copy_n(i_pValues, static_cast<std::size_t>(run) * m_Components, pRow);
        else
            for (std::int64_t i = 0; i < run; ++i)
                std::copy_n(i_pValues + static_cast<std::size_t>(i) * i_Stride, m_Components,
                            pRow + static_cast<std::size_t>(i) * m_Components);
        i_pValues += static_cast<std::size_t>(run) * i_Stride;
        i_Row += run;
        i_Count -= run;
    }
}

void VSampleRows::WriteMissing(std::int64_t i_Row, std::int64_t i_Count)
{
    while (i_Count > 0)
    {
        const std::int64_t run = std::min(m_Chunks.RunLength(i_Row), i_Count);
        if (!m_Chunks.IsVoid(i_Row))
            std::fill_n(m_Chunks.Row(i_Row), static_cast<std::size_t>(run) * m_Components, Missing);
        i_Row += run;
        i_Count -= run;
    }
}

} // namespace Channels
