#include "StoreParameters/ActiveHandlers.h"

#include "StoreInterface/EntryPath.h"

#include <map>
#include <mutex>
#include <string>
#include <utility>

namespace Store
{
namespace
{

struct ActiveTable
{
    std::mutex Mutex;
    std::map<std::pair<const TQL::IStore*, std::string>, int> CountOf; // guarded by Mutex
};

} // namespace

std::shared_ptr<void> BecomeActiveHandler(const TQL::IStore& i_rStore, const EntryPath& i_rPath, bool& o_rbAnother)
{
    static const auto s_pTable = std::make_shared<ActiveTable>();
    const std::lock_guard lock(s_pTable->Mutex);
    const auto at = s_pTable->CountOf.try_emplace({&i_rStore, i_rPath.Text()}, 0).first;
    o_rbAnother = at->second > 0;
    ++at->second;
    return {nullptr, [pTable = s_pTable, at](void*)
            {
                const std::lock_guard releaseLock(pTable->Mutex);
                if (--at->second == 0)
                    pTable->CountOf.erase(at);
            }};
}

} // namespace Store
