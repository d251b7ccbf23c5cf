#pragma once

#include "Channels/Contexts/VChannelContext.h"
#include "Channels/Contexts/VChannelNumbering.h"
#include "Recordings/Common/VRecording.h"

#include <memory>
#include <string>

namespace Channels
{

/// An opened recording as a context. Its channels read the samples of the recording where they are, and keep it alive.
/// Subjects, and markers and segments within their subject, are numbered in the order of the file. Nothing ever
/// changes, so RangeChanged is never raised; a file that is read again gives another context. Any thread.
class VRecordedContext : public VChannelContext
{
public:
    /// The frame period and the sample periods of the recording are above 0; a channel for which that does not hold or
    /// that has no component is left out. Channels of the same kind, subject and name as in i_pBefore, the context of
    /// the file as it was read before, get the ids that they had there.
    VRecordedContext(std::string i_Name, std::shared_ptr<VSubTypeTable> i_pSubTypes,
                     std::shared_ptr<const Recordings::VRecording> i_pRecording,
                     const VRecordedContext* i_pBefore = nullptr);

    const std::shared_ptr<const Recordings::VRecording>& GetRecording() const { return m_pRecording; }

    TQL::TickRange GetTickRange() const override { return m_pRecording->Range; }

private:
    const std::shared_ptr<const Recordings::VRecording> m_pRecording;
    VChannelNumbering m_Numbering; // changes in the constructor only
};

} // namespace Channels
