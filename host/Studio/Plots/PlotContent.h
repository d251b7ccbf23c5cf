#pragma once

#include "TQL/IResult.h"

#include <QtCore/QPointF>
#include <QtGui/QImage>

#include <filesystem>
#include <string>

class QObject;
class QQuickWidget;
class QWidget;

namespace Studio
{

/// A Graph Plots content as the studio can see it from outside: the Quick widget in it and the properties that the
/// scene's objects offer by name. All functions: UI thread; the content outlives the call.

/// Null when there is none in it.
QQuickWidget* FindQuickWidget(QWidget& i_rContent);

/// The object that the scene knows as "contextTraceManager"; null when the scene has none.
QObject* FindTraceManager(QQuickWidget& i_rQuickWidget);

/// Whether some channel has data in the window.
bool HasTraceData(QQuickWidget& i_rQuickWidget);

/// False where Qt Quick had to fall back to drawing without OpenGL: the traces are missing then. Once it is shown.
bool DrawsWithOpenGL(QQuickWidget& i_rQuickWidget);

/// The time axis, in frames. NotSupported when the content does not offer it.
[[nodiscard]] TQL::IResult SetTimeRange(QQuickWidget& i_rQuickWidget, const QPointF& i_rRange);

/// The value axes, in the units of the channels. NotSupported when the content does not offer it.
[[nodiscard]] TQL::IResult SetValueRange(QQuickWidget& i_rQuickWidget, const QPointF& i_rRange);

/// Writes a PNG file; a file that was there is replaced only when all of the new one is on the disk. o_rError is one
/// line.
[[nodiscard]] TQL::IResult SavePicture(const QImage& i_rPicture, const std::filesystem::path& i_rPath,
                                       std::string& o_rError);

} // namespace Studio
