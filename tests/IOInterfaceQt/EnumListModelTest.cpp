#include "IOInterfaceQt/VEnumListModel.h"

#include <QtTest/QAbstractItemModelTester>
#include <gtest/gtest.h>

using TQL::IO::VEnumListModel;

TEST(EnumListModel, GivesItsRowsByRole)
{
    VEnumListModel model({{"Ten", 10, "first"}, {"Also ten", 10, "second"}, {"Text", QString("t"), {}}});
    const QAbstractItemModelTester tester(&model, QAbstractItemModelTester::FailureReportingMode::Fatal);
    QString table;
    const QHash<int, QByteArray> names = model.roleNames();
    for (int row = 0; row < model.rowCount(); ++row)
        for (const int role : {256, 257, 258})
            table += names[role] + "=" + model.data(model.index(row, 0), role).toString() + (role == 258 ? "\n" : " ");
    EXPECT_EQ(table.toStdString(), "key=Ten value=10 details=first\n"
                                   "key=Also ten value=10 details=second\n"
                                   "key=Text value=t details=\n");
    EXPECT_EQ(model.rowCount(model.index(0, 0)), 0) << "a list, no tree";
    EXPECT_FALSE(model.data(QModelIndex(), VEnumListModel::EKeyRole).isValid());

    const std::pair<QVariant, int> searches[] = {{10, 0}, {QString("t"), 2}, {11, -1}, {QVariant(), -1}};
    for (const auto& [rValue, index] : searches)
        EXPECT_EQ(model.findFirstValueIndex(rValue), index) << rValue.toString().toStdString();
}
