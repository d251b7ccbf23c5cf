#pragma once

#include "TQL/ISchema.h"

#include <cstdint>
#include <span>
#include <string>
#include <utility>
#include <vector>

namespace TQL
{

/// Carries i_rNames from the names of a schema with history i_From to those of one with history i_To: what i_To has
/// more is applied forward, what it has less is undone, last first. A name that was removed becomes empty. False, and
/// the names stay, when the histories disagree in the part that both have.
[[nodiscard]] bool CarryNames(std::span<const SchemaRename> i_From, std::span<const SchemaRename> i_To,
                              std::vector<std::string>& io_rNames);

/// How the values of an old enum stand in a new one.
struct EnumMapping
{
    std::vector<std::pair<std::int32_t, std::int32_t>> Values; ///< old to new by old value; empty: nothing changes
    std::vector<std::int32_t> Removed;                         ///< old values without a name any more, ascending
    std::vector<std::string> Messages;                         ///< why it failed; empty when it succeeded

    bool HasSucceeded() const noexcept { return Messages.empty(); }
};

EnumMapping MapEnum(const ISchema& i_rOld, const ISchema& i_rNew);

/// For each member of a named tuple the index of its partner on the other side, -1 without one.
struct MemberMatch
{
    bool bHistoriesAgree = false;
    std::vector<int> Partners; ///< as many as there are members; none when the histories disagree
};

MemberMatch MatchMembers(const ISchema& i_rFrom, const ISchema& i_rTo);

} // namespace TQL
