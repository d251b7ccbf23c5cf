#include "StoreIO/VStoreImporterJson.h"

#include "StoreIO/BoundedJson.h"
#include "StoreIO/FormatVersion.h"
#include "StoreIO/StoreIOLog.h"
#include "StoreIO/VImportWalk.h"
#include "UtilsFileSystem/FileIO.h"
#include "UtilsFileSystem/ProtectedFileIO.h"
#include "UtilsFileSystem/VMemoryMappedInputFile.h"

#include <utility>

namespace StoreIO
{
namespace
{

JsonReadResult ReadUnmapped(const std::string& i_rPath, rapidjson::Document& o_rDocument)
{
    const auto [pFile, opened] = UtilsFileSystem::OpenInputFile(i_rPath, UtilsFileSystem::EOpenMode::Binary);
    if (opened.IsError())
        return {opened, {}};
    UtilsFileSystem::VFileInputStreamVirtual stream(std::move(*pFile));
    return ReadJson(stream, o_rDocument);
}

JsonReadResult ReadMapped(const std::string& i_rPath, rapidjson::Document& o_rDocument)
{
    UtilsFileSystem::VMemoryMappedInputStreamVirtual file;
    const TQL::IResult opened = file.Open(i_rPath, 0, UtilsFileSystem::VMemoryMappedInputFile::OptionSequential);
    if (opened == TQL::Result::NotSupported)
        return ReadUnmapped(i_rPath, o_rDocument);
    if (opened.IsError())
        return {opened, {}};
    file.GuardViews();
    const auto [bytes, bWhole] = file.GetFile().GetWholeFile();
    JsonReadResult result = bWhole ? ReadJson(bytes, o_rDocument) : ReadJson(file, o_rDocument);
    if (file.IsStillWhole())
        return result;
    o_rDocument.SetNull();
    return {TQL::Result::FileIOFailure, "Another program shortened the file while it was read."};
}

TQL::IResult WithoutRemark(TQL::IResult i_Result)
{
    return i_Result.IsError() ? i_Result : TQL::Result::Ok;
}

} // namespace

TQL::IResult VStoreImporterJson::ReadFile(const std::string& i_rPath)
{
    m_Document.SetNull();
    const auto read = [&](const std::string& i_rFile)
    {
        const JsonReadResult result = ReadMapped(i_rFile, m_Document);
        if (!result.Problem.empty())
            LogError("Error reading document %1%: %2%", i_rFile, result.Problem);
        return result.Result;
    };
    return WithoutRemark(UtilsFileSystem::ProtectedLoad(read, i_rPath));
}

TQL::IResult VStoreImporterJson::ReadStream(TQL::IInputStream& i_rStream)
{
    const JsonReadResult result = ReadJson(i_rStream, m_Document);
    if (!result.Problem.empty())
        LogError("Error reading document: %1%", result.Problem);
    return WithoutRemark(result.Result);
}

TQL::IResult VStoreImporterJson::Import(TQL::IStoreWriter& i_rWriter)
{
    if (!m_Document.IsObject())
        return TQL::Result::InvalidFormat;
    if (m_Document.ObjectEmpty())
        return TQL::Result::FileNotOpen;
    if (!HasSupportedVersion(m_Document))
        return TQL::Result::InvalidVersion;
    VImportWalk walk(i_rWriter);
    walk.ReadRoot(m_Document);
    for (const std::string& rMessage : walk.Messages())
        LogError("%1%", rMessage);
    return walk.Messages().empty() ? TQL::Result::Ok : TQL::Result::Failed;
}

} // namespace StoreIO
