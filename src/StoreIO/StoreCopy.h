#pragma once

#include "StoreInterface/EntryHandle.h"
#include "TQL/IResult.h"

#include <cstdint>

namespace TQL
{
class IStoreReader;
class IStoreWriter;
} // namespace TQL

/// Copies of entries, their values and flags, between two stores or within one. The caller holds the read and the
/// write for the whole copy. What was skipped or failed, and why, is in the log.
namespace StoreIO
{

/// How to copy; any of these together.
namespace CopyOption
{
inline constexpr std::uint32_t PersistableOnly = 1; ///< skip what is not Persistable
inline constexpr std::uint32_t Literal = 2;         ///< both values and the flags as they stand
inline constexpr std::uint32_t KeepValues = 4;      ///< skip where the target already has a value
inline constexpr std::uint32_t SkipReadouts = 32;   ///< skip where the target is a Readout
inline constexpr std::uint32_t MarkPersistable = 64;
inline constexpr std::uint32_t MarkReadout = 128;
} // namespace CopyOption

/// Copies one entry. `OkButNoEffect` for a skipped entry; one without values gives that too in a literal copy, else
/// `NotFound`, as an entry does that does not exist. `NotSet` when the target refuses a value, for example because it
/// is of another type.
TQL::IResult CopyEntry(const TQL::IStoreReader& i_rReader, Store::EntryHandle i_Entry, TQL::IStoreWriter& i_rWriter,
                       Store::EntryHandle i_Target, std::uint32_t i_Options);

/// Copies one entry to another place of the store that is being written.
TQL::IResult CopyEntrySameStore(TQL::IStoreWriter& i_rWriter, Store::EntryHandle i_Entry, Store::EntryHandle i_Target,
                                std::uint32_t i_Options);

/// Copies an entry and all below it. A failure does not end the walk. Each entry counts with all below it as one part
/// of the entry above: `OkButPartial` when some parts failed and others did not, else the first failure, else the first
/// result that is not `Ok`. A target inside the tree is not itself copied. How deep the tree is does not matter to the
/// stack.
TQL::IResult CopyEntryTree(const TQL::IStoreReader& i_rReader, Store::EntryHandle i_Entry, TQL::IStoreWriter& i_rWriter,
                           Store::EntryHandle i_Target, std::uint32_t i_Options);

} // namespace StoreIO
