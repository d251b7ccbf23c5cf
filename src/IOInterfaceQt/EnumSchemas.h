#pragma once

#include "IOInterfaceQt/VEnumListModel.h"

#include <QtCore/QMetaEnum>

namespace TQL
{
struct ISchema;
}

namespace TQL::IO
{

/// The schema of an enumeration known to Qt (Q_ENUM, Q_ENUM_NS), with 32-bit storage.
ISchema MakeEnumSchema(const QMetaEnum& i_rEnum);

/// One row for each value of an enum schema: its name, its number and its documentation. Empty for any other schema.
std::vector<VEnumListModel::Row> EnumRows(const ISchema& i_rSchema);

} // namespace TQL::IO
