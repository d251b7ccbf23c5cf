#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

namespace Recordings
{

/// The kind of machine that wrote a C3D file, by the byte that names it there. It rules integers and reals alike.
enum class EProcessor : std::uint8_t
{
    Intel = 84, ///< little-endian, IEEE reals
    Dec = 85,   ///< little-endian integers, VAX F reals
    Mips = 86   ///< big-endian, IEEE reals
};

/// The processor of that byte; nothing where the byte names none.
std::optional<EProcessor> ProcessorOfByte(std::byte i_Byte);

enum class EWordKind
{
    Signed,   ///< 16-bit integers
    Unsigned, ///< 16-bit integers
    Real      ///< 32-bit reals
};

constexpr std::size_t BytesOf(EWordKind i_Kind)
{
    return i_Kind == EWordKind::Real ? 4 : 2;
}

/// Words of a file that stand in rows, one word if not told otherwise: each row at the same distance from the one
/// before, and so within the rows.
struct WordGrid
{
    std::size_t Rows = 1;
    std::size_t RowBytes = 0; ///< from row to row
    std::size_t Columns = 1;
    std::size_t ColumnBytes = 0; ///< from word to word in a row
};

/// Turns the bytes of a file into numbers as one processor wrote them. A value; any thread. Every span of bytes that is
/// handed in must hold what is asked for: the callers check lengths where they check the structure of the file.
class VByteDecoder
{
public:
    explicit VByteDecoder(EProcessor i_Processor) : m_Processor(i_Processor) {}

    EProcessor Processor() const { return m_Processor; }

    std::uint16_t Word(std::span<const std::byte> i_Bytes) const;
    /// A real that the processor reserves as "no number" comes back as NaN.
    float Real(std::span<const std::byte> i_Bytes) const;

    /// Decodes the words of a grid, row by row, the first one at i_pFirst. o_pValues has room for all of them.
    void Decode(EWordKind i_Kind, const std::byte* i_pFirst, const WordGrid& i_rGrid, float* o_pValues) const;

private:
    EProcessor m_Processor;
};

} // namespace Recordings
