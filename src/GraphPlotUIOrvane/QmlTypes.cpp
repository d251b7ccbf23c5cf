#include "GraphPlotUIOrvane/QmlTypes.h"

#include "GraphPlotSystem/Channels/ChannelOptionEnums.h"
#include "GraphPlotSystem/Channels/EActiveChannelModelRoles.h"
#include "GraphPlotSystem/Channels/EChannelTypeModelRoles.h"
#include "GraphPlotSystem/Common/ESubplotLayoutModes.h"
#include "GraphPlotSystem/Common/ESubplotPinState.h"
#include "GraphPlotSystem/Subplots/VKeyModel.h"
#include "GraphPlotSystem/Subplots/VSubplotModel.h"
#include "GraphPlotSystem/Subplots/VTraceModel.h"
#include "GraphPlotUI/Axes/VTimeAxisRenderType.h"
#include "GraphPlotUI/Axes/VValueAxisRenderType.h"
#include "GraphPlotUI/Frame/VGraphPlotFBO.h"
#include "GraphPlotUI/RegisterResources.h"
#include "GraphPlotUI/Traces/VSubplotRenderType.h"
#include "GraphPlotUIOrvane/Preferences/VGraphPlotStorePreferences.h"
#include "IOInterfaceQt/RegisterTypes.h"
#include "TQL/SchemaIntern.h"

#include <QtCore/QDir>
#include <QtCore/QMetaEnum>
#include <QtQml/QQmlEngine>
#include <QtQml/qqml.h>

#include <utility>

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
    TQL::IO::RegisterQmlTypes();
    const std::pair<const char*, QMetaEnum> maps[] = {
        {"ChannelTypeModelRoles", QMetaEnum::fromType<TQL::ChannelTypeModelRoles::EChannelTypeModelRoles>()},
        {"ActiveChannelModelRoles", QMetaEnum::fromType<TQL::ActiveChannelModelRoles::EActiveChannelModelRoles>()},
        {"KeyModelRoles", QMetaEnum::fromType<TQL::KeyModelRoles::EKeyModelRoles>()},
        {"SubplotModelRoles", QMetaEnum::fromType<TQL::SubplotModelRoles::ESubplotModelRoles>()},
        {"SubplotLayoutModes", QMetaEnum::fromType<TQL::SubplotLayoutModes::ESubplotLayoutModes>()},
        {"SubplotPinStates", QMetaEnum::fromType<TQL::SubplotPinStates::ESubplotPinState>()},
        {"TraceModelRoles", QMetaEnum::fromType<TQL::TraceModelRoles::ETraceModelRoles>()},
    };
    for (const auto& [pName, map] : maps)
        TQL::IO::RegisterEnumMap(pModule, pName, map);
    TQL::IO::RegisterEnumMap(pModule, "TraceColourSets",
                             TQL::IO::GetUniqueSchema(DescribeSchema(std::type_identity<ETraceColourSet>())));
    TQL::IO::RegisterEnumMap(pModule, "RotationUnits", RotationUnitsSchema());
    TQL::IO::RegisterEnumMap(pModule, "LengthUnits", LengthUnitsSchema());
}

QString SourceFolder(const char* i_pRoom)
{
    return QDir::cleanPath(QStringLiteral(GRAPHPLOTS_SOURCE_FOLDER) + QLatin1Char('/') + QLatin1String(i_pRoom));
}

void AddDevelopmentPaths(QQmlEngine& i_rEngine)
{
    const QString hostFacing = SourceFolder("GraphPlotUIOrvane");
    for (const QString& rFolder : {SourceFolder("GraphPlotUI/qml"), hostFacing})
        i_rEngine.addImportPath(rFolder); // one that the engine has already only moves to the front
    const QString prefix = QStringLiteral("qml");
    if (const QStringList folders = QDir::searchPaths(prefix); !folders.contains(hostFacing))
        QDir::setSearchPaths(prefix, folders + QStringList(hostFacing));
}

} // namespace GraphPlotUI
