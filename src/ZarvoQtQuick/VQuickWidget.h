#pragma once

#include "OrvanePluginInterface/IQuickWidget.h"

#include <QtQuickWidgets/QQuickWidget>

class QQmlComponent;
class QQmlContext;
class QQmlPropertyMap;

namespace ZarvoQtQuick
{

/// The bridge from a widget window to a QML scene: finds a component in folders or resources, loads it on the engine
/// that all windows share, in a context of its own, and tells the log how that went. Context properties belong to this
/// widget alone. Set them before SetSource. UI thread. An empty source ends the scene while its context still lives.
class VQuickWidget : public QQuickWidget, public TQL::IQuickWidget
{
    Q_OBJECT

public:
    /// A null engine makes one of its own, without network access.
    explicit VQuickWidget(QQmlEngine* i_pEngine, QWidget* i_pParent = nullptr);
    ~VQuickWidget() override;

    void SetContextProperty(const QString& i_rName, QObject* i_pObject) override;
    void SetContextProperty(const QString& i_rName, const QVariant& i_rValue) override;
    void AddImportPath(const QString& i_rFolder) override;
    QStringList ImportPaths() const override;
    void SetSource(const QString& i_rRelativeName, const QStringList& i_rFolders) override;
    QUrl Source() const override { return m_Source; }
    void SetSearchFolders(const QStringList& i_rFolders) override { m_SearchFolders = i_rFolders; }
    QStringList SearchFolders() const override { return m_SearchFolders; }
    QQmlPropertyMap* PersistentProperties() const override { return m_pPersistentProperties; }
    void EmitPreSave() override;
    void EmitPostLoad() override;
    QQuickWidget* Widget() override { return this; }

    /// Ends the scene; the context properties stay.
    void ClearSource();

    Q_INVOKABLE QPoint mapToGlobal(int i_X, int i_Y) const;

Q_SIGNALS:
    void prePersistentPropertiesSave();
    void postPersistentPropertiesLoad();

private:
    void OnComponentStatus();
    void CreateRoot();

    QQmlContext* m_pContext = nullptr;                  // child of this widget
    QQmlPropertyMap* m_pPersistentProperties = nullptr; // child of this widget
    QQmlComponent* m_pComponent = nullptr;              // owned by this widget
    QStringList m_SearchFolders;
    QUrl m_Source;
};

} // namespace ZarvoQtQuick
