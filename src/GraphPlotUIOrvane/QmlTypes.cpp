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

void AddResourceImportPath(QQmlEngine& i_rEngine)
{
    const QString path = QStringLiteral("qrc:/");
    if (!i_rEngine.importPathList().contains(path))
        i_rEngine.addImportPath(path);
}

} // namespace GraphPlotUI
