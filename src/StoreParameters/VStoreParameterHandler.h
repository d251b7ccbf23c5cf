#pragma once

#include "StoreInterface/EntryPath.h"
#include "StoreInterface/IStore.h"
#include "StoreParameters/IStoreParameterHandler.h"
#include "StoreParameters/VStoreParameterGroup.h"
#include "TQL/VShared.h"

#include <memory>
#include <mutex>
#include <string>

namespace Store
{

/// Binds one object, for example a channel, to its subtree of a store. Derived classes say what their parameters are
/// and write the root's value, which is what makes the object present. Owned by that object; keeps the store alive.
/// While it lives, until Remove, it is the active handler of its path; a second one logs an error and works all the
/// same.
class VStoreParameterHandler : public TQL::IStoreParameterHandler, public TQL::VShared
{
public:
    VStoreParameterHandler(std::shared_ptr<TQL::IStore> i_pStore, EntryPath i_Root, std::string i_Name,
                           std::string i_TypeName);
    ~VStoreParameterHandler() override;
    VStoreParameterHandler(const VStoreParameterHandler&) = delete;
    VStoreParameterHandler& operator=(const VStoreParameterHandler&) = delete;

    bool IsPresent(const TQL::IStoreReader& i_rReader) const override;
    TQL::IResult Remove(TQL::IStoreWriter& io_rWriter) override;
    TQL::IResult RemoveAndClear(TQL::IStoreWriter& io_rWriter) override;
    TQL::IResult BuildParameters(VStoreParameterBuilder& io_rBuilder) override;
    std::string GetTypeName() const override { return m_TypeName; }
    std::string GetName() const override { return m_Name; }
    std::shared_ptr<TQL::IStoreParameterGroup> GetGroup() override { return Group(); }
    using TQL::IStoreParameterHandler::LoadParameters;
    TQL::IResult LoadParameters(const TQL::IStoreReader& i_rReader) override;

    const EntryPath& GetRootPath() const { return m_Root; }

protected:
    TQL::IStore& GetStore() const { return *m_pStore; }

private:
    std::shared_ptr<VStoreParameterGroup> Group();

    const std::shared_ptr<TQL::IStore> m_pStore;
    const EntryPath m_Root;
    const std::string m_Name;
    const std::string m_TypeName;
    std::mutex m_Mutex;
    std::shared_ptr<void> m_pActive;                // guarded by m_Mutex; held while the active handler of the path
    std::shared_ptr<VStoreParameterGroup> m_pGroup; // guarded by m_Mutex; made on first need
};

} // namespace Store
