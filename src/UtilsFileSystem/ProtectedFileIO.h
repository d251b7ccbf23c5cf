#pragma once

#include "TQL/IResult.h"

#include <cstdint>
#include <functional>
#include <string>

/// Saves that leave the file whole when they are cut off by a crash or a power failure. A save writes a side file, path
/// + ".new", brings it to the disk and swaps it in; the previous file is path + ".old" during the swap. A load looks at
/// which of the three names exist and repairs before it reads. Of a path that is a symbolic link the file behind it is
/// meant. Two savers of one path at once are not guarded against.
namespace UtilsFileSystem
{

/// Any value other than 0 overwrites.
enum class EWriteMode : std::uint32_t
{
    Exclusive = 0,
    Overwrite = 1
};

/// Called with the path to write or read.
using FileCallback = std::function<TQL::IResult(const std::string&)>;

/// Has i_rWriter write the complete file under the new name, then swaps it in. A failure of the writer, a full disk or,
/// with `Exclusive`, an existing file (`AlreadyPresent`) leave the file as it was. An empty callable throws
/// std::bad_function_call; an empty path gives `FileNotFound`.
TQL::IResult ProtectedSave(const FileCallback& i_rWriter, const std::string& i_rPath, EWriteMode i_Mode);

/// Finishes or undoes an interrupted save, then has i_rReader read the file. The result is the reader's.
TQL::IResult ProtectedLoad(const FileCallback& i_rReader, const std::string& i_rPath);

/// The swap: moves i_rNewPath to i_rPath.
TQL::IResult CompleteProtectedSave(const std::string& i_rPath, const std::string& i_rNewPath, EWriteMode i_Mode);

} // namespace UtilsFileSystem
