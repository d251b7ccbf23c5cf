#pragma once

#include <QtGui/QIcon>

class QPalette;

namespace Studio
{

enum class ETransportIcon
{
    First,
    PreviousEvent,
    PreviousFrame,
    Play,
    Pause,
    NextFrame,
    NextEvent,
    Last,
    Loop
};

/// Drawn in the colours of the palette, sharp at any scale of the screen.
QIcon MakeTransportIcon(ETransportIcon i_Icon, const QPalette& i_rPalette);

} // namespace Studio
