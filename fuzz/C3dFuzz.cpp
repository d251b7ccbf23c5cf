// Any bytes as a C3D file. Nothing may crash, and what is read is no larger than the file allows.

#include "RecordingChecks.h"

#include "Recordings/C3d/C3dReader.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* i_pBytes, std::size_t i_Count)
{
    const auto file = std::as_bytes(std::span(i_pBytes, i_Count));
    Recordings::VRecording recording;
    std::string error;
    if (Recordings::ReadC3d(file, {}, recording, error).IsSuccess())
        Fuzz::CheckRecording(recording, 8 * i_Count + (std::size_t{1} << 20));
    else
        Fuzz::CheckRefusal(error);
    return 0;
}
