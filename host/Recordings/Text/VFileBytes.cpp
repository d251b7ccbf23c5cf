#include "Recordings/Text/VFileBytes.h"

#include <cstdint>
#include <fstream>
#include <limits>
#include <new>
#include <string_view>
#include <system_error>

namespace Recordings
{

namespace
{

TQL::IResult Refuse(TQL::IResult i_Result, std::string_view i_Sentence, std::string& o_rError)
{
    o_rError = i_Sentence;
    return i_Result;
}

TQL::IResult RefuseMemory(std::string& o_rError)
{
    return Refuse(TQL::Result::AllocationFailure,
                  "the file does not fit into memory. Close other programs or choose a shorter recording.", o_rError);
}

TQL::IResult RefuseOpening(std::string& o_rError)
{
    return Refuse(TQL::Result::FileNotOpen, "the file cannot be opened. Check that you may read it.", o_rError);
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

std::string Utf8Of(const std::filesystem::path& i_rPath)
{
    const std::u8string text = i_rPath.u8string();
    return {text.begin(), text.end()};
}

} // namespace

TQL::IResult VFileBytes::Open(const std::filesystem::path& i_rPath, std::string& o_rError)
{
    if (const TQL::IResult result = CheckKindOfFile(i_rPath, o_rError); result.IsError())
        return result;
    std::error_code error;
    const std::uintmax_t size = std::filesystem::file_size(i_rPath, error);
    if (error)
        return RefuseOpening(o_rError);
    if (size == 0)
        return Refuse(TQL::Result::InvalidFormat, "the file is empty. Copy it again from where it came.", o_rError);
    if (size > static_cast<std::uintmax_t>(std::numeric_limits<std::ptrdiff_t>::max()))
        return RefuseMemory(o_rError);
    if (size > LargestLoaded && Map(i_rPath))
        return TQL::Result::Ok;
    return Load(i_rPath, static_cast<std::size_t>(size), o_rError); // also where the file system cannot map
}

TQL::IResult VFileBytes::Load(const std::filesystem::path& i_rPath, std::size_t i_Size, std::string& o_rError)
{
    try
    {
        std::ifstream stream(i_rPath, std::ios::binary);
        if (!stream)
            return RefuseOpening(o_rError);
        m_Loaded.resize(i_Size);
        stream.read(reinterpret_cast<char*>(m_Loaded.data()), static_cast<std::streamsize>(i_Size));
        if (static_cast<std::size_t>(stream.gcount()) != i_Size)
            return Refuse(TQL::Result::FileIOFailure,
                          "the file could not be read to its end. Check the disk or the network and try again.",
                          o_rError);
        m_Bytes = m_Loaded;
        return TQL::Result::Ok;
    }
    catch (const std::bad_alloc&)
    {
        return RefuseMemory(o_rError);
    }
}

bool VFileBytes::Map(const std::filesystem::path& i_rPath)
{
    const TQL::IResult result =
        m_Mapped.Open(Utf8Of(i_rPath), 0, UtilsFileSystem::VMemoryMappedInputFile::OptionSequential);
    const auto [bytes, bWhole] = m_Mapped.GetWholeFile();
    if (result.IsError() || !bWhole || bytes.empty())
    {
        m_Mapped.Close();
        return false;
    }
    m_Mapped.GuardViews();
    m_Bytes = bytes;
    return true;
}

} // namespace Recordings
