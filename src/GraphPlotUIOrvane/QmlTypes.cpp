#include "GraphPlotUIOrvane/QmlTypes.h"

#include "GraphPlotUI/RegisterResources.h"
#include "GraphPlotUI/VGraphPlotFBO.h"
#include "GraphPlotUI/VSubplotRenderType.h"
#include "GraphPlotUI/VTimeAxisRenderType.h"
#include "GraphPlotUI/VValueAxisRenderType.h"

#include <QtQml/QQmlEngine>
#include <QtQml/qqml.h>

namespace GraphPlotUI
{

void RegisterResources()
{
    RegisterGraphPlotResources();
}

void UnregisterResources()
{
    UnregisterGraphPlotResources();
}

void RegisterGraphPlotTypes()
{
    constexpr const char* pModule = "Zarvo.GraphPlot";
    qmlRegisterType<VGraphPlotFBO>(pModule, 1, 0, "GraphPlotFBO");
    qmlRegisterType<VSubplotRenderType>(pModule, 1, 0, "SubplotRenderType");
    qmlRegisterType<VTimeAxisRenderType>(pModule, 1, 0, "TimeAxisRenderType");
    qmlRegisterType<VValueAxisRenderType>(pModule, 1, 0, "ValueAxisRenderType");
}

void AddResourceImportPath(QQmlEngine& i_rEngine)
{
    const QString path = QStringLiteral("qrc:/");
    if (!i_rEngine.importPathList().contains(path))
        i_rEngine.addImportPath(path);
}

} // namespace GraphPlotUI
