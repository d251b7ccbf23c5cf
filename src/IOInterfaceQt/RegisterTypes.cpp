#include "IOInterfaceQt/RegisterTypes.h"

#include "IOInterfaceQt/EnumSchemas.h"
#include "IOInterfaceQt/ISchemaRegistryQml.h"
#include "IOInterfaceQt/ITickDefaultRateQml.h"
#include "IOInterfaceQt/VEnumListModel.h"
#include "IOInterfaceQt/VEnumPropertyMap.h"
#include "IOInterfaceQt/VResultNamespaceObjectQml.h"

#include <QtQml/QQmlEngine>
#include <QtQml/qqml.h>

namespace TQL::IO
{
namespace
{

constexpr const char* TypesModule = "Zarvo.Types";
constexpr const char* IntrospectionModule = "Zarvo.Introspection";

/// QML holds a schema as a value and only hands it on.
class ISchemaQml
{
    Q_GADGET
    QML_VALUE_TYPE(iSchema)
    QML_FOREIGN(TQL::ISchema)
};

template <typename T>
QObject* MakeSingleton(QQmlEngine*, QJSEngine*)
{
    return new T;
}

/// A result word that QML holds as a number.
template <typename TNumber>
void RegisterResultFrom()
{
    QMetaType::registerConverter<TNumber, IResult>(
        [](TNumber i_Number) { return IResult(static_cast<std::uint32_t>(static_cast<qint64>(i_Number))); });
}

} // namespace

void RegisterQmlTypes()
{
    static const bool s_bRegistered = []
    {
        RegisterResultFrom<int>();
        RegisterResultFrom<uint>();
        RegisterResultFrom<double>();
        qmlRegisterSingletonType<VResultNamespaceObjectQml>(TypesModule, 1, 0, "Result",
                                                            &MakeSingleton<VResultNamespaceObjectQml>);
        qmlRegisterTypesAndRevisions<ITickDefaultRateQml>(TypesModule, 1);
        qmlRegisterTypesAndRevisions<ISchemaQml>(IntrospectionModule, 1);
        qmlRegisterSingletonType<ISchemaRegistryQml>(IntrospectionModule, 1, 0, "ISchemaRegistry",
                                                     &MakeSingleton<ISchemaRegistryQml>);
        qmlRegisterUncreatableType<VEnumListModel>(
            IntrospectionModule, 1, 0, "EnumListModel",
            QStringLiteral("%1 can only be created from c++.").arg(QStringLiteral("EnumListModel")));
        return true;
    }();
    Q_UNUSED(s_bRegistered)
}

void RegisterEnumMap(const char* i_pModule, const char* i_pName, const QMetaEnum& i_rEnum)
{
    qmlRegisterSingletonType<VEnumPropertyMap>(i_pModule, 1, 0, i_pName,
                                               [metaEnum = i_rEnum](QQmlEngine*, QJSEngine*) -> QObject*
                                               { return new VEnumPropertyMap(MakeEnumSchema(metaEnum)); });
}

void RegisterEnumMap(const char* i_pModule, const char* i_pName, const ISchema& i_rSchema)
{
    qmlRegisterSingletonType<VEnumPropertyMap>(i_pModule, 1, 0, i_pName,
                                               [pSchema = &i_rSchema](QQmlEngine*, QJSEngine*) -> QObject*
                                               { return new VEnumPropertyMap(*pSchema); });
}

} // namespace TQL::IO

#include "RegisterTypes.moc"
