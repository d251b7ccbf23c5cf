#include "Studio/Plots/PlotContent.h"

#include "Recordings/Common/VFileReplacement.h"
#include "Studio/Common/Paths.h"

#include <QtCore/QBuffer>
#include <QtCore/QByteArray>
#include <QtCore/QVariant>
#include <QtQml/QQmlContext>
#include <QtQml/QQmlEngine>
#include <QtQuick/QQuickItem>
#include <QtQuick/QQuickWindow>
#include <QtQuick/QSGRendererInterface>
#include <QtQuickWidgets/QQuickWidget>

namespace Studio
{

namespace
{

TQL::IResult WriteProperty(QObject* i_pObject, const char* i_pName, const QPointF& i_rValue)
{
    if (!i_pObject || i_pObject->metaObject()->indexOfProperty(i_pName) < 0)
        return TQL::Result::NotSupported;
    return i_pObject->setProperty(i_pName, i_rValue) ? TQL::Result::Ok : TQL::Result::NotSupported;
}

} // namespace

QQuickWidget* FindQuickWidget(QWidget& i_rContent)
{
    if (auto* pSelf = qobject_cast<QQuickWidget*>(&i_rContent))
        return pSelf;
    return i_rContent.findChild<QQuickWidget*>();
}

QObject* FindTraceManager(QQuickWidget& i_rQuickWidget)
{
    // All windows share one engine, so each scene has its objects in a context of its own.
    const QQmlContext* pContext = qmlContext(i_rQuickWidget.rootObject());
    if (!pContext)
        pContext = i_rQuickWidget.rootContext();
    return pContext->contextProperty(QStringLiteral("contextTraceManager")).value<QObject*>();
}

bool HasTraceData(QQuickWidget& i_rQuickWidget)
{
    const QObject* pManager = FindTraceManager(i_rQuickWidget);
    return pManager && pManager->property("haveTraceData").toBool();
}

bool DrawsWithOpenGL(QQuickWidget& i_rQuickWidget)
{
    const QQuickWindow* pWindow = i_rQuickWidget.quickWindow();
    return pWindow && pWindow->rendererInterface()->graphicsApi() == QSGRendererInterface::OpenGL;
}

TQL::IResult SetTimeRange(QQuickWidget& i_rQuickWidget, const QPointF& i_rRange)
{
    return WriteProperty(FindTraceManager(i_rQuickWidget), "timeRange", i_rRange);
}

TQL::IResult SetValueRange(QQuickWidget& i_rQuickWidget, const QPointF& i_rRange)
{
    return WriteProperty(i_rQuickWidget.rootObject(), "valueRangeOverride", i_rRange);
}

TQL::IResult SavePicture(const QImage& i_rPicture, const std::filesystem::path& i_rPath, std::string& o_rError)
{
    QByteArray bytes;
    QBuffer buffer(&bytes);
    if (i_rPicture.isNull() || !buffer.open(QIODevice::WriteOnly) || !i_rPicture.save(&buffer, "png"))
    {
        o_rError = TextFromPath(i_rPath.filename()) + ": the window gave no picture; try again with a longer --after";
        return TQL::Result::NotAvailable;
    }
    Recordings::VFileReplacement file(i_rPath);
    TQL::IResult result = file.Open(o_rError);
    if (result.IsSuccess())
        result = file.Write(bytes.toStdString(), o_rError);
    return result.IsSuccess() ? file.Commit(o_rError) : result;
}

} // namespace Studio
