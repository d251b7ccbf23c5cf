#pragma once

#include "UtilsFileSystem/FileIO.h"
#include "UtilsFileSystem/ProtectedFileIO.h"

#include <iterator>
#include <string>

namespace TestUtilsFileSystem
{

/// A writer of a text, as an application would have it.
inline UtilsFileSystem::FileCallback Writer(const std::string& i_rText)
{
    return [i_rText](const std::string& i_rPath) -> TQL::IResult
    {
        auto [pFile, result] = UtilsFileSystem::OpenOutputFile(i_rPath, UtilsFileSystem::EOpenMode::Binary, true);
        if (result.IsError())
            return result;
        result = pFile->Write(std::as_bytes(std::span(i_rText)));
        const TQL::IResult closed = pFile->Close();
        return result.IsError() ? result : closed;
    };
}

/// What a protected load reads, or "no file".
inline std::string LoadText(const std::string& i_rPath)
{
    std::string text = "no file";
    const auto reader = [&](const std::string& i_rMain)
    {
        auto [pFile, result] = i_rMain == i_rPath
                                   ? UtilsFileSystem::OpenInputFileStream(i_rMain, UtilsFileSystem::EOpenMode::Binary)
                                   : std::pair(std::unique_ptr<std::ifstream>(), TQL::Result::InvalidArgument);
        if (pFile)
            text.assign(std::istreambuf_iterator<char>(*pFile), {});
        return result;
    };
    const TQL::IResult result = UtilsFileSystem::ProtectedLoad(reader, i_rPath);
    const bool bFound = result == TQL::Result::Ok;
    return bFound || result == TQL::Result::FileNotFound ? text : std::string(result.Name());
}

} // namespace TestUtilsFileSystem
