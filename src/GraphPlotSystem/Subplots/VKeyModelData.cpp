// What the rows of the key tell, and what can be written to them.
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Subplots/KeyRows.h"
#include "GraphPlotSystem/Subplots/VKeyModel.h"
#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"

#include <QtGui/QColor>

#include <array>
#include <set>

namespace GraphPlotUI
{

using namespace TQL::KeyModelRoles;
using TQL::ActiveChannelModelRoles::ActiveChannelMissingData;
using TQL::ActiveChannelModelRoles::ActiveChannelPinned;

QVariant VKeyModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!checkIndex(i_rIndex, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
        return {};
    const TQL::ITraceId& rTrace = m_Rows[static_cast<std::size_t>(i_rIndex.row())];
    switch (i_Role)
    {
    case KeyComponentIndex:
        return static_cast<int>(rTrace.Component());
    case KeyColour:
        return ColourOf(rTrace);
    case KeyChannelId:
        return QVariant::fromValue(rTrace.Channel());
    case KeyTraceId:
        return QVariant::fromValue(rTrace);
    case KeyChannelName:
    case KeyComponentName:
    case KeyChannelSubTypeName:
        return TextData(rTrace, i_Role);
    case KeyEnabledComponentCount:
    case KeyEnabledComponents:
    case KeyFirstEnabledComponent:
    case KeyLastEnabledComponent:
        return ComponentData(rTrace, i_Role);
    case KeyPinned:
    case KeyMissingData:
        return ChannelData(rTrace, i_Role);
    default:
        return {};
    }
}

QVariant VKeyModel::ColourOf(const TQL::ITraceId& i_rTrace) const
{
    std::array<float, 4> colour{};
    m_pStorage->GetTraceColour(colour, i_rTrace);
    return QColor::fromRgbF(colour[0], colour[1], colour[2], colour[3]);
}

QVariant VKeyModel::TextData(const TQL::ITraceId& i_rTrace, int i_Role) const
{
    if (i_Role == KeyChannelName)
        return m_pTextProvider->GetChannelDisplayName(i_rTrace.Channel());
    if (i_Role == KeyComponentName)
        return m_pTextProvider->GetComponentName(i_rTrace.Channel(), i_rTrace.Component());
    return m_pTextProvider->GetSubTypeDisplayName(m_pTextProvider->GetSubTypeId(i_rTrace.Channel()));
}

KeyComponents VKeyModel::ComponentsOf(const TQL::ITraceId& i_rTrace) const
{
    const std::uint64_t subType = m_pTextProvider->GetSubTypeId(i_rTrace.Channel());
    const TQL::VDisabledComponents disabled = m_pComponentControls->GetDisabledComponents(subType);
    return DescribeKeyComponents(i_rTrace.Component(), m_pTextProvider->GetComponentCount(subType),
                                 {disabled.begin(), disabled.end()});
}

QVariant VKeyModel::ComponentData(const TQL::ITraceId& i_rTrace, int i_Role) const
{
    const KeyComponents components = ComponentsOf(i_rTrace);
    if (i_Role == KeyEnabledComponentCount)
        return components.EnabledCount;
    if (i_Role == KeyFirstEnabledComponent)
        return components.bFirstEnabled;
    if (i_Role == KeyLastEnabledComponent)
        return components.bLastEnabled;
    QVariantList disabled;
    for (const std::uint64_t component : components.Disabled)
        disabled.append(static_cast<int>(component));
    return disabled;
}

QModelIndex VKeyModel::ChannelRowOf(const TQL::ITraceId& i_rTrace) const
{
    return m_pActiveChannelModel ? m_pActiveChannelModel->index(m_pActiveChannelModel->FindRow(i_rTrace.Channel()))
                                 : QModelIndex();
}

QVariant VKeyModel::ChannelData(const TQL::ITraceId& i_rTrace, int i_Role) const
{
    const QModelIndex channel = ChannelRowOf(i_rTrace);
    if (i_Role == KeyPinned)
        return channel.isValid() && channel.data(ActiveChannelPinned).toBool();
    return !channel.isValid() || channel.data(ActiveChannelMissingData).toBool();
}

bool VKeyModel::setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role)
{
    if (!checkIndex(i_rIndex, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
        return false;
    const TQL::ITraceId trace = m_Rows[static_cast<std::size_t>(i_rIndex.row())];
    if (i_Role == KeyEnabledComponents && i_rValue.canConvert<QVariantList>())
        return SwitchComponents(trace, i_rValue.toList());
    if (i_Role != KeyPinned)
        return false;
    const QModelIndex channel = ChannelRowOf(trace);
    return channel.isValid() && m_pActiveChannelModel->setData(channel, i_rValue, ActiveChannelPinned);
}

bool VKeyModel::SwitchComponents(const TQL::ITraceId& i_rTrace, const QVariantList& i_rDisabled)
{
    std::set<std::uint64_t> disabled;
    for (const QVariant& rComponent : i_rDisabled)
        disabled.insert(rComponent.toULongLong());
    const std::uint64_t subType = m_pTextProvider->GetSubTypeId(i_rTrace.Channel());
    const std::uint64_t count = m_pTextProvider->GetComponentCount(subType);
    bool bAll = count != 0;
    for (std::uint64_t component = 0; component < count; ++component)
        bAll =
            m_pComponentControls->SetComponentEnabled(subType, component, !disabled.contains(component)).IsSuccess() &&
            bAll;
    return bAll;
}

} // namespace GraphPlotUI
