#include "Services/VChannelMigrationService.h"

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelService.h"
#include "Channels/Derived/VDerivedChannel.h"
#include "Channels/VChannelService.h"
#include "Services/Checking/VCheckedChannels.h"

#include <utility>

namespace Services
{

namespace
{

/// The name behind the subject.
std::string_view OwnName(std::string_view i_Name)
{
    const std::size_t colon = i_Name.find(':');
    return colon == std::string_view::npos ? i_Name : i_Name.substr(colon + 1);
}

constexpr int MostAlike = 6;
constexpr int SameFrom = 5; ///< this likeness and above: the same thing

/// How well a channel of the same type can stand for another; 0: not at all.
int Likeness(const Channels::VSourceChannel& i_rWanted, const Channels::VSourceChannel& i_rOther)
{
    const std::string& rWanted = i_rWanted.GetDefinition().Name;
    const std::string& rOther = i_rOther.GetDefinition().Name;
    const bool bSameNumbers = i_rWanted.GetInstanceId() == i_rOther.GetInstanceId();
    if (!rWanted.empty() && rWanted == rOther)
        return bSameNumbers ? MostAlike : SameFrom;
    if (!rWanted.empty() && OwnName(rWanted) == OwnName(rOther))
        return i_rWanted.GetInstanceId().First == i_rOther.GetInstanceId().First ? 4 : 3;
    return bSameNumbers ? 2 : 0;
}

} // namespace

VChannelMigrationService::VChannelMigrationService(std::shared_ptr<ChannelSystem::IChannelService> i_pService,
                                                   std::shared_ptr<VCheckedChannels> i_pChecked,
                                                   ThreadCheckPointer i_pCheck)
    : m_pService(std::move(i_pService)), m_pChecked(std::move(i_pChecked)), m_pCheck(std::move(i_pCheck))
{
}

TQL::IResult VChannelMigrationService::Migrate(const std::shared_ptr<TQL::IChannel>& i_rpChannel,
                                               std::string_view i_NewContext,
                                               std::vector<std::shared_ptr<TQL::IChannel>>& o_rMigrated,
                                               std::vector<std::shared_ptr<TQL::IChannel>>& o_rFallbacks)
{
    CheckThread(m_pCheck, "IChannelMigrationService::Migrate");
    o_rMigrated.clear();
    o_rFallbacks.clear();
    if (!i_rpChannel)
        return TQL::Result::InvalidArgument;
    if (!m_pService || !m_pService->GetContextByName(i_NewContext))
        return TQL::Result::NotFound;
    Found found;
    const TQL::IResult result = Find(VCheckedChannels::Unwrap(i_rpChannel), std::string(i_NewContext), found);
    if (result.IsError())
        return result;
    (found.bSame ? o_rMigrated : o_rFallbacks)
        .push_back(m_pChecked ? m_pChecked->Wrap(found.pChannel) : found.pChannel);
    return TQL::Result::Ok;
}

TQL::IResult VChannelMigrationService::Find(const std::shared_ptr<TQL::IChannel>& i_rpChannel,
                                            const std::string& i_rContext, Found& o_rFound) const
{
    std::vector<std::shared_ptr<TQL::IChannel>> inputs;
    i_rpChannel->GetDependentChannels(inputs);
    if (!inputs.empty())
        return DeriveAnew(i_rpChannel, i_rContext, o_rFound);
    o_rFound = FindSource(*i_rpChannel, i_rContext);
    return o_rFound.pChannel ? TQL::Result::Ok : TQL::Result::NotFound;
}

TQL::IResult VChannelMigrationService::DeriveAnew(const std::shared_ptr<TQL::IChannel>& i_rpChannel,
                                                  const std::string& i_rContext, Found& o_rFound) const
{
    const auto pDerived = std::dynamic_pointer_cast<Channels::VDerivedChannel>(i_rpChannel);
    if (!pDerived)
        return TQL::Result::NotSupported;
    std::vector<std::shared_ptr<TQL::IChannel>> inputs;
    bool bSame = true;
    for (const std::shared_ptr<TQL::IChannel>& rpInput : pDerived->GetInputs())
    {
        Found found;
        if (const TQL::IResult result = Find(rpInput, i_rContext, found); result.IsError())
            return result;
        inputs.push_back(std::move(found.pChannel));
        bSame = bSame && found.bSame;
    }
    o_rFound = {m_pService->CreateDerivedChannel(pDerived->GetInstanceId().TypeName, pDerived->GetRecord(), inputs),
                bSame};
    return o_rFound.pChannel ? TQL::Result::Ok : TQL::Result::Failed;
}

VChannelMigrationService::Found VChannelMigrationService::FindSource(const TQL::IChannel& i_rChannel,
                                                                     const std::string& i_rContext) const
{
    const TQL::IChannelInstanceId& rId = i_rChannel.GetInstanceId();
    if (rId.DataContextName == Channels::GlobalContextName) // the same in all contexts
        return {m_pService->GetChannel(rId), true};
    const auto* pWanted = dynamic_cast<const Channels::VSourceChannel*>(&i_rChannel);
    const auto* pService = dynamic_cast<const Channels::VChannelService*>(m_pService.get());
    const auto pContext = pService ? pService->FindContext(i_rContext) : nullptr;
    if (!pWanted || !pContext)
        return {m_pService->GetChannel({i_rContext, rId.TypeName, rId.First, rId.Second, rId.Text}), false};
    // The same name under the same numbers is what is mostly there, and needs no search.
    if (auto pSame = pContext->FindChannel({i_rContext, rId.TypeName, rId.First, rId.Second, rId.Text}))
        if (Likeness(*pWanted, *pSame) == MostAlike)
            return {std::move(pSame), true};
    std::shared_ptr<TQL::IChannel> pBest;
    int best = 0;
    const auto pChannels = pContext->GetChannels();
    for (const auto& rpOther : *pChannels)
    {
        const int likeness = rpOther->GetInstanceId().TypeName == rId.TypeName ? Likeness(*pWanted, *rpOther) : 0;
        if (likeness <= best)
            continue;
        best = likeness;
        pBest = rpOther;
    }
    return {std::move(pBest), best >= SameFrom};
}

} // namespace Services
