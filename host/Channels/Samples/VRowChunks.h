#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <memory>
#include <utility>

namespace Channels
{

/// Rows of values in chunks of fixed size, addressed by row numbers that may be negative. Growing at either end never
/// moves a value, and the memory of rows that are no longer wanted is given back by the chunk; one freed chunk is kept
/// for the next growth. Chunks begin at multiples of their rows, and one value behind a chunk's last can be read,
/// whatever it holds. A chunk can be void: it has its place and no memory, and its rows are not to be read before it is
/// made by Ensure. Not thread-safe: the owner keeps changes of the table of chunks (Ensure, EnsureVoid, FreeBefore,
/// Clear) apart from everything else.
template <typename T, std::int64_t TRows>
class VRowChunks
{
    static_assert((TRows & (TRows - 1)) == 0);

public:
    static constexpr std::int64_t ChunkRows = TRows;

    /// Chunks of fewer rows, a power of two, where rows are wide.
    explicit VRowChunks(std::size_t i_Width, std::int64_t i_Rows = TRows) : m_Width(i_Width), m_Rows(i_Rows) {}

    /// Whether the rows have a place.
    bool HasPlace(std::int64_t i_First, std::int64_t i_End) const
    {
        return i_First >= i_End || (!m_Chunks.empty() && i_First >= FirstRow() && i_End <= EndRow());
    }

    /// Whether the rows have memory.
    bool Covers(std::int64_t i_First, std::int64_t i_End) const
    {
        if (!HasPlace(i_First, i_End))
            return false;
        for (std::int64_t row = i_First; row < i_End; row += RunLength(row))
            if (IsVoid(row))
                return false;
        return true;
    }

    bool IsVoid(std::int64_t i_Row) const { return !m_Chunks[ChunkIndex(i_Row)]; }

    /// Gives the rows a place. They have to touch or overlap those that have one already.
    void EnsureVoid(std::int64_t i_First, std::int64_t i_End)
    {
        if (i_First >= i_End)
            return;
        if (m_Chunks.empty())
            m_FirstChunk = ChunkOf(i_First);
        while (ChunkOf(i_First) < m_FirstChunk)
        {
            m_Chunks.emplace_front();
            --m_FirstChunk;
        }
        while (EndRow() < i_End)
            m_Chunks.emplace_back();
    }

    /// Gives the rows memory, under the same condition. i_rMade is called with the first row of each chunk that gets
    /// it.
    template <typename TMade>
    void Ensure(std::int64_t i_First, std::int64_t i_End, const TMade& i_rMade)
    {
        EnsureVoid(i_First, i_End);
        for (std::int64_t row = i_First; row < i_End; row += RunLength(row))
            if (auto& rpChunk = m_Chunks[ChunkIndex(row)]; !rpChunk)
            {
                rpChunk = NewChunk();
                i_rMade(row - (row & (m_Rows - 1)));
            }
    }
    void Ensure(std::int64_t i_First, std::int64_t i_End)
    {
        Ensure(i_First, i_End, [](std::int64_t) {});
    }

    bool CanFreeBefore(std::int64_t i_Row) const { return !m_Chunks.empty() && FirstRow() + m_Rows <= i_Row; }

    void FreeBefore(std::int64_t i_Row)
    {
        while (CanFreeBefore(i_Row))
        {
            if (m_Chunks.front())
                m_pSpare = std::move(m_Chunks.front());
            m_Chunks.pop_front();
            ++m_FirstChunk;
        }
    }

    void Clear() { m_Chunks.clear(); }

    /// The values of one row; those of the next RunLength(i_Row) - 1 rows follow.
    T* Row(std::int64_t i_Row) { return m_Chunks[ChunkIndex(i_Row)].get() + Offset(i_Row); }
    const T* Row(std::int64_t i_Row) const { return m_Chunks[ChunkIndex(i_Row)].get() + Offset(i_Row); }

    std::int64_t RunLength(std::int64_t i_Row) const { return m_Rows - (i_Row & (m_Rows - 1)); }

    std::size_t ByteCount() const
    {
        const auto made =
            std::count_if(m_Chunks.begin(), m_Chunks.end(), [](const auto& i_rp) { return i_rp != nullptr; });
        return static_cast<std::size_t>(made) * static_cast<std::size_t>(m_Rows) * m_Width * sizeof(T);
    }

private:
    std::int64_t ChunkOf(std::int64_t i_Row) const { return (i_Row - (i_Row & (m_Rows - 1))) / m_Rows; }
    std::size_t ChunkIndex(std::int64_t i_Row) const { return static_cast<std::size_t>(ChunkOf(i_Row) - m_FirstChunk); }
    std::size_t Offset(std::int64_t i_Row) const { return static_cast<std::size_t>(i_Row & (m_Rows - 1)) * m_Width; }
    std::int64_t FirstRow() const { return m_FirstChunk * m_Rows; }
    std::int64_t EndRow() const { return (m_FirstChunk + static_cast<std::int64_t>(m_Chunks.size())) * m_Rows; }

    std::unique_ptr<T[]> NewChunk()
    {
        if (m_pSpare)
            return std::move(m_pSpare);
        return std::make_unique_for_overwrite<T[]>(static_cast<std::size_t>(m_Rows) * m_Width + 1);
    }

    std::size_t m_Width;
    std::int64_t m_Rows;
    std::int64_t m_FirstChunk = 0;
    std::deque<std::unique_ptr<T[]>> m_Chunks;
    std::unique_ptr<T[]> m_pSpare;
};

} // namespace Channels
