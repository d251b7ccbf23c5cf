#include "IOInterfaceQt/VReadOnlyPropertyMap.h"

#include <QtCore/QtDebug>

#include <algorithm>

namespace TQL::IO
{

const QVariant* VReadOnlyPropertyMap::Find(const QString& i_rName) const
{
    const auto found = std::ranges::find(m_Entries, i_rName, &Entry::first);
    return found == m_Entries.end() ? nullptr : &found->second;
}

QVariant VReadOnlyPropertyMap::updateValue(const QString& i_rName, const QVariant&)
{
    const QVariant* pKept = Find(i_rName);
    qWarning(pKept ? "Modifying properties of a C++ singleton is not permitted."
                   : "Adding properties to a C++ enum singleton is not permitted.");
    return pKept ? *pKept : QVariant();
}

void VReadOnlyPropertyMap::SetEntries(std::vector<Entry> i_Entries)
{
    m_Entries = std::move(i_Entries);
    for (const auto& [rName, rValue] : m_Entries)
        if (!contains(rName))
            insert(rName, rValue);
}

} // namespace TQL::IO
