#pragma once

#include "StoreIO/VStoreExporterJson.h"
#include "TQL/IPostalService.h"
#include "TQL/VShared.h"

#include <memory>
#include <string>

namespace StoreIO
{
class IStoreImporter;
}

namespace TQL
{
class IHandlerCallback;
class IStore;
} // namespace TQL

namespace Services
{

/// The operator's preferences: a store that is read from a file when it is made, and saved when it changes and at the
/// end. The file holds what the operator chose: persistable values that are no defaults, of whichever module. A file
/// with faults is moved aside (".broken" is appended to its name) with one line in the log, and what could be read of
/// it stays. Made by TQL::MakeShared and owned by the host services. UI thread, but for the store itself.
class VPreferencesStore : public TQL::VShared
{
public:
    /// The path in UTF-8; empty: kept in memory only. Changes are saved on the postal service, a burst of them once.
    VPreferencesStore(std::string i_Path, std::shared_ptr<TQL::IPostalService> i_pUiPostalService);
    ~VPreferencesStore() override; ///< saves

    const std::shared_ptr<TQL::IStore>& GetStore() const { return m_pStore; }

protected:
    void OnPostCreation() override;

private:
    void Load();
    TQL::IResult Import(StoreIO::IStoreImporter& i_rImporter);
    void MoveAside();
    void LogUnusable(TQL::IResult i_Why) const;
    StoreIO::VStoreExporterJson Export() const;
    void Save();

    const std::string m_Path;
    const std::shared_ptr<TQL::IPostalService> m_pUiPostalService;
    const std::shared_ptr<TQL::IStore> m_pStore;
    bool m_bSaves = false;
    StoreIO::VStoreExporterJson m_Saved; ///< what the file holds
    std::shared_ptr<TQL::IHandlerCallback> m_pHandler;
};

} // namespace Services
