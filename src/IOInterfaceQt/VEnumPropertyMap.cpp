#include "IOInterfaceQt/VEnumPropertyMap.h"

#include "IOInterfaceQt/EnumSchemas.h"

#include <QtCore/QStringList>
#include <QtCore/QtDebug>

#include <cmath>
#include <limits>
#include <optional>

namespace TQL::IO
{
namespace
{

/// The whole number that a variant holds. Numbers that come from QML may be doubles however whole they are.
std::optional<qint64> WholeNumber(const QVariant& i_rValue)
{
    switch (i_rValue.typeId())
    {
    case QMetaType::Char:
    case QMetaType::SChar:
    case QMetaType::UChar:
    case QMetaType::Short:
    case QMetaType::UShort:
    case QMetaType::Int:
    case QMetaType::UInt:
    case QMetaType::Long:
    case QMetaType::ULong:
    case QMetaType::LongLong:
        return i_rValue.toLongLong();
    case QMetaType::ULongLong:
        return static_cast<qint64>(i_rValue.toULongLong());
    case QMetaType::Double:
        break;
    default:
        return std::nullopt;
    }
    constexpr double exactLimit = 9007199254740992.0;
    const double number = i_rValue.toDouble();
    if (std::trunc(number) != number || std::abs(number) > exactLimit)
        return std::nullopt;
    return static_cast<qint64>(number);
}

/// Negative values of 32-bit enumerations stand for the same bits as their unsigned twins.
std::optional<quint64> BitsOf(const QVariant& i_rValue)
{
    const std::optional<qint64> number = WholeNumber(i_rValue);
    if (!number)
        return std::nullopt;
    const bool b32BitNegative = *number < 0 && *number >= std::numeric_limits<qint32>::min();
    return b32BitNegative ? static_cast<quint32>(static_cast<qint32>(*number)) : static_cast<quint64>(*number);
}

QVariant NumberOfBits(quint64 i_Bits)
{
    if (i_Bits <= static_cast<quint64>(std::numeric_limits<int>::max()))
        return static_cast<int>(i_Bits);
    return i_Bits <= std::numeric_limits<quint32>::max() ? QVariant(static_cast<quint32>(i_Bits)) : QVariant(i_Bits);
}

std::vector<VReadOnlyPropertyMap::Entry> EntriesOf(const ISchema& i_rSchema)
{
    std::vector<VReadOnlyPropertyMap::Entry> entries;
    for (const VEnumListModel::Row& rRow : EnumRows(i_rSchema))
        entries.emplace_back(rRow.Key, rRow.Value);
    return entries;
}

} // namespace

VEnumPropertyMap::VEnumPropertyMap(std::vector<Entry> i_Entries, QObject* i_pParent)
    : VReadOnlyPropertyMap(this, i_pParent)
{
    SetEntries(std::move(i_Entries));
}

VEnumPropertyMap::VEnumPropertyMap(const ISchema& i_rSchema, QObject* i_pParent)
    : VEnumPropertyMap(EntriesOf(i_rSchema), i_pParent)
{
}

QVariantList VEnumPropertyMap::values() const
{
    QVariantList values;
    for (const auto& [rKey, rValue] : Entries())
        values.append(rValue);
    return values;
}

QVariant VEnumPropertyMap::keyToValue(const QString& i_rKey) const
{
    const QVariant* pValue = Find(i_rKey);
    return pValue ? *pValue : QVariant();
}

QVariant VEnumPropertyMap::keysToValue(const QString& i_rKeys) const
{
    quint64 bits = 0;
    for (const QString& rKey : i_rKeys.split(Separator, Qt::SkipEmptyParts))
    {
        const QVariant value = keyToValue(rKey);
        if (value.isNull())
        {
            qWarning().noquote() << QStringLiteral(
                                        "Cannot convert keys '%1' to a single value, key '%2' value is null.")
                                        .arg(i_rKeys, rKey);
            return {};
        }
        const std::optional<quint64> valueBits = BitsOf(value);
        if (!valueBits)
        {
            qWarning().noquote()
                << QStringLiteral("Cannot convert keys '%1' to a single value, key '%2' value '%3' is not an integer.")
                       .arg(i_rKeys, rKey, value.toString());
            return {};
        }
        bits |= *valueBits;
    }
    return NumberOfBits(bits);
}

QVariant VEnumPropertyMap::valueToKey(const QVariant& i_rValue) const
{
    const std::optional<quint64> bits = BitsOf(i_rValue);
    for (const auto& [rKey, rValue] : Entries())
        if (bits ? BitsOf(rValue) == bits : rValue == i_rValue)
            return rKey;
    return {};
}

QVariant VEnumPropertyMap::valueToKeys(const QVariant& i_rValue) const
{
    const std::optional<quint64> bits = BitsOf(i_rValue);
    if (!bits)
    {
        qWarning().noquote() << QStringLiteral(
                                    "Cannot convert value '%1' to a combined set of keys, value is not an integer.")
                                    .arg(i_rValue.toString());
        return {};
    }
    QStringList keys;
    for (const auto& [rKey, rValue] : Entries())
    {
        const std::optional<quint64> keyBits = BitsOf(rValue);
        const bool bListed = keyBits && *keyBits != 0 && (*bits & *keyBits) == *keyBits;
        const bool bNameOfZero = keyBits && *keyBits == 0 && *bits == 0 && keys.isEmpty();
        if (bListed || bNameOfZero)
            keys.append(rKey);
    }
    return keys.join(Separator);
}

} // namespace TQL::IO
