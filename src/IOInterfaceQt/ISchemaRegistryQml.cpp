#include "IOInterfaceQt/ISchemaRegistryQml.h"

#include "IOInterfaceQt/EnumSchemas.h"

#include <algorithm>

namespace TQL::IO
{
namespace
{

/// Null for a schema that is no enum and for an index that it does not have.
const SchemaEnumValue* FindByIndex(const ISchema& i_rSchema, int i_Index)
{
    const bool bKnown = IsEnum(i_rSchema.Type) && i_Index >= 0 && i_Index < std::ssize(i_rSchema.EnumValues);
    return bKnown ? &i_rSchema.EnumValues[static_cast<std::size_t>(i_Index)] : nullptr;
}

template <typename T, typename TMember>
const SchemaEnumValue* FindBy(const ISchema& i_rSchema, const T& i_rValue, TMember SchemaEnumValue::*i_pMember)
{
    const auto found = std::ranges::find(i_rSchema.EnumValues, i_rValue, i_pMember);
    return IsEnum(i_rSchema.Type) && found != i_rSchema.EnumValues.end() ? &*found : nullptr;
}

QVariant NameOf(const SchemaEnumValue* i_pValue)
{
    return i_pValue ? QVariant(QString::fromStdString(i_pValue->Name)) : QVariant();
}

QVariant NumberOf(const SchemaEnumValue* i_pValue)
{
    return i_pValue ? QVariant(i_pValue->Value) : QVariant();
}

} // namespace

bool ISchemaRegistryQml::isBool(const TQL::ISchema& i_rSchema) const
{
    return i_rSchema.Type == EType::Bool;
}

bool ISchemaRegistryQml::isInt(const TQL::ISchema& i_rSchema) const
{
    return i_rSchema.Type >= EType::Int8 && i_rSchema.Type <= EType::UInt64;
}

bool ISchemaRegistryQml::isFloat(const TQL::ISchema& i_rSchema) const
{
    return i_rSchema.Type == EType::Float32 || i_rSchema.Type == EType::Float64;
}

bool ISchemaRegistryQml::isString(const TQL::ISchema& i_rSchema) const
{
    return i_rSchema.Type == EType::String;
}

bool ISchemaRegistryQml::isEnum(const TQL::ISchema& i_rSchema) const
{
    return IsEnum(i_rSchema.Type);
}

QVariant ISchemaRegistryQml::enumValueToKey(const TQL::ISchema& i_rSchema, int i_Value) const
{
    return NameOf(FindBy(i_rSchema, i_Value, &SchemaEnumValue::Value));
}

QVariant ISchemaRegistryQml::enumKeyToValue(const TQL::ISchema& i_rSchema, const QString& i_rKey) const
{
    return NumberOf(FindBy(i_rSchema, i_rKey.toStdString(), &SchemaEnumValue::Name));
}

int ISchemaRegistryQml::enumKeyCount(const TQL::ISchema& i_rSchema) const
{
    return IsEnum(i_rSchema.Type) ? static_cast<int>(i_rSchema.EnumValues.size()) : 0;
}

QVariant ISchemaRegistryQml::enumKey(const TQL::ISchema& i_rSchema, int i_Index) const
{
    return NameOf(FindByIndex(i_rSchema, i_Index));
}

QVariant ISchemaRegistryQml::enumValue(const TQL::ISchema& i_rSchema, int i_Index) const
{
    return NumberOf(FindByIndex(i_rSchema, i_Index));
}

VEnumListModel* ISchemaRegistryQml::enumModel(const TQL::ISchema& i_rSchema) const
{
    return new VEnumListModel(EnumRows(i_rSchema));
}

} // namespace TQL::IO
