#include "Recordings/OpenRecording.h"

#include "Recordings/Common/FileMessage.h"
#include "Recordings/Common/VReadProgress.h"
#include "Recordings/FileFormats.h"
#include "Recordings/Tables/CsvReader.h"
#include "Recordings/Text/TextScan.h"
#include "Recordings/Text/VFileBytes.h"

#include <algorithm>
#include <cstddef>
#include <span>
#include <string>
#include <string_view>
#include <system_error>
#include <utility>

namespace Recordings
{

namespace
{

using Bytes = std::span<const std::byte>;

std::string EndingOf(const std::filesystem::path& i_rPath)
{
    return SmallLetters(i_rPath.extension().string());
}

const FileFormat* ChooseFormat(Bytes i_File, const std::string& i_rEnding)
{
    const std::span<const FileFormat> formats = GetFileFormats();
    const auto endsLike = [&](const FileFormat& i_rFormat)
    {
        return std::ranges::find(i_rFormat.Endings, i_rEnding) != i_rFormat.Endings.end();
    };
    const FileFormat* pByContent = nullptr;
    for (const FileFormat& rFormat : formats)
        if ((!pByContent || endsLike(rFormat)) && rFormat.pLooksLike && rFormat.pLooksLike(i_File))
            pByContent = &rFormat;
    if (pByContent)
        return pByContent;
    const auto byEnding = std::ranges::find_if(formats, endsLike);
    if (byEnding != formats.end())
        return &*byEnding;
    return LooksLikeCsv(i_File) ? &formats.back() : nullptr;
}

/// Stands between a reader and the one who waits for its file: gives the memory of what was read back now and then, and
/// stops the reading of a file that was shortened.
class VFileMinder
{
public:
    VFileMinder(VFileBytes& i_rFile, VReadProgress* i_pOuter)
        : m_rFile(i_rFile)
        , m_pOuter(i_pOuter)
        , m_Progress([this](double i_Fraction) { return Mind(i_Fraction); }, i_pOuter ? i_pOuter->StopFlag() : nullptr)
    {
    }

    VReadProgress& Progress() { return m_Progress; }

private:
    static constexpr double BytesHeld = 4 << 20; ///< of progress; a first pass to count rows reads ten times as much
    static constexpr std::size_t Whole = std::size_t{1} << 30;

    bool Mind(double i_Fraction)
    {
        if (!m_rFile.IsWhole())
            return false;
        const double done = i_Fraction * static_cast<double>(m_rFile.GetBytes().size());
        if (done >= m_Forgotten + std::min(BytesHeld, static_cast<double>(m_rFile.GetBytes().size()) / 16.0))
        {
            m_rFile.Forget();
            m_Forgotten = done;
        }
        return TellProgress(m_pOuter, static_cast<std::size_t>(i_Fraction * static_cast<double>(Whole)), Whole);
    }

    VFileBytes& m_rFile;
    VReadProgress* const m_pOuter;
    VReadProgress m_Progress;
    double m_Forgotten = 0.0; ///< bytes that were read when memory was given back last
};

TQL::IResult ReadAny(const std::filesystem::path& i_rPath, const ReadOptions& i_rOptions, VRecording& o_rRecording,
                     std::string& o_rError)
{
    VFileBytes file;
    if (const TQL::IResult result = file.Open(i_rPath, o_rError); result.IsError())
        return result;
    if (const FileFormat* pFormat = ChooseFormat(file.GetBytes(), EndingOf(i_rPath)))
    {
        VFileMinder minder(file, i_rOptions.pProgress);
        ReadOptions options = i_rOptions;
        options.pProgress = &minder.Progress();
        const TQL::IResult result = pFormat->pRead(file.GetBytes(), options, o_rRecording, o_rError);
        if (!file.IsWhole())
        {
            o_rError = "the file became shorter while it was read. Wait until it is written, and open it again.";
            return TQL::Result::FileIOFailure;
        }
        o_rRecording.Format = pFormat->Name; // one format may stand there under two names
        return result;
    }
    o_rError = "this kind of file is not known. Files that can be opened: " + ListFormatsWithEndings() + ".";
    return TQL::Result::NotSupported;
}

} // namespace

TQL::IResult OpenRecording(const std::filesystem::path& i_rPath, VRecording& o_rRecording, std::string& o_rError,
                           const ReadOptions& i_rOptions)
{
    VRecording recording;
    const TQL::IResult result = ReadAny(i_rPath, i_rOptions, recording, o_rError);
    if (result.IsError())
    {
        o_rError = FileMessage(i_rPath, o_rError);
        return result;
    }
    recording.Name = i_rPath.stem().string();
    o_rRecording = std::move(recording);
    return result;
}

bool IsRecordingFile(const std::filesystem::path& i_rPath)
{
    std::error_code error;
    VFileBytes file;
    std::string ignored;
    if (!std::filesystem::is_regular_file(i_rPath, error) || file.Open(i_rPath, ignored).IsError())
        return false;
    return std::ranges::any_of(GetFileFormats(), [&](const FileFormat& i_rFormat)
                               { return i_rFormat.pLooksLike && i_rFormat.pLooksLike(file.GetBytes()); });
}

} // namespace Recordings
