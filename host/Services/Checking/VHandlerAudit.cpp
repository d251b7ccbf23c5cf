#include "Services/Checking/VHandlerAudit.h"

#include "Services/Common/VHostSubscriptions.h"
#include "Store/VStore.h"

namespace Services
{
namespace
{

using Handlers = std::vector<std::shared_ptr<Store::VHandlerCallback>>;

Handlers LivingHandlers(const TQL::IStore& i_rStore)
{
    const auto* pStore = dynamic_cast<const Store::VStore*>(&i_rStore);
    return pStore ? pStore->GetHandlers() : Handlers();
}

/// The entries and patterns that a handler watches.
std::string Watched(const TQL::IStore& i_rStore, const Store::HandlerKey& i_rKey)
{
    std::string text;
    const auto add = [&text](const Store::EntryPath& i_rPath)
    {
        text += (text.empty() ? "\"" : ", \"") + i_rPath.Text() + "\"";
    };
    for (const Store::EntryHandle entry : i_rKey.Entries)
        add(i_rStore.GetEntryPath(entry));
    for (const Store::EntryPath& rPattern : i_rKey.Patterns)
        add(rPattern);
    return text;
}

} // namespace

VHandlerAudit::VHandlerAudit(std::shared_ptr<TQL::IStore> i_pStore,
                             std::shared_ptr<const VHostSubscriptionLedger> i_pLedger)
    : m_pStore(std::move(i_pStore)), m_pLedger(std::move(i_pLedger))
{
    for (const auto& rpHandler : LivingHandlers(*m_pStore))
        m_Before.insert(rpHandler.get());
}

std::vector<std::string> VHandlerAudit::Leftovers() const
{
    std::vector<std::string> texts;
    for (const auto& rpHandler : LivingHandlers(*m_pStore))
        if (!m_Before.contains(rpHandler.get()) && m_pLedger->Count(rpHandler.get()) == 0)
            texts.push_back("IStore::GetHandlerCallback: the plug-in still holds the handler of " +
                            Watched(*m_pStore, rpHandler->Key()) + ", with " +
                            std::to_string(rpHandler->GetTotalSubscriptionCount()) + " subscriber(s)");
    return texts;
}

} // namespace Services
