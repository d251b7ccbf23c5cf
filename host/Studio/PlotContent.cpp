#include "Studio/PlotContent.h"

#include <QtCore/QDir>
#include <QtCore/QFileInfo>
#include <QtCore/QSaveFile>
#include <QtCore/QVariant>
#include <QtGui/QImageWriter>
#include <QtQml/QQmlContext>
#include <QtQml/QQmlEngine>
#include <QtQuick/QQuickItem>
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

TQL::IResult SetTimeRange(QQuickWidget& i_rQuickWidget, const QPointF& i_rRange)
{
    return WriteProperty(FindTraceManager(i_rQuickWidget), "timeRange", i_rRange);
}

TQL::IResult SetValueRange(QQuickWidget& i_rQuickWidget, const QPointF& i_rRange)
{
    return WriteProperty(i_rQuickWidget.rootObject(), "valueRangeOverride", i_rRange);
}

TQL::IResult SavePicture(const QImage& i_rPicture, const QString& i_rPath, std::string& o_rError)
{
    const auto fail = [&](const QString& i_rReason)
    {
        o_rError = QStringLiteral("cannot write the picture %1: %2").arg(i_rPath, i_rReason).toStdString();
        return TQL::Result::FileIOFailure;
    };
    if (i_rPicture.isNull())
        return fail(QStringLiteral("the window gave no picture"));
    const QFileInfo info(i_rPath);
    if (info.isDir())
        return fail(QStringLiteral("it is a folder; give the name of a file"));
    if (!info.absoluteDir().exists())
        return fail(QStringLiteral("the folder %1 does not exist; make it first").arg(info.absolutePath()));
    QSaveFile file(i_rPath);
    if (!file.open(QIODevice::WriteOnly))
        return fail(file.errorString());
    QImageWriter writer(&file, "png");
    if (!writer.write(i_rPicture))
        return fail(file.error() != QFileDevice::NoError ? file.errorString() : writer.errorString());
    if (!file.commit())
        return fail(file.errorString());
    return TQL::Result::Ok;
}

} // namespace Studio
