#include "Channels/VChannelService.h"

#include "Channels/Blocks/VCacheChannel.h"
#include "Channels/Derived/VDerivedChannel.h"
#include "Channels/Derived/VOperationTable.h"
#include "TQL/HashMix.h"

#include <algorithm>
#include <mutex>
#include <set>
#include <utility>

namespace Channels
{

namespace
{

std::uint64_t HashId(const TQL::IChannelInstanceId& i_rId)
{
    std::uint64_t hash = TQL::HashMix(0, TQL::HashText(i_rId.DataContextName));
    hash = TQL::HashMix(hash, TQL::HashText(i_rId.TypeName));
    hash = TQL::HashMix(hash, i_rId.First);
    hash = TQL::HashMix(hash, i_rId.Second);
    return TQL::HashMix(hash, TQL::HashText(i_rId.Text));
}

/// A text of the first input, its placeholders replaced as the channel that is named will have them.
std::string DisplayNameOf(const ChannelSystem::VDerivedChannelParameters& i_rRecord,
                          const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs)
{
    TQL::ParameterValue value;
    if (VDerivedParameters(i_rRecord, i_rInputs, [] { return std::string(); })
            .Read("", "TypeDisplayName", value)
            .IsError())
        return {};
    const std::string* pText = std::get_if<std::string>(&value);
    return pText ? *pText : std::string();
}

/// The id of a derived channel: the same in every run for the same operation on the same inputs.
TQL::IChannelInstanceId MakeDerivedId(std::string_view i_Operation, std::uint64_t i_RecordHash,
                                      const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs,
                                      std::string i_DisplayName)
{
    std::uint64_t hash = 0;
    for (const std::shared_ptr<TQL::IChannel>& rpInput : i_rInputs)
        hash = TQL::HashMix(hash, HashId(rpInput->GetInstanceId()));
    return {i_rInputs.front()->GetInstanceId().DataContextName, std::string(i_Operation), i_RecordHash, hash,
            std::move(i_DisplayName)};
}

} // namespace

VChannelService::VChannelService()
    : m_pSubTypes(std::make_shared<VSubTypeTable>())
    , m_pOperations(std::make_shared<VOperationTable>(m_pSubTypes))
    , m_pContextListChanged(std::make_shared<NotificationSystem::VChangeSignal>())
    , m_pTypeListChanged(std::make_shared<NotificationSystem::VChangeSignal>())
{
}

void VChannelService::AddContext(std::shared_ptr<VChannelContext> i_pContext)
{
    std::shared_ptr<VChannelContext> pOld;
    {
        const std::unique_lock lock(m_Mutex);
        std::shared_ptr<VChannelContext>& rpPlace = m_Contexts[i_pContext->GetName()];
        pOld = std::exchange(rpPlace, i_pContext);
    }
    if (pOld && pOld != i_pContext)
        pOld->Retire();
    m_pContextListChanged->Invoke();
    m_pTypeListChanged->Invoke();
}

TQL::IResult VChannelService::RemoveContext(std::string_view i_Name)
{
    std::shared_ptr<VChannelContext> pOld;
    {
        const std::unique_lock lock(m_Mutex);
        const auto context = m_Contexts.find(i_Name);
        if (context == m_Contexts.end())
            return TQL::Result::NotFound;
        pOld = std::move(context->second);
        m_Contexts.erase(context);
    }
    pOld->Retire();
    m_pContextListChanged->Invoke();
    m_pTypeListChanged->Invoke();
    return TQL::Result::Ok;
}

void VChannelService::SetGlobalChannels(std::shared_ptr<VChannelContext> i_pContext)
{
    std::shared_ptr<VChannelContext> pOld;
    {
        const std::unique_lock lock(m_Mutex);
        pOld = std::exchange(m_pGlobal, i_pContext);
    }
    if (pOld == i_pContext)
        return;
    if (pOld)
        pOld->Retire();
    m_pContextListChanged->Invoke();
    m_pTypeListChanged->Invoke();
}

std::shared_ptr<VChannelContext> VChannelService::GetGlobalChannels() const
{
    const std::shared_lock lock(m_Mutex);
    return m_pGlobal;
}

/// Where the channels are that bear a context's name in their ids.
std::shared_ptr<VChannelContext> VChannelService::HomeOf(std::string_view i_ContextName) const
{
    return i_ContextName == GlobalContextName ? GetGlobalChannels() : FindContext(i_ContextName);
}

std::vector<std::shared_ptr<VChannelContext>> VChannelService::GetContexts() const
{
    const std::shared_lock lock(m_Mutex);
    std::vector<std::shared_ptr<VChannelContext>> contexts;
    for (const auto& [name, pContext] : m_Contexts)
        contexts.push_back(pContext);
    return contexts;
}

std::shared_ptr<VChannelContext> VChannelService::FindContext(std::string_view i_Name) const
{
    const std::shared_lock lock(m_Mutex);
    const auto context = m_Contexts.find(i_Name);
    return context == m_Contexts.end() ? nullptr : context->second;
}

std::shared_ptr<ChannelSystem::IChannelContext> VChannelService::GetContextByName(std::string_view i_Name) const
{
    return FindContext(i_Name);
}

std::vector<std::string> VChannelService::GetChannelTypes(std::uint64_t i_Mask, std::string_view i_Context) const
{
    std::vector<std::shared_ptr<VChannelContext>> contexts;
    if (i_Context.empty())
        contexts = GetContexts();
    else if (auto pContext = FindContext(i_Context))
        contexts.push_back(std::move(pContext));
    if (auto pGlobal = GetGlobalChannels())
        contexts.push_back(std::move(pGlobal));
    std::set<std::string, std::less<>> present;
    for (const std::shared_ptr<VChannelContext>& rpContext : contexts)
    {
        const std::shared_ptr<const VChannelContext::ChannelList> pChannels = rpContext->GetChannels();
        for (const std::shared_ptr<VSourceChannel>& rpChannel : *pChannels)
            present.insert(rpChannel->GetInstanceId().TypeName);
    }
    std::vector<std::string> types;
    for (const ChannelType& rType : GetChannelTypeTable())
        if ((rType.Flags & i_Mask) == 0 && present.contains(rType.Name))
            types.emplace_back(rType.Name);
    return types;
}

std::shared_ptr<TQL::IChannelParameters> VChannelService::GetTypeParameters(std::string_view i_TypeName) const
{
    const ChannelType* pType = FindChannelType(i_TypeName);
    if (!pType)
        return nullptr;
    auto pParameters = std::make_shared<VChannelParameters>();
    DefineTypeParameters(*pType, *pParameters);
    return pParameters;
}

std::shared_ptr<TQL::IChannel>
VChannelService::CreateDerivedChannel(std::string_view i_Operation,
                                      const ChannelSystem::VDerivedChannelParameters& i_rParameters,
                                      const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs)
{
    if (i_rInputs.empty() || std::ranges::find(i_rInputs, nullptr) != i_rInputs.end())
        return nullptr;
    if (i_Operation == VCacheChannel::Operation)
        return i_rInputs.size() == 1 ? MakeCache(i_rParameters.Hash, i_rInputs.front()) : nullptr;
    OperationRequest request;
    if (!ReadRequest(i_Operation, i_rParameters, request))
        return nullptr;
    return MakeOrFind(i_Operation, request, i_rParameters, i_rInputs);
}

std::shared_ptr<TQL::IChannel> VChannelService::MakeCache(std::uint64_t i_Hash,
                                                          const std::shared_ptr<TQL::IChannel>& i_rpInput)
{
    auto id = MakeDerivedId(VCacheChannel::Operation, i_Hash, {i_rpInput}, DisplayNameOf({}, {i_rpInput}));
    const auto pChannel = std::make_shared<VCacheChannel>(std::move(id), i_rpInput, !IsLive(*i_rpInput));
    pChannel->ConnectParameters();
    const std::unique_lock lock(m_Mutex);
    RememberLocked(pChannel);
    return pChannel;
}

std::vector<std::shared_ptr<VCacheChannel>> VChannelService::FindCaches() const
{
    std::vector<std::shared_ptr<VCacheChannel>> caches;
    const std::shared_lock lock(m_Mutex);
    for (const auto& [rId, rpWeak] : m_Derived)
        if (auto pCache = std::dynamic_pointer_cast<VCacheChannel>(rpWeak.lock()))
            caches.push_back(std::move(pCache));
    return caches;
}

bool VChannelService::IsReadEnough() const
{
    const auto caches = FindCaches();
    return !caches.empty() &&
           std::ranges::all_of(caches, [](const auto& i_rpCache) { return i_rpCache->IsReadEnough(); });
}

void VChannelService::ForgetReads()
{
    for (const auto& rpCache : FindCaches())
        rpCache->ForgetReads();
}

std::shared_ptr<TQL::IChannel>
VChannelService::MakeOrFind(std::string_view i_Operation, const OperationRequest& i_rRequest,
                            const ChannelSystem::VDerivedChannelParameters& i_rParameters,
                            const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs)
{
    DerivedKey key{std::string(i_Operation), i_rParameters.Hash, {}};
    for (const std::shared_ptr<TQL::IChannel>& rpInput : i_rInputs)
        std::get<2>(key).push_back(rpInput.get());
    const auto find = [&]
    {
        const auto found = m_ByKey.find(key);
        return found == m_ByKey.end() ? nullptr : found->second.lock();
    };
    {
        const std::shared_lock lock(m_Mutex);
        if (auto pKnown = find())
            return pKnown;
    }
    const bool bLive = std::ranges::any_of(i_rInputs, [this](const auto& i_rpInput) { return IsLive(*i_rpInput); });
    auto id = MakeDerivedId(i_Operation, i_rParameters.Hash, i_rInputs, DisplayNameOf(i_rParameters, i_rInputs));
    const auto pMade =
        std::make_shared<VDerivedChannel>(std::move(id), i_rRequest, i_rParameters, i_rInputs, m_pOperations, bLive);
    pMade->ConnectInputs();
    const std::unique_lock lock(m_Mutex);
    if (auto pKnown = find()) // somebody was quicker
        return pKnown;
    RememberLocked(pMade);
    m_ByKey.insert_or_assign(std::move(key), pMade);
    return pMade;
}

/// Whether samples of the channel come and go.
bool VChannelService::IsLive(const TQL::IChannel& i_rChannel) const
{
    if (const auto* pDerived = dynamic_cast<const VDerivedChannel*>(&i_rChannel))
        return pDerived->IsLive();
    const auto pContext = HomeOf(i_rChannel.GetInstanceId().DataContextName);
    return pContext && pContext->GetType() == ChannelSystem::EContextType::Live;
}

/// Makes the channel known to GetChannel while it lives.
void VChannelService::RememberLocked(const std::shared_ptr<TQL::IChannel>& i_rpChannel)
{
    m_Derived.emplace(i_rpChannel->GetInstanceId(), i_rpChannel);
    if (m_Derived.size() < m_PruneAt)
        return;
    std::erase_if(m_Derived, [](const auto& i_rEntry) { return i_rEntry.second.expired(); });
    std::erase_if(m_ByKey, [](const auto& i_rEntry) { return i_rEntry.second.expired(); });
    m_PruneAt = std::max<std::size_t>(64, 2 * m_Derived.size());
}

std::shared_ptr<TQL::IChannel> VChannelService::GetChannel(const TQL::IChannelInstanceId& i_rId) const
{
    const std::shared_lock lock(m_Mutex);
    if (m_pGlobal && (i_rId.DataContextName.empty() || i_rId.DataContextName == GlobalContextName))
        if (auto pChannel = m_pGlobal->FindChannel(
                {std::string(GlobalContextName), i_rId.TypeName, i_rId.First, i_rId.Second, i_rId.Text}))
            return pChannel;
    if (const auto context = m_Contexts.find(i_rId.DataContextName); context != m_Contexts.end())
        if (auto pChannel = context->second->FindChannel(i_rId))
            return pChannel;
    // The newest first: an older one of the same id may be what is left of data that were replaced.
    const auto [first, end] = m_Derived.equal_range(i_rId);
    for (auto entry = end; entry != first;)
        if (auto pChannel = (--entry)->second.lock())
            return pChannel;
    return nullptr;
}

void VChannelService::SetSelectionManager(std::shared_ptr<TQL::IChannelSelectionManager> i_pSelectionManager)
{
    const std::unique_lock lock(m_Mutex);
    m_pSelectionManager.swap(i_pSelectionManager); // the old one goes after the mutex, with whoever listens to it
}

std::shared_ptr<TQL::IChannelSelectionManager> VChannelService::GetSelectionManager() const
{
    const std::shared_lock lock(m_Mutex);
    return m_pSelectionManager;
}

TQL::IResult VChannelService::GetSubTypeTable(std::uint16_t i_SubTypeId, TQL::SubTypeRecord& o_rRecord) const
{
    return m_pSubTypes->Find(i_SubTypeId, o_rRecord);
}

} // namespace Channels
