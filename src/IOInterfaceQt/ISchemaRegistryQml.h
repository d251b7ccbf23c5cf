#pragma once

#include "TQL/ISchema.h"

#include <QtCore/QObject>
#include <QtCore/QVariant>

namespace TQL::IO
{

class VEnumListModel;

/// Schemas for QML, there the singleton ISchemaRegistry of module Zarvo.Introspection: asks a schema what it describes
/// and translates the values of enum schemas. Anything asked of a schema that is no enum, or of a value, name or index
/// that it does not have, gives null.
class ISchemaRegistryQml : public QObject
{
    Q_OBJECT

public:
    using QObject::QObject;

    Q_INVOKABLE bool isBool(const TQL::ISchema& i_rSchema) const;
    Q_INVOKABLE bool isInt(const TQL::ISchema& i_rSchema) const; ///< of any size, with or without sign
    Q_INVOKABLE bool isFloat(const TQL::ISchema& i_rSchema) const;
    Q_INVOKABLE bool isString(const TQL::ISchema& i_rSchema) const;
    Q_INVOKABLE bool isEnum(const TQL::ISchema& i_rSchema) const;

    Q_INVOKABLE QVariant enumValueToKey(const TQL::ISchema& i_rSchema, int i_Value) const;
    Q_INVOKABLE QVariant enumKeyToValue(const TQL::ISchema& i_rSchema, const QString& i_rKey) const;
    Q_INVOKABLE int enumKeyCount(const TQL::ISchema& i_rSchema) const;
    Q_INVOKABLE QVariant enumKey(const TQL::ISchema& i_rSchema, int i_Index) const;
    Q_INVOKABLE QVariant enumValue(const TQL::ISchema& i_rSchema, int i_Index) const;

    /// A new model, which the QML engine owns; without rows for a schema that is no enum.
    Q_INVOKABLE TQL::IO::VEnumListModel* enumModel(const TQL::ISchema& i_rSchema) const;
};

} // namespace TQL::IO
