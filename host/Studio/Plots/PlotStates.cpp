#include "Studio/Plots/PlotStates.h"

#include "OrvanePluginInterface/IWorkspaceContent.h"
#include "Store/VStore.h"
#include "StoreIO/VStoreExporterJson.h"
#include "StoreIO/VStoreImporterJson.h"
#include "StoreInterface/ScopedAccess.h"
#include "Studio/Common/Paths.h"
#include "TQL/Log.h"
#include "TQL/VShared.h"

#include <QtWidgets/QWidget>

#include <string>

namespace Studio
{

namespace
{

using OrvanePluginInterface::IOrvaneWindowPersist;

Store::EntryPath PathOf(std::size_t i_Number)
{
    return Store::EntryPath("Windows") / std::to_string(i_Number);
}

void LogWarning(const char* i_pFormat, const std::filesystem::path& i_rFile, const TQL::IResult& i_rResult)
{
    TQL::Log::Format(TQL::Log::GetCategory("Studio"), TQL::ELogSeverity::Warning, i_pFormat, TextFromPath(i_rFile),
                     i_rResult.Description());
}

} // namespace

void SavePlotStates(const std::filesystem::path& i_rFile, const std::vector<QWidget*>& i_rContents)
{
    const auto pStore = TQL::MakeShared<Store::VStore>();
    bool bAny = false;
    {
        const TQL::ScopedWrite writer(*pStore);
        for (std::size_t i = 0; i < i_rContents.size(); ++i)
            if (auto* pPersist = dynamic_cast<IOrvaneWindowPersist*>(i_rContents[i]))
            {
                bAny = true;
                if (const TQL::IResult result = pPersist->SaveWindowState(*writer, PathOf(i)); result.IsError())
                    LogWarning("A window's state was not saved in full in %1%: %2%", i_rFile, result);
            }
    }
    if (!bAny)
        return;
    StoreIO::VStoreExporterJson exporter;
    {
        const TQL::ScopedRead reader(*pStore);
        if (const TQL::IResult result = exporter.Export(*reader); result.IsError())
            LogWarning("The states of the windows were not saved in full in %1%: %2%", i_rFile, result);
    }
    const TQL::IResult written = exporter.WriteToFile(TextFromPath(i_rFile), UtilsFileSystem::EWriteMode::Overwrite);
    if (written.IsError())
        LogWarning("The states of the windows were not saved in %1%: %2%", i_rFile, written);
}

std::shared_ptr<TQL::IStore> ReadPlotStates(const std::filesystem::path& i_rFile)
{
    StoreIO::VStoreImporterJson importer;
    const TQL::IResult read = importer.ReadFile(TextFromPath(i_rFile));
    if (read == TQL::Result::FileNotFound)
        return nullptr;
    const std::shared_ptr<TQL::IStore> pStore = TQL::MakeShared<Store::VStore>();
    TQL::IResult result = read;
    if (read.IsSuccess())
    {
        const TQL::ScopedWrite writer(*pStore);
        result = importer.Import(*writer);
    }
    if (result.IsError())
        LogWarning("The states of the windows in %1% cannot all be used: %2%", i_rFile, result);
    return read.IsSuccess() ? pStore : nullptr;
}

bool LoadPlotState(TQL::IStore& i_rStates, std::size_t i_Number, QWidget& o_rContent)
{
    auto* pPersist = dynamic_cast<IOrvaneWindowPersist*>(&o_rContent);
    if (!pPersist)
        return false;
    const TQL::ScopedRead reader(i_rStates);
    return pPersist->LoadWindowState(*reader, PathOf(i_Number));
}

} // namespace Studio
