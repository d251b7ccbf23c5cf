#include "Recordings/FileFormats.h"

#include "Recordings/Bvh/BvhReader.h"
#include "Recordings/C3d/C3dReader.h"
#include "Recordings/Tables/CsvReader.h"
#include "Recordings/Tables/StorageTableReader.h"
#include "Recordings/Tables/TrcReader.h"
#include "Recordings/Text/C3dText.h"

#include <algorithm>
#include <array>

namespace Recordings
{

namespace
{

constexpr std::array<std::string_view, 1> C3dEndings{".c3d"};
constexpr std::array<std::string_view, 1> BvhEndings{".bvh"};
constexpr std::array<std::string_view, 1> TrcEndings{".trc"};
constexpr std::array<std::string_view, 1> StoEndings{".sto"};
constexpr std::array<std::string_view, 1> MotEndings{".mot"};
constexpr std::array<std::string_view, 4> CsvEndings{".csv", ".tsv", ".txt", ".dat"};

// Of two that look alike the one with the right ending is taken, else the first.
constexpr std::array Formats{
    FileFormat{"C3D", C3dEndings, "markers, model outputs, analog channels, events", LooksLikeC3d, ReadC3d},
    FileFormat{"BVH", BvhEndings, "skeletons with their joint angles", LooksLikeBvh, ReadBvh},
    FileFormat{"TRC", TrcEndings, "markers", LooksLikeTrc, ReadTrc},
    FileFormat{"STO", StoEndings, "columns over time", LooksLikeStorageTable, ReadStorageTable},
    FileFormat{"MOT", MotEndings, "columns over time, mostly joint angles or forces", LooksLikeStorageTable,
               ReadStorageTable},
    FileFormat{"CSV", CsvEndings, "any table of numbers", nullptr, ReadCsv}};

std::string Join(std::span<const std::string_view> i_Texts)
{
    std::string joined;
    for (const std::string_view text : i_Texts)
        joined.append(joined.empty() ? "" : ", ").append(text);
    return joined;
}

} // namespace

std::span<const FileFormat> GetFileFormats()
{
    return Formats;
}

std::string ListFormatNames()
{
    std::array<std::string_view, Formats.size()> names;
    std::ranges::transform(Formats, names.begin(), &FileFormat::Name);
    return Join(names);
}

std::string ListFormatsWithEndings()
{
    std::string text;
    for (const FileFormat& rFormat : Formats)
        text += (text.empty() ? "" : ", ") + std::string(rFormat.Name) + " (" + Join(rFormat.Endings) + ")";
    return text;
}

std::string DescribeFormats()
{
    constexpr std::size_t column = 24;
    std::string text;
    for (const FileFormat& rFormat : Formats)
    {
        std::string line = "  " + std::string(rFormat.Name) + "  " + Join(rFormat.Endings);
        line.resize(std::max(column, line.size() + 2), ' ');
        text += line.append(rFormat.About) + "\n";
    }
    return text;
}

std::string ListFilePatterns()
{
    std::string text;
    for (const FileFormat& rFormat : Formats)
        for (const std::string_view ending : rFormat.Endings)
            text += (text.empty() ? "*" : " *") + std::string(ending) + " *" + C3dCapitals(ending);
    return text;
}

} // namespace Recordings
