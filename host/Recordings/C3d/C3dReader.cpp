#include "Recordings/C3d/C3dReader.h"

#include "Recordings/C3d/C3dHeader.h"
#include "Recordings/C3d/C3dLayout.h"
#include "Recordings/C3d/C3dParameters.h"
#include "Recordings/C3d/C3dSamples.h"
#include "Recordings/Common/VReadProgress.h"

#include <algorithm>
#include <cstdint>
#include <new>
#include <string>
#include <utility>
#include <vector>

namespace Recordings
{

namespace
{

// Behind damage nothing more can be read. That is bearable once everything is known that rules the values.
bool HasWhatValuesNeed(const C3dSource& i_rSource)
{
    const auto has = [&](const char* i_pGroup, const char* i_pName)
    {
        return i_rSource.Parameters.Find(i_pGroup, i_pName) != nullptr;
    };
    const bool bPoints = has("POINT", "USED") && has("POINT", "SCALE");
    const bool bAnalog = has("ANALOG", "SCALE") && has("ANALOG", "OFFSET") && has("ANALOG", "GEN_SCALE");
    return bPoints && (i_rSource.Layout.AnalogChannels == 0 || bAnalog);
}

TQL::IResult CheckDamage(const C3dSource& i_rSource, std::vector<std::string>& o_rWarnings, std::string& o_rError)
{
    const std::string& rPlace = i_rSource.Parameters.DamagedBehind();
    if (rPlace.empty())
        return TQL::Result::Ok;
    if (!HasWhatValuesNeed(i_rSource))
    {
        o_rError = "the parameter section is damaged behind " + rPlace +
                   ". Export the file again from the program that made it.";
        return TQL::Result::InvalidFormat;
    }
    o_rWarnings.push_back("The parameter section is damaged behind " + rPlace +
                          "; labels, units and events that "
                          "followed are missing.");
    return TQL::Result::Ok;
}

/// Reads all channels by the block of frames, so that a block is still in the cache when its last channel is read.
/// False when told to stop.
bool ReadChannels(const C3dSource& i_rSource, VReadProgress* i_pProgress, VRecording& io_rRecording)
{
    constexpr std::size_t blockBytes = 128 << 10;
    const C3dLayout& rLayout = i_rSource.Layout;
    AddC3dPoints(i_rSource, io_rRecording);
    const C3dAnalogRules analog = AddC3dAnalog(i_rSource, io_rRecording);
    const std::span<RecordedChannel> channels(io_rRecording.Channels);
    const std::size_t blockFrames =
        std::max<std::size_t>(1, blockBytes / std::max<std::size_t>(1, rLayout.FrameBytes()));
    std::vector<float> scratch;
    for (std::size_t frame = 0; frame < rLayout.Frames; frame += blockFrames)
    {
        if (!TellProgress(i_pProgress, frame, rLayout.Frames))
            return false;
        const C3dFrames frames{frame, std::min(blockFrames, rLayout.Frames - frame)};
        ReadC3dPoints(i_rSource, frames, channels.first(rLayout.Points), scratch);
        ReadC3dAnalog(i_rSource, analog, frames, channels.subspan(rLayout.Points), scratch);
    }
    return TellProgress(i_pProgress, rLayout.Frames, rLayout.Frames);
}

TQL::IResult ReadAll(std::span<const std::byte> i_File, VReadProgress* i_pProgress, VRecording& o_rRecording,
                     std::string& o_rError)
{
    VRecording recording;
    recording.Format = "C3D";
    C3dHeader header;
    if (const TQL::IResult result = ReadC3dHeader(i_File, header, o_rError); result.IsError())
        return result;
    VC3dParameters parameters;
    if (const TQL::IResult result = VC3dParameters::Read(i_File, header, parameters, o_rError); result.IsError())
        return result;
    C3dLayout layout;
    if (const TQL::IResult result =
            FindC3dLayout(i_File.size(), header, parameters, layout, recording.Warnings, o_rError);
        result.IsError())
        return result;
    const C3dSource source{i_File, header, parameters, layout};
    if (const TQL::IResult result = CheckDamage(source, recording.Warnings, o_rError); result.IsError())
        return result;

    recording.FramePeriod = PeriodOfRate(layout.Rate);
    recording.Range.First = (layout.FirstFrame - 1) * recording.FramePeriod;
    recording.Range.Last = recording.Range.First + static_cast<std::int64_t>(layout.Frames) * recording.FramePeriod;
    if (!ReadChannels(source, i_pProgress, recording))
        return StoppedReading(o_rError);
    AddC3dEvents(source, recording);
    o_rRecording = std::move(recording);
    return TQL::Result::Ok;
}

} // namespace

bool LooksLikeC3d(std::span<const std::byte> i_File)
{
    C3dHeader header;
    std::string error;
    return ReadC3dHeader(i_File, header, error).IsSuccess();
}

TQL::IResult ReadC3d(std::span<const std::byte> i_File, const ReadOptions& i_rOptions, VRecording& o_rRecording,
                     std::string& o_rError)
{
    try
    {
        return ReadAll(i_File, i_rOptions.pProgress, o_rRecording, o_rError);
    }
    catch (const std::bad_alloc&)
    {
        o_rError = "the recording does not fit into memory. Close other programs or choose a shorter one.";
        return TQL::Result::AllocationFailure;
    }
}

} // namespace Recordings
