#include "Recordings/Text/ByteDecoder.h"

#include <bit>
#include <cmath>
#include <cstring>
#include <limits>

namespace Recordings
{

static_assert(std::numeric_limits<float>::is_iec559 && sizeof(float) == 4);

namespace
{

constexpr std::uint16_t Swap(std::uint16_t i_Value)
{
    return static_cast<std::uint16_t>(i_Value << 8 | i_Value >> 8);
}

constexpr std::uint32_t Swap(std::uint32_t i_Value)
{
    return i_Value << 24 | (i_Value & 0xFF00u) << 8 | (i_Value >> 8 & 0xFF00u) | i_Value >> 24;
}

template <typename Unsigned, std::endian Order>
Unsigned Load(const std::byte* i_pBytes)
{
    Unsigned value;
    std::memcpy(&value, i_pBytes, sizeof(value));
    return Order == std::endian::native ? value : Swap(value);
}

std::uint16_t LittleWord(const std::byte* i_pBytes)
{
    return Load<std::uint16_t, std::endian::little>(i_pBytes);
}

std::uint16_t BigWord(const std::byte* i_pBytes)
{
    return Load<std::uint16_t, std::endian::big>(i_pBytes);
}

float IntelReal(const std::byte* i_pBytes)
{
    return std::bit_cast<float>(Load<std::uint32_t, std::endian::little>(i_pBytes));
}

float MipsReal(const std::byte* i_pBytes)
{
    return std::bit_cast<float>(Load<std::uint32_t, std::endian::big>(i_pBytes));
}

// Sign, 8 bits of exponent and 23 of fraction as in IEEE, but the high word comes first, the value is
// 0.1fraction x 2^(exponent - 128), and there are neither infinities nor NaN.
float VaxReal(const std::byte* i_pBytes)
{
    const std::uint32_t bits = std::rotl(Load<std::uint32_t, std::endian::little>(i_pBytes), 16);
    const std::uint32_t exponent = (bits >> 23) & 0xFFu;
    const bool bNegative = (bits & 0x80000000u) != 0;
    if (exponent == 0)
        return bNegative ? std::numeric_limits<float>::quiet_NaN() : 0.0f;
    if (exponent > 2)
        return std::bit_cast<float>(bits - (2u << 23));
    const float magnitude =
        std::ldexp(static_cast<float>((bits & 0x7FFFFFu) | 0x800000u), static_cast<int>(exponent) - 152);
    return bNegative ? -magnitude : magnitude;
}

template <typename Convert>
void DecodeGrid(const std::byte* i_pFirst, const WordGrid& i_rGrid, float* o_pValues, Convert i_Convert)
{
    for (std::size_t row = 0; row < i_rGrid.Rows; ++row)
    {
        const std::byte* pBytes = i_pFirst + row * i_rGrid.RowBytes;
        for (std::size_t column = 0; column < i_rGrid.Columns; ++column, pBytes += i_rGrid.ColumnBytes)
            *o_pValues++ = static_cast<float>(i_Convert(pBytes));
    }
}

std::int16_t AsSigned(std::uint16_t i_Word)
{
    return static_cast<std::int16_t>(i_Word);
}

} // namespace

std::optional<EProcessor> ProcessorOfByte(std::byte i_Byte)
{
    const auto value = std::to_integer<std::uint8_t>(i_Byte);
    if (value < static_cast<std::uint8_t>(EProcessor::Intel) || value > static_cast<std::uint8_t>(EProcessor::Mips))
        return std::nullopt;
    return static_cast<EProcessor>(value);
}

std::uint16_t VByteDecoder::Word(std::span<const std::byte> i_Bytes) const
{
    return m_Processor == EProcessor::Mips ? BigWord(i_Bytes.data()) : LittleWord(i_Bytes.data());
}

float VByteDecoder::Real(std::span<const std::byte> i_Bytes) const
{
    switch (m_Processor)
    {
    case EProcessor::Dec:
        return VaxReal(i_Bytes.data());
    case EProcessor::Mips:
        return MipsReal(i_Bytes.data());
    case EProcessor::Intel:
        break;
    }
    return IntelReal(i_Bytes.data());
}

void VByteDecoder::Decode(EWordKind i_Kind, const std::byte* i_pFirst, const WordGrid& i_rGrid, float* o_pValues) const
{
    const auto decodeEach = [&](auto i_Convert)
    {
        DecodeGrid(i_pFirst, i_rGrid, o_pValues, i_Convert);
    };
    const bool bBig = m_Processor == EProcessor::Mips;
    if (i_Kind == EWordKind::Real && m_Processor == EProcessor::Dec)
        decodeEach([](const std::byte* i_p) { return VaxReal(i_p); });
    else if (i_Kind == EWordKind::Real && bBig)
        decodeEach([](const std::byte* i_p) { return MipsReal(i_p); });
    else if (i_Kind == EWordKind::Real)
        decodeEach([](const std::byte* i_p) { return IntelReal(i_p); });
    else if (i_Kind == EWordKind::Unsigned && bBig)
        decodeEach([](const std::byte* i_p) { return BigWord(i_p); });
    else if (i_Kind == EWordKind::Unsigned)
        decodeEach([](const std::byte* i_p) { return LittleWord(i_p); });
    else if (bBig)
        decodeEach([](const std::byte* i_p) { return AsSigned(BigWord(i_p)); });
    else
        decodeEach([](const std::byte* i_p) { return AsSigned(LittleWord(i_p)); });
}

} // namespace Recordings
