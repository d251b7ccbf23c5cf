#pragma once

#include <QtCore/QByteArray>
#include <QtCore/QRectF>
#include <QtCore/QSize>

#include <filesystem>
#include <optional>
#include <vector>

namespace Studio
{

/// How the window was left: its place and that of its panels as Qt writes them, and the Graph Plots windows in it. The
/// places of those are shares of the area that holds them, so that they fit any screen.
struct WindowLayout
{
    static constexpr std::size_t MostPlots = 32;

    QByteArray Geometry;
    QByteArray Panels;
    bool bTabbed = true;
    std::vector<QRectF> Plots; ///< 0 to 1
    int Current = 0;           ///< which of the plots

    friend bool operator==(const WindowLayout&, const WindowLayout&) = default;
};

QByteArray FormatLayout(const WindowLayout& i_rLayout);

/// Nothing for a text that is no layout. What a layout says of plots that makes no sense is put right.
std::optional<WindowLayout> ParseLayout(const QByteArray& i_rText);

/// Nothing when there is no such file or it cannot be used; the latter is told in the log.
std::optional<WindowLayout> ReadLayout(const std::filesystem::path& i_rFile);

/// Replaces the file in one step. A failure is told in the log and leaves the file as it was.
void WriteLayout(const std::filesystem::path& i_rFile, const WindowLayout& i_rLayout);

/// Places side by side: rows of equal height, wider than high where that can be.
std::vector<QRectF> TilePlots(std::size_t i_Count);

/// A place in an area of some size, whole and inside it, at least i_Smallest where the area has so much.
QRect PlaceInArea(const QRectF& i_rPlace, const QSize& i_rArea, const QSize& i_rSmallest);

/// The other way round.
QRectF ShareOfArea(const QRect& i_rRect, const QSize& i_rArea);

} // namespace Studio
