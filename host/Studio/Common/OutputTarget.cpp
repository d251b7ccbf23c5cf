#include "Studio/Common/OutputTarget.h"

#include "Recordings/OpenRecording.h"
#include "Studio/Common/Paths.h"

#include <system_error>

namespace Studio
{

bool MayWrite(const std::filesystem::path& i_rTarget, const std::filesystem::path& i_rSource, bool i_bForce,
              std::string& o_rError)
{
    std::error_code error;
    if (!i_rSource.empty() && std::filesystem::equivalent(i_rTarget, i_rSource, error))
    {
        o_rError = TextFromPath(i_rTarget) + ": this is the recording that is read; write to another file";
        return false;
    }
    if (i_bForce || !Recordings::IsRecordingFile(i_rTarget))
        return true;
    o_rError = TextFromPath(i_rTarget) +
               ": there is a recording of that name; write to another file, or replace it with "
               "--force";
    return false;
}

} // namespace Studio
