#include "Channels/Samples/VSampleRows.h"

#include <algorithm>
#include <limits>
#include <utility>

namespace Channels
{

VSampleRows::VSampleRows(std::uint32_t i_Components) : m_Components(i_Components), m_Chunks(i_Components) {}

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
        const std::int64_t run = std::min(Chunks::RunLength(i_Row), i_Count);
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
        const std::int64_t run = std::min(Chunks::RunLength(i_Row), i_Count);
        std::fill_n(m_Chunks.Row(i_Row), static_cast<std::size_t>(run) * m_Components,
                    std::numeric_limits<float>::quiet_NaN());
        i_Row += run;
        i_Count -= run;
    }
}

} // namespace Channels
