#include "GraphPlotSystem/Subplots/SubplotToolTip.h"

#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "TQL/ITraceId.h"

#include <QtCore/QStringList>

#include <map>
#include <set>
#include <string>

namespace GraphPlotUI
{

namespace
{

using TextSet = std::set<QString>;

QString Join(const TextSet& i_rTexts, const QString& i_rSeparator)
{
    return QStringList(i_rTexts.begin(), i_rTexts.end()).join(i_rSeparator);
}

QString Section(const char* i_pHead, const QString& i_rLines)
{
    return QLatin1String("<b>") + QLatin1String(i_pHead) + QLatin1String(":</b><br>") + i_rLines;
}

QString JoinChannels(const std::map<QString, TextSet>& i_rChannels)
{
    QStringList lines;
    for (const auto& [rName, rComponents] : i_rChannels)
        lines.append(rComponents.empty()
                         ? rName
                         : rName + QLatin1String(" (") + Join(rComponents, QStringLiteral(", ")) + QLatin1Char(')'));
    return lines.join(QStringLiteral("<br>"));
}

} // namespace

QString SubplotToolTip(std::span<const TQL::ITraceId> i_Traces, const TQL::IChannelTextProvider& i_rTexts,
                       bool i_bShowDataContexts)
{
    std::map<QString, TextSet> channels; // each with its components
    TextSet units;
    TextSet contexts;
    for (const TQL::ITraceId& rTrace : i_Traces)
    {
        const std::uint64_t subType = i_rTexts.GetSubTypeId(rTrace.Channel());
        TextSet& rComponents = channels[i_rTexts.GetChannelDisplayName(rTrace.Channel()).toHtmlEscaped()];
        const QString component = i_rTexts.GetComponentName(subType, rTrace.Component());
        if (i_rTexts.GetComponentCount(subType) > 1 && !component.isEmpty())
            rComponents.insert(component.toHtmlEscaped());
        if (const QString unit = i_rTexts.GetComponentUnits(subType, rTrace.Component(), true); !unit.isEmpty())
            units.insert(unit);
        if (const std::string& rContext = rTrace.Channel().DataContextName; i_bShowDataContexts && !rContext.empty())
            contexts.insert(QString::fromStdString(rContext).toHtmlEscaped());
    }
    const QString lineBreak = QStringLiteral("<br>");
    QString text = Section("Channels", JoinChannels(channels));
    if (!units.empty())
        text += lineBreak + Section("Units", Join(units, lineBreak));
    if (!contexts.empty())
        text += lineBreak + Section("Data contexts", Join(contexts, lineBreak));
    return text;
}

} // namespace GraphPlotUI
