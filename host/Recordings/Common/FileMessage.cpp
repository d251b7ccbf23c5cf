#include "Recordings/Common/FileMessage.h"

#include <algorithm>

namespace Recordings
{

std::string FileMessage(const std::filesystem::path& i_rPath, std::string_view i_Sentence)
{
    std::string message = i_rPath.filename().empty() ? i_rPath.string() : i_rPath.filename().string();
    const auto isControl = [](char i_Character)
    {
        return static_cast<unsigned char>(i_Character) < 0x20;
    };
    std::replace_if(message.begin(), message.end(), isControl, ' ');
    return message.append(": ").append(i_Sentence);
}

} // namespace Recordings
