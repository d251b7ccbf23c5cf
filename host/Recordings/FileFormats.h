#pragma once

#include "Recordings/Common/ReadOptions.h"
#include "Recordings/Common/VRecording.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <span>
#include <string>
#include <string_view>

namespace Recordings
{

/// One kind of motion file: everything that is known of it outside of its reader.
struct FileFormat
{
    std::string_view Name;                                 ///< "C3D"; also the Format of its recordings
    std::span<const std::string_view> Endings;             ///< small letters, with the dot
    std::string_view About;                                ///< a few words on what it holds
    bool (*pLooksLike)(std::span<const std::byte> i_File); ///< null where the content has no mark of its own
    TQL::IResult (*pRead)(std::span<const std::byte> i_File, const ReadOptions& i_rOptions, VRecording& o_rRecording,
                          std::string& o_rError);
};

/// All that can be opened, in the order in which they are listed. The last one takes any text with rows of numbers.
std::span<const FileFormat> GetFileFormats();

/// "C3D, BVH, TRC".
std::string ListFormatNames();

/// "C3D (.c3d), CSV (.csv, .tsv)".
std::string ListFormatsWithEndings();

/// A line for each format, indented, with its endings and what it holds.
std::string DescribeFormats();

/// For a dialog of files: "*.c3d *.C3D *.bvh *.BVH".
std::string ListFilePatterns();

} // namespace Recordings
