#pragma once

#include <QtCore/QVariant>
#include <QtQml/QQmlPropertyMap>

#include <utility>
#include <vector>

namespace TQL::IO
{

/// A fixed set of named values for QML, which can read them and neither change them nor add to them: an attempt leaves
/// a warning and the old value. Base of the enum maps. UI thread.
class VReadOnlyPropertyMap : public QQmlPropertyMap
{
    Q_OBJECT

public:
    using Entry = std::pair<QString, QVariant>;

    const std::vector<Entry>& Entries() const { return m_Entries; }

    /// Null when no entry has the name; the first one counts.
    const QVariant* Find(const QString& i_rName) const;

protected:
    template <typename TDerived>
    VReadOnlyPropertyMap(TDerived* i_pDerived, QObject* i_pParent) : QQmlPropertyMap(i_pDerived, i_pParent)
    {
    }

    /// Called once, by the constructor of the derived class. The first of several entries of one name counts.
    void SetEntries(std::vector<Entry> i_Entries);

    QVariant updateValue(const QString& i_rName, const QVariant& i_rInput) override;

private:
    std::vector<Entry> m_Entries; ///< the map itself also knows the names that QML tried to add
};

} // namespace TQL::IO
