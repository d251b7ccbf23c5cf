#pragma once

#include <QtCore/QMetaEnum>

namespace TQL
{
struct ISchema;
}

namespace TQL::IO
{

/// Registers what this room has for QML: Result and the tick value in Zarvo.Types 1.0; ISchema, ISchemaRegistry and
/// EnumListModel in Zarvo.Introspection 1.0. Once a process; repeating it does nothing. UI thread.
void RegisterQmlTypes();

/// Registers an enumeration known to Qt (Q_ENUM, Q_ENUM_NS) as a singleton VEnumPropertyMap, made on first use, of a
/// module of version 1.0. The two texts must live on.
void RegisterEnumMap(const char* i_pModule, const char* i_pName, const QMetaEnum& i_rEnum);

/// The same for an enumeration with a schema of its own, which must live on.
void RegisterEnumMap(const char* i_pModule, const char* i_pName, const ISchema& i_rSchema);

} // namespace TQL::IO
