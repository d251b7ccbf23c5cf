#pragma once

#include <cstdint>

/// The bits of an entry's flags word that have a meaning. The others among the low twelve are kept as they are set.
namespace Store::EntryFlag
{

inline constexpr std::uint32_t Persistable = 1; ///< written to files
inline constexpr std::uint32_t Hidden = 4;
inline constexpr std::uint32_t Advanced = 8;
inline constexpr std::uint32_t VerifyRequired = 16; ///< a proposed value is verified before it becomes the value
inline constexpr std::uint32_t Synthetic = 32;
inline constexpr std::uint32_t Readout = 64;         ///< an output of the system; nobody but its owner sets it
inline constexpr std::uint32_t ValueIsDefault = 512; ///< the value came from the default; an explicit set clears it
inline constexpr std::uint32_t Mask = 0xFFF;

} // namespace Store::EntryFlag
