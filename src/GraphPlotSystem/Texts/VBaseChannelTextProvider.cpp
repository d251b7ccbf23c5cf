#include "GraphPlotSystem/Texts/VBaseChannelTextProvider.h"

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelService.h"
#include "ChannelSystemUtils/ChannelNames.h"
#include "ChannelSystemUtils/ChannelParameterAccess.h"
#include "ChannelSystemUtils/ChannelParameterNames.h"
#include "ChannelSystemUtils/UnitText.h"
#include "GraphPlotSystem/Common/StateResults.h"
#include "GraphPlotSystem/Texts/ChannelSubType.h"
#include "TQL/ITraceId.h"

#include <utility>

namespace GraphPlotUI
{
namespace
{

QString Unknown()
{
    return QStringLiteral("Unknown");
}

} // namespace

VBaseChannelTextProvider::VBaseChannelTextProvider(std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                                                   std::shared_ptr<TQL::IPostalService> i_pUiPostalService)
    : m_pChannelService(std::move(i_pChannelService))
    , m_pTextChanged(std::make_shared<NotificationSystem::VChangeSignal>(std::move(i_pUiPostalService)))
{
}

VBaseChannelTextProvider::~VBaseChannelTextProvider() = default;

TQL::IResult VBaseChannelTextProvider::Update(const std::shared_ptr<TQL::IChannel>& i_rpChannel)
{
    bool bChanged = false;
    TQL::IResult result;
    {
        const std::lock_guard lock(m_Mutex);
        result = UpdateLocked(i_rpChannel, bChanged);
    }
    if (bChanged)
        m_pTextChanged->Invoke();
    return result;
}

void VBaseChannelTextProvider::Update(std::span<const TQL::ITraceId> i_Traces)
{
    bool bChanged = false;
    const TQL::IChannelInstanceId* pPrevious = nullptr;
    for (const TQL::ITraceId& rTrace : i_Traces)
    {
        // The components of a channel usually stand together.
        if (pPrevious && TQL::IsSameChannel(*pPrevious, rTrace.Channel()))
            continue;
        pPrevious = &rTrace.Channel();
        if (const auto pChannel = m_pChannelService->GetChannel(rTrace.Channel()))
        {
            const std::lock_guard lock(m_Mutex);
            (void)UpdateLocked(pChannel, bChanged);
        }
    }
    if (bChanged)
        m_pTextChanged->Invoke();
}

TQL::IResult VBaseChannelTextProvider::UpdateLocked(const std::shared_ptr<TQL::IChannel>& i_rpChannel,
                                                    bool& io_rbChanged)
{
    if (!i_rpChannel)
        return TQL::Result::NotAvailable;
    const auto [record, bNew] = m_Channels.try_emplace(i_rpChannel->GetInstanceId());
    ChannelText& rRecord = record->second;
    const std::uint64_t revision = i_rpChannel->GetRevision();
    if (!bNew && rRecord.Revision == revision)
        return rRecord.Result.IsError() ? rRecord.Result : TQL::Result::OkButNoEffect;

    ChannelText channel;
    SubTypeText subType;
    channel.Result = UpdateInputsLocked(*i_rpChannel, io_rbChanged);
    channel.Revision = revision;
    ReadTexts(*i_rpChannel, channel, subType);

    SubTypeText& rSubType = m_SubTypes[channel.SubType];
    rRecord.Revision = channel.Revision; // these two are no texts
    rRecord.Result = channel.Result;
    if (bNew || rRecord != channel || rSubType != subType)
        io_rbChanged = true;
    rSubType = std::move(subType);
    rRecord = std::move(channel);
    return rRecord.Result;
}

TQL::IResult VBaseChannelTextProvider::UpdateInputsLocked(const TQL::IChannel& i_rChannel, bool& io_rbChanged)
{
    std::vector<std::shared_ptr<TQL::IChannel>> inputs;
    i_rChannel.GetDependentChannels(inputs);
    TQL::IResult result;
    for (const auto& rpInput : inputs)
        result = WorseResult(result, UpdateLocked(rpInput, io_rbChanged));
    return result;
}

void VBaseChannelTextProvider::ReadTexts(const TQL::IChannel& i_rChannel, ChannelText& o_rChannel,
                                         SubTypeText& o_rSubType) const
{
    using namespace ChannelSystemUtils;
    const auto pParameters = i_rChannel.GetParameters();
    const auto componentNames = ReadTextParameter(*pParameters, ParameterName::ComponentDisplayNames);
    const auto category = ReadTextParameter(*pParameters, ParameterName::CategoryDisplayName);
    const ChannelNames names = ComposeChannelNames(i_rChannel);
    const TQL::ComponentDescription description = i_rChannel.GetDescription();
    o_rChannel.TypeName = QString::fromStdString(names.TypeName);
    o_rChannel.DisplayName = QString::fromStdString(names.DisplayName);
    o_rChannel.Category = category ? QString::fromStdString(*category) : Unknown();
    o_rChannel.SubType = ComputeChannelSubType(names.TypeName, description, componentNames);

    const std::vector<std::string> split = SplitComponentNames(componentNames.value_or(std::string()));
    std::vector<std::string> units;
    for (const TQL::ComponentGroup& rGroup : description.Groups)
    {
        const std::size_t component = units.size();
        units.push_back(ComposeUnitText(rGroup, *m_pChannelService, EUnitText::Plain));
        o_rSubType.Components.push_back(
            {component < split.size() ? QString::fromStdString(split[component]) : QString(),
             QString::fromStdString(ComposeUnitText(rGroup, *m_pChannelService, EUnitText::Rich)),
             QString::fromStdString(units.back())});
    }
    o_rSubType.DisplayName = o_rChannel.TypeName;
    o_rSubType.Units = QString::fromStdString(ComposeRunText(units));
}

const VBaseChannelTextProvider::ChannelText*
VBaseChannelTextProvider::FindChannelLocked(const TQL::IChannelInstanceId& i_rChannel) const
{
    const auto found = m_Channels.find(i_rChannel);
    return found == m_Channels.end() ? nullptr : &found->second;
}

const VBaseChannelTextProvider::SubTypeText* VBaseChannelTextProvider::FindSubTypeLocked(std::uint64_t i_SubType) const
{
    const auto found = m_SubTypes.find(i_SubType);
    return found == m_SubTypes.end() ? nullptr : &found->second;
}

const VBaseChannelTextProvider::ComponentText*
VBaseChannelTextProvider::FindComponentLocked(std::uint64_t i_SubType, std::uint64_t i_Component) const
{
    const SubTypeText* pSubType = FindSubTypeLocked(i_SubType);
    return pSubType && i_Component < pSubType->Components.size() ? &pSubType->Components[i_Component] : nullptr;
}

QString VBaseChannelTextProvider::GetChannelTypeName(const TQL::IChannelInstanceId& i_rChannel) const
{
    const std::lock_guard lock(m_Mutex);
    const ChannelText* pChannel = FindChannelLocked(i_rChannel);
    return pChannel ? pChannel->TypeName : Unknown();
}

QString VBaseChannelTextProvider::GetChannelDisplayName(const TQL::IChannelInstanceId& i_rChannel) const
{
    const std::lock_guard lock(m_Mutex);
    const ChannelText* pChannel = FindChannelLocked(i_rChannel);
    return pChannel ? pChannel->DisplayName : Unknown();
}

std::uint64_t VBaseChannelTextProvider::GetSubTypeId(const TQL::IChannelInstanceId& i_rChannel) const
{
    const std::lock_guard lock(m_Mutex);
    const ChannelText* pChannel = FindChannelLocked(i_rChannel);
    return pChannel ? pChannel->SubType : 0;
}

QString VBaseChannelTextProvider::GetSubTypeDisplayName(std::uint64_t i_SubType) const
{
    const std::lock_guard lock(m_Mutex);
    const SubTypeText* pSubType = FindSubTypeLocked(i_SubType);
    return pSubType ? pSubType->DisplayName : Unknown();
}

QString VBaseChannelTextProvider::GetSubTypeUnits(std::uint64_t i_SubType) const
{
    const std::lock_guard lock(m_Mutex);
    const SubTypeText* pSubType = FindSubTypeLocked(i_SubType);
    return pSubType ? pSubType->Units : QString();
}

std::uint64_t VBaseChannelTextProvider::GetComponentCount(std::uint64_t i_SubType) const
{
    const std::lock_guard lock(m_Mutex);
    const SubTypeText* pSubType = FindSubTypeLocked(i_SubType);
    return pSubType ? pSubType->Components.size() : 0;
}

QString VBaseChannelTextProvider::GetComponentName(const TQL::IChannelInstanceId& i_rChannel,
                                                   std::uint64_t i_Component) const
{
    const std::lock_guard lock(m_Mutex);
    const ChannelText* pChannel = FindChannelLocked(i_rChannel);
    const ComponentText* pComponent = pChannel ? FindComponentLocked(pChannel->SubType, i_Component) : nullptr;
    return pComponent ? pComponent->Name : QString();
}

QString VBaseChannelTextProvider::GetComponentName(std::uint64_t i_SubType, std::uint64_t i_Component) const
{
    const std::lock_guard lock(m_Mutex);
    const ComponentText* pComponent = FindComponentLocked(i_SubType, i_Component);
    return pComponent ? pComponent->Name : QString();
}

QString VBaseChannelTextProvider::GetComponentUnits(std::uint64_t i_SubType, std::uint64_t i_Component,
                                                    bool i_bRich) const
{
    const std::lock_guard lock(m_Mutex);
    const ComponentText* pComponent = FindComponentLocked(i_SubType, i_Component);
    if (!pComponent)
        return QString();
    return i_bRich ? pComponent->RichUnits : pComponent->PlainUnits;
}

QString VBaseChannelTextProvider::GetCategory(const TQL::IChannelInstanceId& i_rChannel) const
{
    const std::lock_guard lock(m_Mutex);
    const ChannelText* pChannel = FindChannelLocked(i_rChannel);
    return pChannel ? pChannel->Category : QString();
}

} // namespace GraphPlotUI
