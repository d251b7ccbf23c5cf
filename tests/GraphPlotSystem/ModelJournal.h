#pragma once

#include <QtCore/QAbstractItemModel>
#include <QtTest/QAbstractItemModelTester>

#include <algorithm>
#include <string>
#include <utility>

/// Writes down what a list model tells its views, one word a signal, and has the model checked by Qt's own tester.
class ModelJournal : public QObject
{
public:
    explicit ModelJournal(QAbstractItemModel& i_rModel)
        : m_Tester(&i_rModel, QAbstractItemModelTester::FailureReportingMode::Fatal)
    {
        connect(&i_rModel, &QAbstractItemModel::rowsInserted, this,
                [this](const QModelIndex&, int i_First, int i_Last) { Note("insert ", i_First, i_Last); });
        connect(&i_rModel, &QAbstractItemModel::rowsRemoved, this,
                [this](const QModelIndex&, int i_First, int i_Last) { Note("remove ", i_First, i_Last); });
        connect(&i_rModel, &QAbstractItemModel::modelReset, this, [this] { m_Text += "reset; "; });
        connect(&i_rModel, &QAbstractItemModel::dataChanged, this,
                [this](const QModelIndex& i_rFirst, const QModelIndex& i_rLast, QList<int> i_Roles)
                {
                    std::ranges::sort(i_Roles);
                    std::string roles;
                    for (const int role : i_Roles)
                        roles += " " + std::to_string(role);
                    Note("change ", i_rFirst.row(), i_rLast.row(), roles);
                });
    }

    /// What has been told since the last call.
    std::string Take() { return std::exchange(m_Text, {}); }

private:
    void Note(const char* i_pWhat, int i_First, int i_Last, const std::string& i_rRoles = {})
    {
        m_Text += i_pWhat + std::to_string(i_First);
        if (i_Last != i_First)
            m_Text += ".." + std::to_string(i_Last);
        m_Text += i_rRoles + "; ";
    }

    QAbstractItemModelTester m_Tester;
    std::string m_Text;
};
