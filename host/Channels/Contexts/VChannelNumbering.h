#pragma once

#include "Channels/Common/ChannelTypes.h"
#include "Recordings/Common/VRecording.h"

#include <cstdint>
#include <map>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

namespace Channels
{

/// Gives the channels of a recording the numbers of their ids: subjects, and channels of a kind within their subject,
/// in the order in which they come. A recording that is read again is numbered with a copy of the numbering of the
/// first: a channel of the same kind, subject and name gets the number that it had, a new one a number that none had. A
/// value.
class VChannelNumbering
{
public:
    /// What makes the channels of a recording, one for each, in its order.
    std::vector<ChannelDefinition> DefineAll(const Recordings::VRecording& i_rRecording);

private:
    using Scope = std::pair<Recordings::EChannelKind, std::uint64_t>; ///< kind and subject
    using Key = std::tuple<Scope, std::string, std::uint64_t>;        ///< and name, and how many bore it before

    ChannelDefinition Define(const Recordings::RecordedChannel& i_rChannel);
    std::uint64_t SubjectOf(const std::string& i_rName);
    std::uint64_t NumberOf(const Scope& i_rScope, const std::string& i_rName);

    std::map<std::string, std::uint64_t> m_Subjects;
    std::map<Key, std::uint64_t> m_Numbers;
    std::map<Scope, std::uint64_t> m_Next;                        ///< the number that none has yet
    std::map<std::pair<Scope, std::string>, std::uint64_t> m_Met; ///< in this recording, of one name
};

} // namespace Channels
