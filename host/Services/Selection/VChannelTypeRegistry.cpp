#include "Services/Selection/VChannelTypeRegistry.h"

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelService.h"
#include "ChannelSystemUtils/ChannelParameterAccess.h"
#include "ChannelSystemUtils/ChannelParameterNames.h"
#include "Channels/Common/ChannelTypes.h"
#include "Channels/Common/VChannelParameters.h"
#include "Services/Selection/VSelectionSource.h"

#include <algorithm>
#include <utility>

namespace Services
{

namespace
{

std::shared_ptr<TQL::IChannelParameters> MakeParameters(const CreatableChannelType& i_rType)
{
    namespace Names = ChannelSystemUtils::ParameterName;
    auto pParameters = std::make_shared<Channels::VChannelParameters>();
    const auto define = [&](std::string_view i_Name, TQL::ParameterValue i_Value)
    {
        pParameters->Define(ChannelSystemUtils::ParameterGroup::Type, i_Name, std::move(i_Value));
    };
    define(Names::TypeDisplayName, i_rType.DisplayName);
    define(Names::ComponentDisplayNames, i_rType.ComponentNames);
    define(Names::CategoryDisplayName, i_rType.Category);
    define(Names::SupportMagnitude, i_rType.bSupportMagnitude);
    define(Names::Selection, static_cast<std::int32_t>(i_rType.Selection));
    return pParameters;
}

/// How many things were selected before the one that a channel is about; a subject stands for its root segment. The
/// number of all for a channel of nothing that is selected.
std::size_t PlaceIn(const VSelectionSource& i_rSelection, const TQL::IChannelInstanceId& i_rId)
{
    const auto item = Channels::SelectionOfChannel(i_rId);
    const auto isOf = [&](const TQL::SelectionItem& i_rSelected)
    {
        return i_rSelected == *item ||
               (i_rSelected.Kind == TQL::ESelectionKind::Subject && item->Kind == TQL::ESelectionKind::Segment &&
                i_rSelected.First == item->First && i_rSelection.RootSegment(item->First) == item->Second);
    };
    const auto& rItems = i_rSelection.Items();
    return item ? static_cast<std::size_t>(std::ranges::find_if(rItems, isOf) - rItems.begin()) : rItems.size();
}

const CreatableChannelType* Find(const std::vector<CreatableChannelType>& i_rTypes, std::string_view i_Name)
{
    const auto type = std::ranges::find(i_rTypes, i_Name, &CreatableChannelType::Name);
    return type == i_rTypes.end() ? nullptr : &*type;
}

} // namespace

VChannelTypeRegistry::VChannelTypeRegistry(ThreadCheckPointer i_pCheck)
    : m_pCheck(std::move(i_pCheck))
    , m_pTypeListChanged(std::make_shared<NotificationSystem::VChangeSignal>())
    , m_Types(MakeCreatableChannelTypes())
{
}

void VChannelTypeRegistry::SetChannelService(std::shared_ptr<ChannelSystem::IChannelService> i_pService)
{
    m_pService = std::move(i_pService);
}

void VChannelTypeRegistry::SetSelection(std::shared_ptr<const VSelectionSource> i_pSelection)
{
    m_pSelection = std::move(i_pSelection);
}

/// What is not selected goes last, in the order given.
std::vector<std::shared_ptr<TQL::IChannel>>
VChannelTypeRegistry::InOrder(std::vector<std::shared_ptr<TQL::IChannel>> i_Inputs) const
{
    if (!m_pSelection || i_Inputs.size() < 2)
        return i_Inputs;
    std::ranges::stable_sort(i_Inputs, {},
                             [&](const std::shared_ptr<TQL::IChannel>& i_rpInput)
                             { return PlaceIn(*m_pSelection, i_rpInput->GetInstanceId()); });
    return i_Inputs;
}

void VChannelTypeRegistry::GetTypes(std::uint64_t, std::vector<std::string>& o_rTypes) const
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::GetTypes");
    o_rTypes.clear();
    for (const CreatableChannelType& rType : m_Types) // none of them has a flag that a mask could meet
        o_rTypes.push_back(rType.Name);
}

TQL::IResult VChannelTypeRegistry::GetSpecifier(std::string_view i_Type, TQL::VChannelSpecifier& o_rSpecifier) const
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::GetSpecifier");
    const CreatableChannelType* pType = Find(m_Types, i_Type);
    if (!pType)
        return TQL::Result::NotFound;
    o_rSpecifier = {MakeParameters(*pType), 0, static_cast<std::int64_t>(pType->InputCount), pType->InputTypes};
    return TQL::Result::Ok;
}

TQL::IResult VChannelTypeRegistry::CreateChannels(std::string_view i_Type,
                                                  const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs,
                                                  std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels)
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::CreateChannels");
    o_rChannels.clear();
    const CreatableChannelType* pType = Find(m_Types, i_Type);
    if (!pType)
        return TQL::Result::NotFound;
    if (i_rInputs.size() != pType->InputCount || std::ranges::find(i_rInputs, nullptr) != i_rInputs.end())
        return TQL::Result::InvalidArgument;
    if (!pType->Record)
    {
        o_rChannels = i_rInputs;
        return TQL::Result::Ok;
    }
    if (!m_pService)
        return TQL::Result::NotAvailable;
    auto pChannel = m_pService->CreateDerivedChannel(ChannelSystemUtils::OperationName::AlgebraicExpression,
                                                     *pType->Record, InOrder(i_rInputs));
    if (!pChannel)
        return TQL::Result::Failed;
    o_rChannels.push_back(std::move(pChannel));
    return TQL::Result::Ok;
}

TQL::IResult VChannelTypeRegistry::CreateGlobalChannels(std::string_view i_Type, std::string_view,
                                                        std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels)
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::CreateGlobalChannels");
    o_rChannels.clear();
    return Find(m_Types, i_Type) ? TQL::Result::InvalidArgument : TQL::Result::NotFound;
}

bool VChannelTypeRegistry::CanComputeMagnitude(std::string_view, std::string_view i_Type) const
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::CanComputeMagnitude");
    if (const CreatableChannelType* pType = Find(m_Types, i_Type))
        return pType->bSupportMagnitude;
    const auto pParameters = m_pService ? m_pService->GetTypeParameters(i_Type) : nullptr;
    return pParameters &&
           ChannelSystemUtils::ReadBoolParameter(*pParameters, ChannelSystemUtils::ParameterName::SupportMagnitude)
               .value_or(false);
}

std::shared_ptr<TQL::IChangeSignal> VChannelTypeRegistry::TypeListChanged() const
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::TypeListChanged");
    return m_pTypeListChanged;
}

} // namespace Services
