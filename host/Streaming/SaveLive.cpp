#include "Streaming/SaveLive.h"

#include "Channels/Contexts/VChannelContext.h"
#include "Recordings/C3d/C3dWriter.h"
#include "Streaming/LiveRecording.h"

namespace Streaming
{

TQL::IResult SaveAsC3d(const Channels::VChannelContext& i_rContext, const std::filesystem::path& i_rPath,
                       std::vector<std::string>& o_rRemarks, std::string& o_rError)
{
    const auto chosen = ChooseForC3d(i_rContext, o_rRemarks);
    Recordings::VRecording recording = CopyContext(i_rContext, [&](const Channels::VSourceChannel& i_rChannel)
                                                   { return chosen.contains(&i_rChannel); });
    if (recording.Channels.empty() || recording.Range.IsEmpty())
    {
        o_rError = "there are no live data yet to save";
        return TQL::Result::NotAvailable;
    }
    FitToC3d(recording, o_rRemarks);
    return Recordings::WriteC3d(recording, i_rPath, o_rError);
}

} // namespace Streaming
