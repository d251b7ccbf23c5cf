#include "Recordings/OpenRecording.h"

#include "Recordings/C3dReader.h"
#include "Recordings/FileBytes.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Recordings
{

namespace
{

/// One kind of file.
struct Reader
{
    std::string_view Ending; ///< small letters, with the dot
    bool (*pLooksLike)(std::span<const std::byte> i_File);
    TQL::IResult (*pRead)(std::span<const std::byte> i_File, VRecording& o_rRecording, std::string& o_rError);
};

constexpr std::array Readers{Reader{".c3d", LooksLikeC3d, ReadC3d}};
constexpr std::string_view KnownKinds = "C3D (.c3d)";

std::string EndingOf(const std::filesystem::path& i_rPath)
{
    std::string ending = i_rPath.extension().string();
    for (char& rCharacter : ending)
        if (rCharacter >= 'A' && rCharacter <= 'Z')
            rCharacter = static_cast<char>(rCharacter - 'A' + 'a');
    return ending;
}

const Reader* ChooseReader(std::span<const std::byte> i_File, const std::filesystem::path& i_rPath)
{
    const auto byContent = std::find_if(Readers.begin(), Readers.end(),
                                        [&](const Reader& i_rReader) { return i_rReader.pLooksLike(i_File); });
    if (byContent != Readers.end())
        return &*byContent;
    const std::string ending = EndingOf(i_rPath);
    const auto byEnding = std::find_if(Readers.begin(), Readers.end(),
                                       [&](const Reader& i_rReader) { return i_rReader.Ending == ending; });
    return byEnding == Readers.end() ? nullptr : &*byEnding;
}

TQL::IResult ReadAny(const std::filesystem::path& i_rPath, VRecording& o_rRecording, std::string& o_rError)
{
    std::vector<std::byte> bytes;
    if (const TQL::IResult result = ReadFileBytes(i_rPath, bytes, o_rError); result.IsError())
        return result;
    if (const Reader* pReader = ChooseReader(bytes, i_rPath))
        return pReader->pRead(bytes, o_rRecording, o_rError);
    o_rError = "this kind of file is not known. Files that can be opened: " + std::string(KnownKinds) + ".";
    return TQL::Result::NotSupported;
}

} // namespace

TQL::IResult OpenRecording(const std::filesystem::path& i_rPath, VRecording& o_rRecording, std::string& o_rError)
{
    VRecording recording;
    const TQL::IResult result = ReadAny(i_rPath, recording, o_rError);
    if (result.IsError())
    {
        o_rError = FileMessage(i_rPath, o_rError);
        return result;
    }
    recording.Name = i_rPath.stem().string();
    o_rRecording = std::move(recording);
    return result;
}

} // namespace Recordings
