#include "Recordings/OpenRecording.h"

#include "Recordings/BvhReader.h"
#include "Recordings/C3dReader.h"
#include "Recordings/CsvReader.h"
#include "Recordings/FileMessage.h"
#include "Recordings/StorageTableReader.h"
#include "Recordings/TextScan.h"
#include "Recordings/TrcReader.h"
#include "Recordings/VFileBytes.h"
#include "Recordings/VReadProgress.h"

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

using Bytes = std::span<const std::byte>;

/// One kind of file.
struct Reader
{
    std::span<const std::string_view> Endings; ///< small letters, with the dot
    bool (*pLooksLike)(Bytes i_File);          ///< null where the content has no mark of its own
    TQL::IResult (*pRead)(Bytes i_File, const ReadOptions& i_rOptions, VRecording& o_rRecording, std::string& o_rError);
};

constexpr std::array<std::string_view, 1> C3dEndings{".c3d"};
constexpr std::array<std::string_view, 1> BvhEndings{".bvh"};
constexpr std::array<std::string_view, 1> TrcEndings{".trc"};
constexpr std::array<std::string_view, 2> StorageEndings{".mot", ".sto"};
constexpr std::array<std::string_view, 4> CsvEndings{".csv", ".tsv", ".txt", ".dat"};

constexpr std::array Readers{Reader{C3dEndings, LooksLikeC3d, ReadC3d}, Reader{BvhEndings, LooksLikeBvh, ReadBvh},
                             Reader{TrcEndings, LooksLikeTrc, ReadTrc},
                             Reader{StorageEndings, LooksLikeStorageTable, ReadStorageTable},
                             Reader{CsvEndings, nullptr, ReadCsv}};
constexpr std::string_view KnownKinds = "C3D (.c3d), BVH (.bvh), TRC (.trc), MOT (.mot), STO (.sto), "
                                        "CSV (.csv, .tsv, .txt)";

std::string EndingOf(const std::filesystem::path& i_rPath)
{
    return SmallLetters(i_rPath.extension().string());
}

const Reader* ChooseReader(Bytes i_File, const std::string& i_rEnding)
{
    const auto looksLike = [&](const Reader& i_rReader)
    {
        return i_rReader.pLooksLike && i_rReader.pLooksLike(i_File);
    };
    const auto endsLike = [&](const Reader& i_rReader)
    {
        return std::find(i_rReader.Endings.begin(), i_rReader.Endings.end(), i_rEnding) != i_rReader.Endings.end();
    };
    const auto byContent = std::find_if(Readers.begin(), Readers.end(), looksLike);
    if (byContent != Readers.end())
        return &*byContent;
    const auto byEnding = std::find_if(Readers.begin(), Readers.end(), endsLike);
    if (byEnding != Readers.end())
        return &*byEnding;
    return LooksLikeCsv(i_File) ? &Readers.back() : nullptr;
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
    const std::string ending = EndingOf(i_rPath);
    if (const Reader* pReader = ChooseReader(file.GetBytes(), ending))
    {
        VFileMinder minder(file, i_rOptions.pProgress);
        ReadOptions options = i_rOptions;
        options.pProgress = &minder.Progress();
        const TQL::IResult result = pReader->pRead(file.GetBytes(), options, o_rRecording, o_rError);
        if (!file.IsWhole())
        {
            o_rError = "the file became shorter while it was read. Wait until it is written, and open it again.";
            return TQL::Result::FileIOFailure;
        }
        if (o_rRecording.Format == "STO" && ending == ".mot")
            o_rRecording.Format = "MOT"; // the same format under two names
        return result;
    }
    o_rError = "this kind of file is not known. Files that can be opened: " + std::string(KnownKinds) + ".";
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

} // namespace Recordings
