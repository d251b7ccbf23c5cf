#include "UtilsFileSystem/FileResult.h"
#include "UtilsFileSystem/ProtectedText.h"
#include "UtilsFileSystem/TestFolder.h"
#include "UtilsFileSystem/Windows/System.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

namespace TestUtilsFileSystem
{
namespace
{

using namespace UtilsFileSystem;

HANDLE Hold(const std::string& i_rPath, DWORD i_Share)
{
    return ::CreateFileW(System::Wide(i_rPath).c_str(), GENERIC_READ, i_Share, nullptr, OPEN_EXISTING, 0, nullptr);
}

TEST(WindowsFiles, AFileHeldByAnotherIsNotPermittedAndStaysWhole)
{
    TestSupport::LogGuard log;
    const TestFolder folder;
    folder.Set("m=M");
    const std::string path = folder / "m";
    {
        const System::Handle held(Hold(path, 0));
        ASSERT_TRUE(held.IsOpen());
        EXPECT_EQ(OpenInputFile(path, EOpenMode::Binary).second, TQL::Result::NotPermitted);
        EXPECT_EQ(OpenOutputFile(path, EOpenMode::Binary, true).second, TQL::Result::NotPermitted);
        EXPECT_EQ(OpenInputFileStream(path, EOpenMode::Binary).second, TQL::Result::NotPermitted);
        EXPECT_EQ(OpenOutputFileStream(path, EOpenMode::Binary, true).second, TQL::Result::NotPermitted);
        EXPECT_EQ(OpenBestInputStream(path, 0, 0).second, TQL::Result::NotPermitted);
        EXPECT_EQ(RemoveFile(path), TQL::Result::NotPermitted);
        EXPECT_EQ(ProtectedSave(Writer("S"), path, EWriteMode::Overwrite), TQL::Result::NotPermitted);
    }
    EXPECT_FALSE(log.Take().empty());
    EXPECT_EQ(LoadText(path), "M");
    EXPECT_EQ(ProtectedSave(Writer("S"), path, EWriteMode::Overwrite), TQL::Result::Ok);
    EXPECT_EQ(folder.Show(), "m=S");
    const System::Handle held(Hold(path, FILE_SHARE_READ));
    EXPECT_EQ(LoadText(path), "S") << "readers share";
}

TEST(WindowsFiles, ErrorsStandForTheStandardConditions)
{
    const std::pair<DWORD, TQL::IResult> rows[] = {
        {2, TQL::Result::FileNotFound},      {3, TQL::Result::FileNotFound},     {53, TQL::Result::FileNotFound},
        {5, TQL::Result::NotPermitted},      {32, TQL::Result::NotPermitted},    {33, TQL::Result::NotPermitted},
        {1175, TQL::Result::NotPermitted},   {1176, TQL::Result::NotPermitted},  {1177, TQL::Result::NotPermitted},
        {80, TQL::Result::AlreadyPresent},   {183, TQL::Result::AlreadyPresent}, {87, TQL::Result::InvalidArgument},
        {123, TQL::Result::InvalidArgument}, {50, TQL::Result::NotSupported},    {267, TQL::Result::InvalidType},
        {112, TQL::Result::FileIOFailure},   {1117, TQL::Result::FileIOFailure},
    };
    TestSupport::LogGuard log;
    for (const auto& [code, result] : rows)
        EXPECT_EQ(ResultFromError(System::Win32Error(code)), result) << code;
    EXPECT_EQ(log.Take().size(), 2u);
    EXPECT_FALSE(System::Win32Error(2).message().empty());
}

} // namespace
} // namespace TestUtilsFileSystem
