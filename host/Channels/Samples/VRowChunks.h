#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <memory>
#include <utility>

namespace Channels
{

/// Rows of values in chunks of fixed size, addressed by row numbers that may be negative. Growing at either end never
/// moves a value, and the memory of rows that are no longer wanted is given back by the chunk; one freed chunk is kept
/// for the next growth. Chunks begin at multiples of TRows, and one value behind a chunk's last can be read, whatever
/// it holds. Not thread-safe: the owner keeps changes of the table of chunks (Ensure, FreeBefore, Clear) apart from
/// everything else.
template <typename T, std::int64_t TRows>
class VRowChunks
{
    static_assert((TRows & (TRows - 1)) == 0);

public:
    static constexpr std::int64_t ChunkRows = TRows;

    explicit VRowChunks(std::size_t i_Width) : m_Width(i_Width) {}

    bool Covers(std::int64_t i_First, std::int64_t i_End) const
    {
        return i_First >= i_End || (!m_Chunks.empty() && i_First >= FirstRow() && i_End <= EndRow());
    }

    /// Makes room for the rows. They have to touch or overlap those that have room already.
    void Ensure(std::int64_t i_First, std::int64_t i_End)
    {
        if (i_First >= i_End)
            return;
        if (m_Chunks.empty())
            m_FirstChunk = ChunkOf(i_First);
        while (ChunkOf(i_First) < m_FirstChunk)
        {
            m_Chunks.push_front(NewChunk());
            --m_FirstChunk;
        }
        while (EndRow() < i_End)
            m_Chunks.push_back(NewChunk());
    }

    bool CanFreeBefore(std::int64_t i_Row) const { return !m_Chunks.empty() && FirstRow() + TRows <= i_Row; }

    void FreeBefore(std::int64_t i_Row)
    {
        while (CanFreeBefore(i_Row))
        {
            m_pSpare = std::move(m_Chunks.front());
            m_Chunks.pop_front();
            ++m_FirstChunk;
        }
    }

    void Clear() { m_Chunks.clear(); }

    /// The values of one row; those of the next RunLength(i_Row) - 1 rows follow.
    T* Row(std::int64_t i_Row) { return m_Chunks[ChunkIndex(i_Row)].get() + Offset(i_Row); }
    const T* Row(std::int64_t i_Row) const { return m_Chunks[ChunkIndex(i_Row)].get() + Offset(i_Row); }

    static std::int64_t RunLength(std::int64_t i_Row) { return TRows - (i_Row & (TRows - 1)); }

    std::size_t ByteCount() const { return m_Chunks.size() * static_cast<std::size_t>(TRows) * m_Width * sizeof(T); }

private:
    static std::int64_t ChunkOf(std::int64_t i_Row) { return (i_Row - (i_Row & (TRows - 1))) / TRows; }
    std::size_t ChunkIndex(std::int64_t i_Row) const { return static_cast<std::size_t>(ChunkOf(i_Row) - m_FirstChunk); }
    std::size_t Offset(std::int64_t i_Row) const { return static_cast<std::size_t>(i_Row & (TRows - 1)) * m_Width; }
    std::int64_t FirstRow() const { return m_FirstChunk * TRows; }
    std::int64_t EndRow() const { return (m_FirstChunk + static_cast<std::int64_t>(m_Chunks.size())) * TRows; }

    std::unique_ptr<T[]> NewChunk()
    {
        if (m_pSpare)
            return std::move(m_pSpare);
        return std::make_unique_for_overwrite<T[]>(static_cast<std::size_t>(TRows) * m_Width + 1);
    }

    std::size_t m_Width;
    std::int64_t m_FirstChunk = 0;
    std::deque<std::unique_ptr<T[]>> m_Chunks;
    std::unique_ptr<T[]> m_pSpare;
};

} // namespace Channels
