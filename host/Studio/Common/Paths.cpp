#include "Studio/Common/Paths.h"

#include <system_error>

namespace Studio
{

std::filesystem::path PathFromText(const std::string& i_rText)
{
    return std::filesystem::path(std::u8string(i_rText.begin(), i_rText.end()));
}

std::string TextFromPath(const std::filesystem::path& i_rPath)
{
    const std::u8string text = i_rPath.u8string();
    return std::string(text.begin(), text.end());
}

std::filesystem::path DefaultModulePath(const std::filesystem::path& i_rProgramFolder)
{
    return i_rProgramFolder / "graphplots.so";
}

std::filesystem::path FindSample(const std::filesystem::path& i_rProgramFolder)
{
    constexpr const char* folders[] = {"../../share/graphplots/samples", "../../../samples", "../samples", "samples"};
    for (const char* pFolder : folders)
    {
        const std::filesystem::path path = i_rProgramFolder / pFolder / "walk.c3d";
        std::error_code error;
        if (std::filesystem::is_regular_file(path, error))
            return path.lexically_normal();
    }
    return {};
}

} // namespace Studio
