#include "Recordings/FileBytes.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <fstream>
#include <limits>
#include <new>
#include <system_error>
#include <utility>

namespace Recordings
{

namespace
{

TQL::IResult Refuse(TQL::IResult i_Result, std::string_view i_Sentence, std::string& o_rError)
{
    o_rError = i_Sentence;
    return i_Result;
}

TQL::IResult CheckKindOfFile(const std::filesystem::path& i_rPath, std::string& o_rError)
{
    std::error_code error;
    const std::filesystem::file_status status = std::filesystem::status(i_rPath, error);
    if (status.type() == std::filesystem::file_type::not_found)
        return Refuse(TQL::Result::FileNotFound, "there is no such file. Check the name and the folder.", o_rError);
    if (status.type() == std::filesystem::file_type::directory)
        return Refuse(TQL::Result::InvalidArgument, "this is a folder. Choose a file in it.", o_rError);
    if (status.type() == std::filesystem::file_type::none || status.type() == std::filesystem::file_type::unknown)
        return Refuse(TQL::Result::FileNotOpen,
                      "the file cannot be reached (" + error.message() + "). Check the permissions of its folder.",
                      o_rError);
    if (status.type() != std::filesystem::file_type::regular)
        return Refuse(TQL::Result::InvalidArgument, "this is not an ordinary file. Choose a recording.", o_rError);
    return TQL::Result::Ok;
}

TQL::IResult ReadStream(std::ifstream& i_rStream, std::uintmax_t i_Size, std::vector<std::byte>& o_rBytes,
                        std::string& o_rError)
{
    std::vector<std::byte> bytes(static_cast<std::size_t>(i_Size));
    i_rStream.read(reinterpret_cast<char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
    if (static_cast<std::uintmax_t>(i_rStream.gcount()) != i_Size)
        return Refuse(TQL::Result::FileIOFailure,
                      "the file could not be read to its end. Check the disk or the network and try again.", o_rError);
    o_rBytes = std::move(bytes);
    return TQL::Result::Ok;
}

} // namespace

TQL::IResult ReadFileBytes(const std::filesystem::path& i_rPath, std::vector<std::byte>& o_rBytes,
                           std::string& o_rError)
{
    if (const TQL::IResult result = CheckKindOfFile(i_rPath, o_rError); result.IsError())
        return result;
    std::error_code error;
    const std::uintmax_t size = std::filesystem::file_size(i_rPath, error);
    std::ifstream stream(i_rPath, std::ios::binary);
    if (error || !stream)
        return Refuse(TQL::Result::FileNotOpen, "the file cannot be opened. Check that you may read it.", o_rError);
    if (size == 0)
        return Refuse(TQL::Result::InvalidFormat, "the file is empty. Copy it again from where it came.", o_rError);
    try
    {
        if (size > static_cast<std::uintmax_t>(std::numeric_limits<std::ptrdiff_t>::max()))
            throw std::bad_alloc();
        return ReadStream(stream, size, o_rBytes, o_rError);
    }
    catch (const std::bad_alloc&)
    {
        return Refuse(TQL::Result::AllocationFailure,
                      "the file does not fit into memory. Close other programs or choose a shorter recording.",
                      o_rError);
    }
}

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
