#include "GraphPlotSystem/Texts/ComponentRows.h"

#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "GraphPlotSystem/Texts/IChannelTextProvider.h"

#include <map>
#include <set>

namespace GraphPlotUI
{
namespace
{

QString TypeText(const TQL::IChannelTextProvider& i_rTexts, std::uint64_t i_SubType)
{
    const QString units = i_rTexts.GetSubTypeUnits(i_SubType);
    const QString name = i_rTexts.GetSubTypeDisplayName(i_SubType);
    return units.isEmpty() ? name : name + QStringLiteral(" - ") + units;
}

int StateOf(std::uint64_t i_Enabled, std::uint64_t i_Count)
{
    if (i_Enabled == 0)
        return Qt::Unchecked;
    return i_Enabled == i_Count ? Qt::Checked : Qt::PartiallyChecked;
}

void AppendType(std::uint64_t i_SubType, const QString& i_rText, const TQL::IChannelTextProvider& i_rTexts,
                const TQL::IChannelComponentControls& i_rControls, std::vector<VComponentType>& io_rRows,
                ComponentCounts& io_rCounts)
{
    const std::uint64_t count = i_rTexts.GetComponentCount(i_SubType);
    const TQL::VDisabledComponents disabled = i_rControls.GetDisabledComponents(i_SubType);
    const std::size_t header = io_rRows.size();
    io_rRows.push_back({i_SubType, i_rText, true, 0, Qt::Unchecked});
    std::uint64_t enabled = 0;
    for (std::uint64_t component = 0; component < count; ++component)
    {
        const bool bEnabled = !disabled.contains(component);
        enabled += bEnabled ? 1 : 0;
        if (count > 1)
            io_rRows.push_back({i_SubType, i_rTexts.GetComponentName(i_SubType, component), false, component,
                                bEnabled ? Qt::Checked : Qt::Unchecked});
    }
    io_rRows[header].State = StateOf(enabled, count);
    io_rCounts.Total += static_cast<int>(count);
    io_rCounts.Enabled += static_cast<int>(enabled);
}

} // namespace

std::vector<VComponentType> ComposeComponentRows(std::span<const TQL::IChannelInstanceId> i_Channels,
                                                 const TQL::IChannelTextProvider& i_rTexts,
                                                 const TQL::IChannelComponentControls& i_rControls,
                                                 ComponentCounts& o_rCounts)
{
    std::set<std::uint64_t> subTypes;
    for (const TQL::IChannelInstanceId& rChannel : i_Channels)
        subTypes.insert(i_rTexts.GetSubTypeId(rChannel));

    // Ordered by the text, types of one text by their id.
    std::map<QString, std::pair<std::uint64_t, QString>> types;
    for (const std::uint64_t subType : subTypes)
    {
        QString text = TypeText(i_rTexts, subType);
        QString key = text + QLatin1Char('~') + QString::number(subType);
        types.try_emplace(std::move(key), subType, std::move(text));
    }
    std::vector<VComponentType> rows;
    o_rCounts = {};
    for (const auto& [rKey, rType] : types)
        AppendType(rType.first, rType.second, i_rTexts, i_rControls, rows, o_rCounts);
    return rows;
}

} // namespace GraphPlotUI
