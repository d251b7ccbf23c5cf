#include "Studio/Session/ContextNames.h"

namespace Studio
{

std::string MakeContextName(const std::string& i_rRecordingName,
                            const std::function<bool(const std::string&)>& i_rIsTaken)
{
    const bool bReserved = i_rRecordingName.empty() || i_rRecordingName == LiveContextName ||
                           i_rRecordingName == "GlobalItems" || i_rRecordingName == "DataStore" ||
                           i_rRecordingName[0] == '#' || i_rRecordingName[0] == '*';
    const std::string name = bReserved ? "Recording " + i_rRecordingName : i_rRecordingName;
    std::string candidate = name;
    for (int number = 2; i_rIsTaken(candidate); ++number)
        candidate = name + " (" + std::to_string(number) + ")";
    return candidate;
}

} // namespace Studio
