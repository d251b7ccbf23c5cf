#pragma once

#include "Channels/VChannelContext.h"
#include "Recordings/VRecording.h"

#include <memory>
#include <string>

namespace Channels
{

/// An opened recording as a context. Its channels read the samples of the recording where they are, and keep it alive.
/// Subjects, and markers and segments within their subject, are numbered in the order of the file. Nothing ever
/// changes, so RangeChanged is never raised. Any thread.
class VRecordedContext : public VChannelContext
{
public:
    /// The frame period and the sample periods of the recording are above 0; a channel for which that does not hold or
    /// that has no component is left out.
    VRecordedContext(std::string i_Name, std::shared_ptr<VSubTypeTable> i_pSubTypes,
                     std::shared_ptr<const Recordings::VRecording> i_pRecording);

    const std::shared_ptr<const Recordings::VRecording>& GetRecording() const { return m_pRecording; }

    TQL::TickRange GetTickRange() const override { return m_pRecording->Range; }

private:
    const std::shared_ptr<const Recordings::VRecording> m_pRecording;
};

} // namespace Channels
