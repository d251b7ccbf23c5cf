#pragma once

class QQmlEngine;

namespace GraphPlotUI
{

/// Registers the bundles of shaders, images and QML. Repeating it does nothing.
void RegisterResources();

/// Takes the bundles away again.
void UnregisterResources();

/// Registers the types of module Zarvo.GraphPlot 1.0. Repeating it does nothing.
void RegisterGraphPlotTypes();

/// Lets an engine find the modules in the bundles.
void AddResourceImportPath(QQmlEngine& i_rEngine);

} // namespace GraphPlotUI
