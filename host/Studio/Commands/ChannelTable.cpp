#include "Studio/Commands/ChannelTable.h"

#include <QtCore/QJsonArray>
#include <QtCore/QJsonDocument>
#include <QtCore/QJsonObject>
#include <QtCore/QString>

#include <algorithm>
#include <array>
#include <vector>

namespace Studio
{

namespace
{

using Recordings::RecordedChannel;

constexpr std::size_t columns = 7;
using Row = std::array<QString, columns>;

std::string TypeName(const RecordedChannel& i_rChannel)
{
    switch (i_rChannel.Kind)
    {
    case Recordings::EChannelKind::Marker:
        return "Marker";
    case Recordings::EChannelKind::SegmentPose:
        return "SegmentPose";
    case Recordings::EChannelKind::Analog:
        return "Analog";
    case Recordings::EChannelKind::JointAngles:
        return "JointAngles";
    case Recordings::EChannelKind::ModelOutput:
        return i_rChannel.Quantity;
    case Recordings::EChannelKind::Column:
        break;
    }
    return "Column";
}

QString OneLine(const std::string& i_rText)
{
    QString text = QString::fromStdString(i_rText);
    for (QChar& rCharacter : text)
        if (!rCharacter.isPrint())
            rCharacter = QLatin1Char(' ');
    return text.isEmpty() ? QStringLiteral("-") : text;
}

Row MakeRow(const RecordedChannel& i_rChannel)
{
    std::string components;
    for (const std::string& rName : i_rChannel.ComponentNames)
        components += (components.empty() ? "" : " ") + rName;
    return {OneLine(i_rChannel.Name),
            QString::fromStdString(TypeName(i_rChannel)),
            OneLine(components),
            OneLine(i_rChannel.Units),
            QString::number(i_rChannel.Rate, 'g', 10),
            QString::number(i_rChannel.RowCount()),
            QString::number(i_rChannel.MissingCount())};
}

} // namespace

std::string FormatChannelTable(const Recordings::VRecording& i_rRecording)
{
    std::vector<Row> rows{{QStringLiteral("name"), QStringLiteral("type"), QStringLiteral("components"),
                           QStringLiteral("units"), QStringLiteral("rate"), QStringLiteral("samples"),
                           QStringLiteral("missing")}};
    for (const RecordedChannel& rChannel : i_rRecording.Channels)
        rows.push_back(MakeRow(rChannel));

    std::array<qsizetype, columns> widths{};
    for (const Row& rRow : rows)
        for (std::size_t i = 0; i < columns; ++i)
            widths[i] = std::max(widths[i], rRow[i].size());

    constexpr std::size_t firstNumber = 4; // rate, samples, missing stand to the right
    QString text;
    for (const Row& rRow : rows)
    {
        QString line;
        for (std::size_t i = 0; i < columns; ++i)
            line += (i == 0 ? QString() : QStringLiteral("  ")) +
                    (i < firstNumber ? rRow[i].leftJustified(widths[i]) : rRow[i].rightJustified(widths[i]));
        text += line + QLatin1Char('\n');
    }
    return text.toStdString();
}

std::string FormatChannelJson(const Recordings::VRecording& i_rRecording)
{
    QJsonArray channels;
    for (const RecordedChannel& rChannel : i_rRecording.Channels)
    {
        QJsonArray components;
        for (const std::string& rName : rChannel.ComponentNames)
            components.append(QString::fromStdString(rName));
        channels.append(QJsonObject{{QStringLiteral("name"), QString::fromStdString(rChannel.Name)},
                                    {QStringLiteral("type"), QString::fromStdString(TypeName(rChannel))},
                                    {QStringLiteral("components"), components},
                                    {QStringLiteral("units"), QString::fromStdString(rChannel.Units)},
                                    {QStringLiteral("rate"), rChannel.Rate},
                                    {QStringLiteral("samples"), static_cast<qint64>(rChannel.RowCount())},
                                    {QStringLiteral("missing"), static_cast<qint64>(rChannel.MissingCount())}});
    }
    return QJsonDocument(channels).toJson(QJsonDocument::Indented).toStdString();
}

} // namespace Studio
