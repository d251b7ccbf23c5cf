#pragma once

#include "IOInterfaceQt/VReadOnlyPropertyMap.h"

#include <QtCore/QChar>

namespace TQL
{
struct ISchema;
}

namespace TQL::IO
{

/// An enumeration for QML: each name is a property that holds its value. Also translates between names and values,
/// one at a time or, for flags, several at once: names joined by Separator stand for the bits of their values together.
/// An argument that cannot be translated gives null, and a warning where the text tells which part of it is to blame.
class VEnumPropertyMap : public VReadOnlyPropertyMap
{
    Q_OBJECT

public:
    static constexpr QChar Separator = QLatin1Char('|');

    explicit VEnumPropertyMap(std::vector<Entry> i_Entries, QObject* i_pParent = nullptr);
    /// The values of an enum schema; none for any other schema.
    explicit VEnumPropertyMap(const ISchema& i_rSchema, QObject* i_pParent = nullptr);

    Q_INVOKABLE QVariantList values() const; ///< in the order of the enumeration
    Q_INVOKABLE QVariant keyToValue(const QString& i_rKey) const;
    Q_INVOKABLE QVariant keysToValue(const QString& i_rKeys) const;  ///< 0 for the empty text
    Q_INVOKABLE QVariant valueToKey(const QVariant& i_rValue) const; ///< the first of several names
    /// The names whose bits are all set. For 0 the name of 0, or the empty text.
    Q_INVOKABLE QVariant valueToKeys(const QVariant& i_rValue) const;
};

} // namespace TQL::IO
