#pragma once

#include "ChannelSystem/IChannelService.h"
#include "Channels/Common/VSubTypeTable.h"
#include "Channels/Contexts/VChannelContext.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <map>
#include <memory>
#include <shared_mutex>
#include <string>
#include <string_view>
#include <tuple>
#include <vector>

namespace Channels
{

class VCacheChannel;
class VDerivedChannel;
class VOperationTable;
struct OperationRequest;

/// The host's channels: contexts by name, their source channels, and the channels derived from them while somebody
/// holds those. Contexts come and go on the UI thread; look-ups may come from any thread.
class VChannelService : public ChannelSystem::IChannelService
{
public:
    VChannelService();

    /// The units that contexts have to be made with.
    const std::shared_ptr<VSubTypeTable>& GetSubTypes() const { return m_pSubTypes; }

    /// A context of the same name is replaced: the old one is retired.
    void AddContext(std::shared_ptr<VChannelContext> i_pContext);
    /// NotFound for a name that no context bears.
    TQL::IResult RemoveContext(std::string_view i_Name);
    std::vector<std::shared_ptr<VChannelContext>> GetContexts() const; ///< in the order of their names
    std::shared_ptr<VChannelContext> FindContext(std::string_view i_Name) const;

    /// The global channels, whose context is called GlobalContextName: found by ids with that context or none, and
    /// listed in every context. Replaces, and retires, those before; null for none.
    void SetGlobalChannels(std::shared_ptr<VChannelContext> i_pContext);
    std::shared_ptr<VChannelContext> GetGlobalChannels() const; ///< null when there are none

    void SetSelectionManager(std::shared_ptr<TQL::IChannelSelectionManager> i_pSelectionManager);

    /// Channels of another type came into a context that is listed already.
    void NotifyTypesChanged() { m_pTypeListChanged->Invoke(); }

    /// Whether the readers of all "Cache" channels, such as the plots of a window, have read what they want; false
    /// while there is no such channel. What grows is never read enough. ForgetReads begins anew, for readers that were
    /// told to show something else.
    bool IsReadEnough() const;
    void ForgetReads();

    // IChannelService
    std::shared_ptr<ChannelSystem::IChannelContext> GetContextByName(std::string_view i_Name) const override;
    std::shared_ptr<TQL::IChangeSignal> ContextListChanged() const override { return m_pContextListChanged; }
    std::shared_ptr<TQL::IChangeSignal> TypeListChanged() const override { return m_pTypeListChanged; }
    /// An empty context name asks for the types of all contexts.
    std::vector<std::string> GetChannelTypes(std::uint64_t i_Mask, std::string_view i_Context) const override;
    std::shared_ptr<TQL::IChannelParameters> GetTypeParameters(std::string_view i_TypeName) const override;
    /// "Cache", "AlgebraicExpression" and "Derivative"; null for any other operation, without inputs and for one that
    /// is null. A derivation that makes no sense gives a channel without output whose errors say why; nothing is
    /// logged.
    std::shared_ptr<TQL::IChannel>
    CreateDerivedChannel(std::string_view i_Operation, const ChannelSystem::VDerivedChannelParameters& i_rParameters,
                         const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs) override;
    std::shared_ptr<TQL::IChannel> GetChannel(const TQL::IChannelInstanceId& i_rId) const override;
    std::shared_ptr<TQL::IChannelSelectionManager> GetSelectionManager() const override;
    TQL::IResult GetSubTypeTable(std::uint16_t i_SubTypeId, TQL::SubTypeRecord& o_rRecord) const override;

private:
    /// Operation, hash of the record, inputs.
    using DerivedKey = std::tuple<std::string, std::uint64_t, std::vector<const TQL::IChannel*>>;

    std::shared_ptr<VChannelContext> HomeOf(std::string_view i_ContextName) const;
    std::shared_ptr<TQL::IChannel> MakeCache(std::uint64_t i_Hash, const std::shared_ptr<TQL::IChannel>& i_rpInput);
    std::shared_ptr<TQL::IChannel> MakeOrFind(std::string_view i_Operation, const OperationRequest& i_rRequest,
                                              const ChannelSystem::VDerivedChannelParameters& i_rParameters,
                                              const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs);
    bool IsLive(const TQL::IChannel& i_rChannel) const;
    std::vector<std::shared_ptr<VCacheChannel>> FindCaches() const;
    void RememberLocked(const std::shared_ptr<TQL::IChannel>& i_rpChannel);

    const std::shared_ptr<VSubTypeTable> m_pSubTypes;
    const std::shared_ptr<VOperationTable> m_pOperations;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pContextListChanged;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pTypeListChanged;
    mutable std::shared_mutex m_Mutex;
    std::map<std::string, std::shared_ptr<VChannelContext>, std::less<>> m_Contexts; // guarded by m_Mutex
    std::shared_ptr<VChannelContext> m_pGlobal;                                      // guarded by m_Mutex
    std::multimap<TQL::IChannelInstanceId, std::weak_ptr<TQL::IChannel>> m_Derived;  // guarded by m_Mutex
    std::map<DerivedKey, std::weak_ptr<VDerivedChannel>> m_ByKey;                    // guarded by m_Mutex
    std::size_t m_PruneAt = 64;                                                      // guarded by m_Mutex
    std::shared_ptr<TQL::IChannelSelectionManager> m_pSelectionManager;              // guarded by m_Mutex
};

} // namespace Channels
