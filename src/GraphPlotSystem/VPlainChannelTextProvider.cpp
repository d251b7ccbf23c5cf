#include "GraphPlotSystem/VPlainChannelTextProvider.h"

#include "ChannelSystem/ComponentDescription.h"
#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelService.h"
#include "TQL/HashMix.h"

#include <QtCore/QStringList>

#include <algorithm>
#include <cstdlib>
#include <utility>

namespace GraphPlotUI
{
namespace
{

QString Unknown()
{
    return QStringLiteral("Unknown");
}

QString ReadText(const TQL::IChannelParameters& i_rParameters, const char* i_pName, const QString& i_rDefault)
{
    TQL::ParameterValue value;
    if (i_rParameters.Read("", i_pName, value).IsError())
        return i_rDefault;
    const auto* const pText = std::get_if<std::string>(&value);
    return pText ? QString::fromStdString(*pText) : i_rDefault;
}

QString ExponentText(const boost::rational<std::int8_t>& i_rExponent)
{
    const int numerator = std::abs(int{i_rExponent.numerator()});
    const int denominator = i_rExponent.denominator();
    if (denominator != 1)
        return QStringLiteral("^(%1/%2)").arg(numerator).arg(denominator);
    return numerator == 1 ? QString() : QStringLiteral("^%1").arg(numerator);
}

/// "mm", "mm/s^2": the factors above the line, then those below it. A factor that the host does not know is left out.
QString UnitText(const ChannelSystem::IChannelService& i_rService, const TQL::ComponentGroup& i_rGroup)
{
    QStringList above;
    QStringList below;
    for (const TQL::UnitFactor& rFactor : i_rGroup.Factors)
    {
        TQL::SubTypeRecord record;
        if (!i_rGroup.bUsed || i_rService.GetSubTypeTable(rFactor.SubTypeId, record).IsError())
            continue;
        (rFactor.Exponent < 0 ? below : above)
            .push_back(QString::fromStdString(record.UnitText) + ExponentText(rFactor.Exponent));
    }
    QString text = above.join(QLatin1Char('.'));
    if (below.isEmpty())
        return text;
    const QString under = below.join(QLatin1Char('.'));
    if (text.isEmpty())
        text = QStringLiteral("1");
    return text + (below.size() > 1 ? QStringLiteral("/(%1)") : QStringLiteral("/%1")).arg(under);
}

std::uint64_t HashOf(const QString& i_rText)
{
    return TQL::HashText(i_rText.toStdString());
}

} // namespace

VPlainChannelTextProvider::VPlainChannelTextProvider(std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                                                     std::shared_ptr<TQL::IPostalService> i_pUiPostalService)
    : m_pChannelService(std::move(i_pChannelService))
    , m_pTextChanged(std::make_shared<NotificationSystem::VChangeSignal>(std::move(i_pUiPostalService)))
{
}

VPlainChannelTextProvider::~VPlainChannelTextProvider() = default;

TQL::IResult VPlainChannelTextProvider::Update(const std::shared_ptr<TQL::IChannel>& i_rpChannel)
{
    if (!i_rpChannel)
        return TQL::Result::InvalidArgument;
    const TQL::IChannelInstanceId& rId = i_rpChannel->GetInstanceId();
    const std::uint64_t revision = i_rpChannel->GetRevision();
    {
        const std::lock_guard lock(m_Mutex);
        const auto found = m_Channels.find(rId);
        if (found != m_Channels.end() && found->second.Revision == revision)
            return TQL::Result::OkButNoEffect;
    }
    ChannelText channel;
    SubTypeText subType;
    Read(*i_rpChannel, channel, subType);
    channel.Revision = revision;
    {
        const std::lock_guard lock(m_Mutex);
        m_SubTypes.try_emplace(channel.SubType, std::move(subType));
        m_Channels[rId] = std::move(channel);
    }
    m_pTextChanged->Invoke();
    return TQL::Result::Ok;
}

void VPlainChannelTextProvider::Read(const TQL::IChannel& i_rChannel, ChannelText& o_rChannel,
                                     SubTypeText& o_rSubType) const
{
    const auto pParameters = i_rChannel.GetParameters();
    const TQL::ComponentDescription description = i_rChannel.GetDescription();
    o_rChannel.TypeName =
        ReadText(*pParameters, "TypeDisplayName", QString::fromStdString(i_rChannel.GetInstanceId().TypeName));
    const QString instance = ReadText(*pParameters, "InstanceDisplayName", QString());
    const QString separator =
        instance.isEmpty() || instance.startsWith(QLatin1Char(' ')) ? QString() : QStringLiteral(" - ");
    o_rChannel.DisplayName = o_rChannel.TypeName + separator + instance;

    o_rSubType.DisplayName = o_rChannel.TypeName;
    const QStringList names =
        ReadText(*pParameters, "ComponentDisplayNames", QString()).split(QLatin1Char(','), Qt::KeepEmptyParts);
    std::uint64_t hash = TQL::HashMix(HashOf(o_rChannel.TypeName), description.Groups.size());
    for (const TQL::ComponentGroup& rGroup : description.Groups)
    {
        const auto component = static_cast<qsizetype>(o_rSubType.ComponentNames.size());
        o_rSubType.ComponentNames.push_back(names.value(component));
        o_rSubType.ComponentUnits.push_back(UnitText(*m_pChannelService, rGroup));
        hash = TQL::HashMix(hash, HashOf(o_rSubType.ComponentNames.back()));
        hash = TQL::HashMix(hash, HashOf(o_rSubType.ComponentUnits.back()));
    }
    o_rChannel.SubType = hash != 0 ? hash : 1; // 0 stands for an unknown channel
}

QString VPlainChannelTextProvider::GetChannelTypeName(const TQL::IChannelInstanceId& i_rChannel) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Channels.find(i_rChannel);
    return found == m_Channels.end() ? Unknown() : found->second.TypeName;
}

QString VPlainChannelTextProvider::GetChannelDisplayName(const TQL::IChannelInstanceId& i_rChannel) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Channels.find(i_rChannel);
    return found == m_Channels.end() ? Unknown() : found->second.DisplayName;
}

std::uint64_t VPlainChannelTextProvider::GetSubTypeId(const TQL::IChannelInstanceId& i_rChannel) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Channels.find(i_rChannel);
    return found == m_Channels.end() ? 0 : found->second.SubType;
}

QString VPlainChannelTextProvider::GetSubTypeDisplayName(std::uint64_t i_SubType) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_SubTypes.find(i_SubType);
    return found == m_SubTypes.end() ? Unknown() : found->second.DisplayName;
}

QString VPlainChannelTextProvider::GetSubTypeUnits(std::uint64_t i_SubType) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_SubTypes.find(i_SubType);
    QStringList runs;
    if (found == m_SubTypes.end())
        return QString();
    const std::vector<QString>& rUnits = found->second.ComponentUnits;
    for (auto it = rUnits.begin(); it != rUnits.end();)
    {
        const auto end = std::find_if(it, rUnits.end(), [it](const QString& i_rUnit) { return i_rUnit != *it; });
        runs.push_back(end - it > 1 ? QStringLiteral("%1[%2]").arg(*it).arg(end - it) : *it);
        it = end;
    }
    return runs.join(QLatin1Char(' '));
}

std::uint64_t VPlainChannelTextProvider::GetComponentCount(std::uint64_t i_SubType) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_SubTypes.find(i_SubType);
    return found == m_SubTypes.end() ? 0 : found->second.ComponentNames.size();
}

QString VPlainChannelTextProvider::GetSubTypeText(std::uint64_t i_SubType, std::vector<QString> SubTypeText::*i_pTexts,
                                                  std::uint64_t i_Component) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_SubTypes.find(i_SubType);
    if (found == m_SubTypes.end() || i_Component >= (found->second.*i_pTexts).size())
        return QString();
    return (found->second.*i_pTexts)[i_Component];
}

QString VPlainChannelTextProvider::GetComponentName(const TQL::IChannelInstanceId& i_rChannel,
                                                    std::uint64_t i_Component) const
{
    return GetComponentName(GetSubTypeId(i_rChannel), i_Component);
}

QString VPlainChannelTextProvider::GetComponentName(std::uint64_t i_SubType, std::uint64_t i_Component) const
{
    return GetSubTypeText(i_SubType, &SubTypeText::ComponentNames, i_Component);
}

QString VPlainChannelTextProvider::GetComponentUnits(std::uint64_t i_SubType, std::uint64_t i_Component) const
{
    return GetSubTypeText(i_SubType, &SubTypeText::ComponentUnits, i_Component);
}

} // namespace GraphPlotUI
