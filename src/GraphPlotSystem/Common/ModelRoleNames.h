#pragma once

#include <QtCore/QByteArray>
#include <QtCore/QHash>
#include <QtCore/QMetaEnum>

#include <string_view>

namespace GraphPlotUI
{

/// The name under which QML reads a role: the enumerator's without a suffix "Role" and without a leading "E" that
/// stands before another capital, with a small first letter.
QByteArray ModelRoleName(std::string_view i_Enumerator);

/// The names of all roles of an enum.
QHash<int, QByteArray> ModelRoleNames(const QMetaEnum& i_rRoles);

} // namespace GraphPlotUI
