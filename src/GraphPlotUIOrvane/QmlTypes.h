#pragma once

#include <QtCore/QString>

class QQmlEngine;

namespace GraphPlotUI
{

/// Registers the bundles of shaders, images and QML. Repeating it does nothing.
void RegisterResources();

/// Takes the bundles away again.
void UnregisterResources();

/// The folder of a room's sources, for development builds only.
QString SourceFolder(const char* i_pRoom);

/// Registers the types of module Zarvo.GraphPlot 1.0. Repeating it does nothing.
void RegisterGraphPlotTypes();

/// Lets an engine read the QML that is being worked on, ahead of the bundles: the source folders of the rooms that have
/// some are import paths, and that of the host-facing room is also found by the prefix "qml:". Repeating it does
/// nothing.
void AddDevelopmentPaths(QQmlEngine& i_rEngine);

} // namespace GraphPlotUI
