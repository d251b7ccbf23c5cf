#include "Services/Ui/VQuickWidgetPersistence.h"

#include "OrvanePluginInterface/IQuickWidget.h"

#include <QtCore/QJsonArray>
#include <QtCore/QJsonDocument>
#include <QtQml/QJSValue>
#include <QtQml/QQmlPropertyMap>

namespace Services
{

// JSON documents hold a list or a map, so the one value travels as a list of one whose brackets are taken off.

std::optional<std::string> PersistentText(const QVariant& i_rValue)
{
    const bool bScript = i_rValue.userType() == qMetaTypeId<QJSValue>();
    const QVariant value = bScript ? i_rValue.value<QJSValue>().toVariant() : i_rValue;
    const QJsonValue json = QJsonValue::fromVariant(value);
    if (json.isUndefined() || (json.isNull() && value.isValid() && !value.isNull()))
        return std::nullopt;
    const QByteArray text = QJsonDocument(QJsonArray{json}).toJson(QJsonDocument::Compact);
    return text.mid(1, text.size() - 2).toStdString();
}

QVariant PersistentValue(const std::string& i_rText)
{
    QJsonParseError error;
    const QByteArray text = '[' + QByteArray::fromStdString(i_rText) + ']';
    const QJsonArray list = QJsonDocument::fromJson(text, &error).array();
    if (error.error != QJsonParseError::NoError || list.size() != 1)
        return QString::fromStdString(i_rText);
    return list.first().toVariant();
}

VQuickWidgetPersistence::VQuickWidgetPersistence(ThreadCheckPointer i_pCheck) : m_pCheck(std::move(i_pCheck)) {}

void VQuickWidgetPersistence::ReadProperties(TQL::IQuickWidget* i_pWidget, Entries& o_rEntries)
{
    CheckThread(m_pCheck, "IQuickWidgetPersistence::ReadProperties");
    o_rEntries.clear();
    if (!i_pWidget)
        return;
    i_pWidget->EmitPreSave();
    const QQmlPropertyMap* pMap = i_pWidget->PersistentProperties();
    QStringList keys = pMap->keys();
    keys.sort();
    for (const QString& rKey : keys)
        if (auto text = PersistentText(pMap->value(rKey)))
            o_rEntries.emplace_back(rKey.toStdString(), std::move(*text));
}

void VQuickWidgetPersistence::WriteProperties(const Entries& i_rEntries, TQL::IQuickWidget* i_pWidget)
{
    CheckThread(m_pCheck, "IQuickWidgetPersistence::WriteProperties");
    if (!i_pWidget)
        return;
    QQmlPropertyMap* pMap = i_pWidget->PersistentProperties();
    for (const auto& [key, text] : i_rEntries)
        pMap->insert(QString::fromStdString(key), PersistentValue(text));
    i_pWidget->EmitPostLoad();
}

} // namespace Services
