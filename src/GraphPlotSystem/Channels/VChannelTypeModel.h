#pragma once

#include "GraphPlotSystem/Channels/ChannelTypeRows.h"
#include "TQL/IResult.h"

#include <QtCore/QAbstractListModel>

#include <memory>
#include <string>
#include <vector>

namespace ChannelSystem
{
class IChannelService;
}

namespace TQL
{
class IChannelTypeRegistry;
}

namespace GraphPlotUI
{

/// The list behind a channel type picker: the types that apply to what is selected in the host, or the global types,
/// which need no selection. Row 0 is "Auto" or "None"; headers stand above the types of a category. The active channel
/// manager owns one of each kind and tells it when to look again. Roles: EChannelTypeModelRoles. UI thread.
class VChannelTypeModel : public QAbstractListModel
{
    Q_OBJECT
    Q_PROPERTY(bool showSelectedChannelTypes READ ShowsSelectedChannelTypes CONSTANT)
    Q_PROPERTY(int currentRowIndex READ GetCurrentRowIndex WRITE SetCurrentRowIndex NOTIFY currentRowIndexChanged)
    Q_PROPERTY(QString currentChannelType READ GetCurrentChannelType NOTIFY currentRowIndexChanged)
    Q_PROPERTY(QString autoDisplayChannelType READ GetAutoDisplayChannelType NOTIFY autoChannelTypeChanged)
    Q_PROPERTY(QString autoChannelType READ GetAutoChannelType NOTIFY autoChannelTypeChanged)

public:
    /// The registry may be null: then there are no creatable types.
    VChannelTypeModel(std::shared_ptr<TQL::IChannelTypeRegistry> i_pTypeRegistry,
                      std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService, bool i_bDeveloperMode,
                      bool i_bShowSelectedChannelTypes, QObject* i_pParent = nullptr);

    int rowCount(const QModelIndex& i_rParent = QModelIndex()) const override;
    QVariant data(const QModelIndex& i_rIndex, int i_Role) const override;
    QHash<int, QByteArray> roleNames() const override;

    /// Asks the host anew for its types. The rows are replaced only when they differ; the current type stays current
    /// while it is listed, otherwise row 0 becomes it.
    void Rebuild(const std::string& i_rContextName);

    /// Asks the host what is selected. Only rows of selected types other than row 0 can become unavailable.
    void UpdateAvailability();

    /// The type that "Auto" stands for now; empty when nothing that can be plotted is selected.
    void SetAutoChannelType(const std::string& i_rInternalName);

    /// Makes a type current by name. A name that is not listed gives row 0 and OkButModified. Before the first Rebuild
    /// the name is kept and looked up then.
    TQL::IResult LoadState(const std::string& i_rInternalName);
    std::string SaveState() const;

    /// Row 0 becomes the current one.
    void SelectNone() { SetCurrentRowIndex(0); }

    /// The current type as it was picked: "Auto" stands for itself.
    const std::string& GetPickedType() const { return m_CurrentChannelType; }

    /// The current type, with the type that "Auto" stands for in its place when there is one.
    const std::string& GetEffectiveType() const;
    bool IsAuto() const;

    bool ShowsSelectedChannelTypes() const { return m_bShowSelectedChannelTypes; }
    int GetCurrentRowIndex() const { return m_CurrentRowIndex; } ///< -1 before the first Rebuild
    /// The index of a header or of no row is refused.
    void SetCurrentRowIndex(int i_Index);
    QString GetCurrentChannelType() const { return QString::fromStdString(GetEffectiveType()); }
    QString GetAutoDisplayChannelType() const { return m_AutoDisplayChannelType; }
    QString GetAutoChannelType() const { return QString::fromStdString(m_AutoChannelType); }

Q_SIGNALS:
    void currentRowIndexChanged();
    void autoChannelTypeChanged();

private:
    void SetCurrent(int i_Index);
    bool UpdateAutoDisplay();

    const std::shared_ptr<TQL::IChannelTypeRegistry> m_pTypeRegistry; ///< may be null
    const std::shared_ptr<ChannelSystem::IChannelService> m_pChannelService;
    const bool m_bDeveloperMode;
    const bool m_bShowSelectedChannelTypes;
    std::vector<ChannelTypeRow> m_Rows;
    int m_CurrentRowIndex = -1;
    std::string m_CurrentChannelType;
    std::string m_AutoChannelType;
    QString m_AutoDisplayChannelType;
};

} // namespace GraphPlotUI
