#pragma once

#include "StoreIO/IStoreMigrator.h"

#include <cstddef>
#include <string>
#include <string_view>

/// What a store file looks like: one JSON object with the members "Version" and "Children". docs/file-formats.md has
/// the grammar.
namespace StoreIO
{

inline constexpr std::string_view VersionMember = "Version";
inline constexpr std::string_view ChildrenMember = "Children";
inline constexpr std::string_view ValueMember = "Value";             ///< the verified value
inline constexpr std::string_view ProposedMember = "Value-Proposed"; ///< the proposed value

/// The entry whose children are the version records of a file's parts; first in a file.
inline constexpr std::string_view VersionsEntry = "Versions";

inline constexpr TQL::StoreVersion CurrentFormat{3, 0};
inline constexpr TQL::StoreVersion LowestFormat{3, 0};
inline constexpr TQL::StoreVersion HighestFormat{3, 0};

/// What a file may not go beyond, so that no file takes more stack or memory than a few times its size.
inline constexpr std::size_t MaximumJsonDepth = 1024; ///< objects and lists inside one another; an entry takes two
inline constexpr std::size_t MaximumPathDepth = 256;  ///< components
inline constexpr std::size_t MaximumPathSize = 4096;  ///< bytes

/// Major, dot, minor.
std::string VersionText(TQL::StoreVersion i_Version);

/// The place of an entry as messages name it: /Configuration/Node[@name='A']/Node[@name='B'] for A/B.
std::string XPathText(std::string_view i_Path);

} // namespace StoreIO
