#include "GraphPlotSystem/Common/ModelRoleNames.h"

namespace GraphPlotUI
{

namespace
{

constexpr bool IsCapital(char i_Character)
{
    return i_Character >= 'A' && i_Character <= 'Z';
}

} // namespace

QByteArray ModelRoleName(std::string_view i_Enumerator)
{
    constexpr std::string_view suffix = "Role";
    if (i_Enumerator.ends_with(suffix))
        i_Enumerator.remove_suffix(suffix.size());
    if (i_Enumerator.size() > 2 && i_Enumerator[0] == 'E' && IsCapital(i_Enumerator[1]))
        i_Enumerator.remove_prefix(1);
    QByteArray name(i_Enumerator.data(), static_cast<qsizetype>(i_Enumerator.size()));
    if (!name.isEmpty() && IsCapital(name[0]))
        name[0] = static_cast<char>(name[0] - 'A' + 'a');
    return name;
}

QHash<int, QByteArray> ModelRoleNames(const QMetaEnum& i_rRoles)
{
    QHash<int, QByteArray> names;
    for (int i = 0; i < i_rRoles.keyCount(); ++i)
        names.insert(i_rRoles.value(i), ModelRoleName(i_rRoles.key(i)));
    return names;
}

} // namespace GraphPlotUI
