#pragma once

#include <cstddef>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace Recordings
{

// The texts of C3D files: fixed widths padded with blanks or zeros, in UTF-8 or in the Latin alphabet of old systems.

/// The text up to the first zero, without the blanks at its end, control characters as blanks, as UTF-8.
std::string C3dText(std::span<const std::byte> i_Bytes);

/// The ASCII letters of a text as capitals.
std::string C3dCapitals(std::string_view i_Text);

/// Exactly i_Count names for channels: the labels as they stand, "Point 7" (i_Word and the number from 1) where there
/// is none, "#2", "#3" behind one that comes again. No two are equal.
std::vector<std::string> UniqueLabels(std::vector<std::string> i_Labels, std::size_t i_Count, std::string_view i_Word);

/// The part of a label before its first colon, or empty.
std::string SubjectOfLabel(std::string_view i_Label);

} // namespace Recordings
