#include "Studio/Transport/TransportIcons.h"

#include <QtGui/QPainter>
#include <QtGui/QPainterPath>
#include <QtGui/QPalette>
#include <QtGui/QPixmap>

#include <utility>

namespace Studio
{

namespace
{

/// All shapes are drawn in a square from 0 to 16, pointing to the right.
void AddTriangle(QPainterPath& o_rPath, double i_Left, double i_Right)
{
    o_rPath.addPolygon(QPolygonF({QPointF(i_Left, 3), QPointF(i_Right, 8), QPointF(i_Left, 13)}));
    o_rPath.closeSubpath();
}

void AddBar(QPainterPath& o_rPath, double i_Left, double i_Width)
{
    o_rPath.addRect(i_Left, 3, i_Width, 10);
}

void AddDiamond(QPainterPath& o_rPath, double i_Middle)
{
    o_rPath.addPolygon(
        QPolygonF({QPointF(i_Middle - 3, 8), QPointF(i_Middle, 4), QPointF(i_Middle + 3, 8), QPointF(i_Middle, 12)}));
    o_rPath.closeSubpath();
}

void AddLoop(QPainterPath& o_rPath)
{
    QPainterPath ring;
    ring.moveTo(12.5, 8);
    ring.arcTo(3, 3.5, 9.5, 9, 0, 290);
    QPainterPathStroker pen;
    pen.setWidth(1.8);
    o_rPath.addPath(pen.createStroke(ring));
    o_rPath.addPolygon(QPolygonF({QPointF(7.5, 9.5), QPointF(12.5, 11.5), QPointF(8, 15.5)}));
    o_rPath.closeSubpath();
}

QPainterPath ShapeOf(ETransportIcon i_Icon)
{
    QPainterPath path;
    path.setFillRule(Qt::WindingFill);
    switch (i_Icon)
    {
    case ETransportIcon::First:
    case ETransportIcon::Last:
        AddTriangle(path, 3, 11);
        AddBar(path, 11, 2);
        break;
    case ETransportIcon::PreviousEvent:
    case ETransportIcon::NextEvent:
        AddTriangle(path, 1, 7);
        AddDiamond(path, 11.5);
        break;
    case ETransportIcon::PreviousFrame:
    case ETransportIcon::NextFrame:
        AddBar(path, 4, 1.5);
        AddTriangle(path, 7, 13);
        break;
    case ETransportIcon::Play:
        AddTriangle(path, 4, 13);
        break;
    case ETransportIcon::Pause:
        AddBar(path, 4, 3);
        AddBar(path, 9, 3);
        break;
    case ETransportIcon::Loop:
        AddLoop(path);
        break;
    }
    return path;
}

bool PointsBack(ETransportIcon i_Icon)
{
    return i_Icon == ETransportIcon::First || i_Icon == ETransportIcon::PreviousEvent ||
           i_Icon == ETransportIcon::PreviousFrame;
}

QPixmap Draw(const QPainterPath& i_rShape, bool i_bBack, int i_Side, const QColor& i_rColour)
{
    QPixmap picture(i_Side, i_Side);
    picture.fill(Qt::transparent);
    QPainter painter(&picture);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.scale(i_Side / 16.0, i_Side / 16.0);
    if (i_bBack)
    {
        painter.translate(16.0, 0.0);
        painter.scale(-1.0, 1.0);
    }
    painter.fillPath(i_rShape, i_rColour);
    return picture;
}

} // namespace

QIcon MakeTransportIcon(ETransportIcon i_Icon, const QPalette& i_rPalette)
{
    const QPainterPath shape = ShapeOf(i_Icon);
    QIcon icon;
    for (const int side : {16, 20, 24, 32, 48, 64, 96})
        for (const auto& [mode, group] :
             {std::pair(QIcon::Normal, QPalette::Active), {QIcon::Disabled, QPalette::Disabled}})
            icon.addPixmap(Draw(shape, PointsBack(i_Icon), side, i_rPalette.color(group, QPalette::ButtonText)), mode);
    return icon;
}

} // namespace Studio
