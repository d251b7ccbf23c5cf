#pragma once

#include <QtCore/QAbstractListModel>
#include <QtCore/QVariant>

#include <vector>

namespace TQL::IO
{

/// A fixed list of choices for QML: one row a choice, with a text to show, the value that it stands for and details.
/// Made by native code only, which also gives it its owner. UI thread.
class VEnumListModel : public QAbstractListModel
{
    Q_OBJECT

public:
    enum EModelRoles
    {
        EKeyRole = Qt::UserRole, ///< "key": the text
        EValueRole,              ///< "value"
        EDetailsRole             ///< "details"
    };
    Q_ENUM(EModelRoles)

    struct Row
    {
        QString Key;
        QVariant Value;
        QString Details;
    };

    explicit VEnumListModel(std::vector<Row> i_Rows, QObject* i_pParent = nullptr);

    int rowCount(const QModelIndex& i_rParent = QModelIndex()) const override;
    QVariant data(const QModelIndex& i_rIndex, int i_Role) const override;
    QHash<int, QByteArray> roleNames() const override;

    const std::vector<Row>& Rows() const { return m_Rows; }

    /// The first row with that value, -1 when there is none.
    Q_INVOKABLE int findFirstValueIndex(const QVariant& i_rValue) const;

private:
    const std::vector<Row> m_Rows;
};

} // namespace TQL::IO
