#include "Studio/Common/WindowLayout.h"

#include "Studio/Common/Paths.h"
#include "TQL/Log.h"

#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QFileInfo>
#include <QtCore/QJsonArray>
#include <QtCore/QJsonDocument>
#include <QtCore/QJsonObject>
#include <QtCore/QSaveFile>

#include <algorithm>
#include <cmath>

namespace Studio
{

namespace
{

constexpr double smallestShare = 0.05;

void LogWarning(const char* i_pFormat, const std::filesystem::path& i_rFile)
{
    TQL::Log::Format(TQL::Log::GetCategory("Studio"), TQL::ELogSeverity::Warning, i_pFormat, TextFromPath(i_rFile));
}

QRectF PutInside(const QRectF& i_rPlace)
{
    const double width = std::clamp(i_rPlace.width(), smallestShare, 1.0);
    const double height = std::clamp(i_rPlace.height(), smallestShare, 1.0);
    return {std::clamp(i_rPlace.x(), 0.0, 1.0 - width), std::clamp(i_rPlace.y(), 0.0, 1.0 - height), width, height};
}

QRectF ParsePlace(const QJsonArray& i_rNumbers)
{
    return PutInside({i_rNumbers.at(0).toDouble(0.0), i_rNumbers.at(1).toDouble(0.0), i_rNumbers.at(2).toDouble(1.0),
                      i_rNumbers.at(3).toDouble(1.0)});
}

QByteArray ParseBytes(const QJsonValue& i_rValue)
{
    return QByteArray::fromBase64(i_rValue.toString().toLatin1());
}

} // namespace

QByteArray FormatLayout(const WindowLayout& i_rLayout)
{
    QJsonArray plots;
    for (const QRectF& rPlace : i_rLayout.Plots)
        plots.append(QJsonArray{rPlace.x(), rPlace.y(), rPlace.width(), rPlace.height()});
    const QJsonObject layout{{QStringLiteral("geometry"), QString::fromLatin1(i_rLayout.Geometry.toBase64())},
                             {QStringLiteral("panels"), QString::fromLatin1(i_rLayout.Panels.toBase64())},
                             {QStringLiteral("view"), QString::fromLatin1(i_rLayout.bTabbed ? "tabs" : "sideBySide")},
                             {QStringLiteral("plots"), plots},
                             {QStringLiteral("current"), i_rLayout.Current}};
    return QJsonDocument(QJsonObject{{QStringLiteral("windowLayout"), layout}}).toJson();
}

std::optional<WindowLayout> ParseLayout(const QByteArray& i_rText)
{
    const QJsonValue value = QJsonDocument::fromJson(i_rText).object().value(QLatin1String("windowLayout"));
    if (!value.isObject())
        return std::nullopt;
    const QJsonObject object = value.toObject();
    WindowLayout layout;
    layout.Geometry = ParseBytes(object.value(QLatin1String("geometry")));
    layout.Panels = ParseBytes(object.value(QLatin1String("panels")));
    layout.bTabbed = object.value(QLatin1String("view")).toString() != QLatin1String("sideBySide");
    for (const auto& rPlot : object.value(QLatin1String("plots")).toArray())
        if (layout.Plots.size() < WindowLayout::MostPlots)
            layout.Plots.push_back(ParsePlace(rPlot.toArray()));
    layout.Current = std::clamp(object.value(QLatin1String("current")).toInt(), 0,
                                std::max(0, static_cast<int>(layout.Plots.size()) - 1));
    return layout;
}

std::optional<WindowLayout> ReadLayout(const std::filesystem::path& i_rFile)
{
    QFile file(QString::fromStdString(TextFromPath(i_rFile)));
    if (i_rFile.empty() || !file.exists())
        return std::nullopt;
    std::optional<WindowLayout> layout;
    if (file.open(QIODevice::ReadOnly))
        layout = ParseLayout(file.readAll());
    if (!layout)
        LogWarning("%1% does not say how the window was left; it opens as for the first time", i_rFile);
    return layout;
}

void WriteLayout(const std::filesystem::path& i_rFile, const WindowLayout& i_rLayout)
{
    if (i_rFile.empty())
        return;
    const QString path = QString::fromStdString(TextFromPath(i_rFile));
    QDir().mkpath(QFileInfo(path).path()); // a failure shows in the next lines
    QSaveFile file(path);
    const QByteArray text = FormatLayout(i_rLayout);
    if (!file.open(QIODevice::WriteOnly) || file.write(text) != text.size() || !file.commit())
        LogWarning("How the window is left cannot be kept in %1%", i_rFile);
}

std::vector<QRectF> TilePlots(std::size_t i_Count)
{
    std::vector<QRectF> places;
    const auto rows = static_cast<std::size_t>(std::sqrt(static_cast<double>(i_Count)));
    for (std::size_t row = 0; row < rows; ++row)
    {
        const std::size_t columns = (i_Count - places.size() + rows - row - 1) / (rows - row);
        const double width = 1.0 / static_cast<double>(columns);
        const double height = 1.0 / static_cast<double>(rows);
        for (std::size_t column = 0; column < columns; ++column)
            places.emplace_back(static_cast<double>(column) * width, static_cast<double>(row) * height, width, height);
    }
    return places;
}

QRect PlaceInArea(const QRectF& i_rPlace, const QSize& i_rArea, const QSize& i_rSmallest)
{
    const QRectF place = PutInside(i_rPlace);
    // Edges are rounded, not sizes, so that neighbours meet.
    const auto edge = [](double i_Share, int i_Length)
    {
        return static_cast<int>(std::lround(i_Share * i_Length));
    };
    QRect rect(QPoint(edge(place.left(), i_rArea.width()), edge(place.top(), i_rArea.height())),
               QPoint(edge(place.right(), i_rArea.width()) - 1, edge(place.bottom(), i_rArea.height()) - 1));
    rect.setSize(rect.size().expandedTo(i_rSmallest).boundedTo(i_rArea));
    rect.moveRight(std::min(rect.right(), i_rArea.width() - 1));
    rect.moveBottom(std::min(rect.bottom(), i_rArea.height() - 1));
    return rect;
}

QRectF ShareOfArea(const QRect& i_rRect, const QSize& i_rArea)
{
    const double width = std::max(1, i_rArea.width());
    const double height = std::max(1, i_rArea.height());
    return PutInside({i_rRect.x() / width, i_rRect.y() / height, i_rRect.width() / width, i_rRect.height() / height});
}

} // namespace Studio
