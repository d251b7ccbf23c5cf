// Any bytes as a table of text: the first byte chooses the reader and whether uneven times are resampled. Nothing may
// crash, what is refused is refused in one sentence, and what is read holds together and is no larger than its rules
// say.

#include "RecordingChecks.h"

#include "Recordings/Tables/CsvReader.h"
#include "Recordings/Tables/StorageTableReader.h"
#include "Recordings/Tables/TrcReader.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* i_pBytes, std::size_t i_Count)
{
    if (i_Count == 0)
        return 0;
    const auto file = std::as_bytes(std::span(i_pBytes + 1, i_Count - 1));
    Recordings::ReadOptions options;
    options.bResample = (i_pBytes[0] & 4) != 0;
    Recordings::VRecording recording;
    std::string error;
    const unsigned reader = i_pBytes[0] & 3u;
    const TQL::IResult result = reader == 0   ? Recordings::ReadTrc(file, options, recording, error)
                                : reader == 1 ? Recordings::ReadStorageTable(file, options, recording, error)
                                              : Recordings::ReadCsv(file, options, recording, error);
    if (result.IsSuccess())
        Fuzz::CheckRecording(recording, 10 * i_Count + (std::size_t{4} << 20));
    else
        Fuzz::CheckRefusal(error);
    return 0;
}
