#pragma once

#include "Channels/Samples/VRowChunks.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>

namespace Channels
{

/// The samples of a store as rows of interleaved components: either its own memory in chunks, or the memory of somebody
/// else that it keeps alive and never writes. Chunks in which every sample is missing need no memory. Runs of rows
/// begin at multiples of 1024, or of a smaller power of two where rows are wide, as far as rows exist, so 16 rows from
/// a multiple of 16 on are always contiguous. Not thread-safe; the store guards it.
class VSampleRows
{
public:
    using Chunks = VRowChunks<float, 1024>;

    explicit VSampleRows(std::uint32_t i_Components);

    std::size_t Components() const { return m_Components; }

    bool IsShared() const { return m_pOwner != nullptr; }
    bool Covers(std::int64_t i_First, std::int64_t i_End) const { return m_Chunks.Covers(i_First, i_End); }
    /// Whether the rows can be written as missing.
    bool CoversMissing(std::int64_t i_First, std::int64_t i_End) const { return m_Chunks.HasPlace(i_First, i_End); }
    void Ensure(std::int64_t i_First, std::int64_t i_End);
    void EnsureMissing(std::int64_t i_First, std::int64_t i_End);
    std::int64_t RunLength(std::int64_t i_Row) const { return m_Chunks.RunLength(i_Row); }
    bool CanFreeBefore(std::int64_t i_Row) const { return m_Chunks.CanFreeBefore(i_Row); }
    void FreeBefore(std::int64_t i_Row) { m_Chunks.FreeBefore(i_Row); }
    void Clear();

    /// Rows i_First and on become those of i_Samples, which i_pOwner keeps alive.
    void Share(std::int64_t i_First, std::shared_ptr<const void> i_pOwner, std::span<const float> i_Samples);

    /// Copies the shared rows that exist into memory of its own, so that more can be written.
    void TakeOver(std::int64_t i_First, std::int64_t i_End);

    /// Copies rows in; they are covered. i_Stride is the distance between rows in the source, in values.
    void Write(std::int64_t i_Row, std::int64_t i_Count, const float* i_pValues, std::size_t i_Stride);
    void WriteMissing(std::int64_t i_Row, std::int64_t i_Count);

    /// Calls i_rFunction(const float* values, i64 row, i64 rows) for each contiguous run of [i_First, i_End).
    template <typename TFunction>
    void ForEachRun(std::int64_t i_First, std::int64_t i_End, const TFunction& i_rFunction) const
    {
        while (i_First < i_End)
        {
            const std::int64_t run =
                m_pOwner ? i_End - i_First : std::min(m_Chunks.RunLength(i_First), i_End - i_First);
            i_rFunction(Row(i_First), i_First, run);
            i_First += run;
        }
    }

    const float* Row(std::int64_t i_Row) const
    {
        if (m_pOwner)
            return m_pShared + static_cast<std::size_t>(i_Row - m_SharedFirst) * m_Components;
        if (m_Chunks.IsVoid(i_Row))
            return MissingRows() + (i_Row & (m_Chunks.RunLength(0) - 1)) * static_cast<std::int64_t>(m_Components);
        return m_Chunks.Row(i_Row);
    }

    std::size_t ByteCount() const { return m_Chunks.ByteCount(); }

private:
    static const float* MissingRows();

    std::size_t m_Components;
    Chunks m_Chunks;
    std::shared_ptr<const void> m_pOwner;
    const float* m_pShared = nullptr;
    std::int64_t m_SharedFirst = 0;
};

} // namespace Channels
