#include "support/ui/list_ops.h"
#include "support/ui/option_group.h"

#include <QComboBox>
#include <QListWidget>
#include <QRadioButton>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

// Texts and data of every item as "a1 b2 c3".
QString Items(const QListWidget& list) {
    QStringList items;
    for (int row = 0; row < list.count(); ++row)
        items << list.item(row)->text() +
                     QString::number(list.item(row)->data(Qt::UserRole).toInt());
    return items.join(' ');
}

class ListTest : public ::testing::Test {
protected:
    ListTest() {
        for (int i = 0; i < 3; ++i)
            (new QListWidgetItem(QString(QChar('a' + i)), &list))->setData(Qt::UserRole, i + 1);
    }
    QListWidget list;
    QListWidget empty;
};

TEST_F(ListTest, AddInsertsBeforeTheSelectionOrAppends) {
    list.setCurrentRow(0);
    ListAddItem(&list, QStringLiteral("n"), 9);
    EXPECT_EQ(Items(list), "n9 a1 b2 c3");
    EXPECT_EQ(ListItemDataValue(&list), 9);
    list.setCurrentRow(-1);
    ListAddItem(&list, QStringLiteral("z"), 8);
    EXPECT_EQ(list.currentRow(), 4);
    ListAddItem(&empty, QStringLiteral("only"), -7);
    EXPECT_EQ(ListItemDataValue(&empty), -7);
}

TEST_F(ListTest, MoveSwapsWithANeighbourOnlyWhenThereIsOne) {
    list.setCurrentRow(2);
    int rowChanges = 0; // the window loads a record on each change
    QObject::connect(&list, &QListWidget::currentRowChanged, [&] { ++rowChanges; });
    ListMoveItem(&list, 1);
    EXPECT_EQ(rowChanges, 1);
    EXPECT_EQ(Items(list), "a1 c3 b2");
    EXPECT_EQ(ListItemDataValue(&list), 3);
    list.setCurrentRow(0);
    ListMoveItem(&list, 2);
    EXPECT_EQ(Items(list), "c3 a1 b2");
    EXPECT_EQ(list.currentRow(), 1);
    list.setCurrentRow(0);
    ListMoveItem(&list, 1); // nothing above the first
    list.setCurrentRow(2);
    ListMoveItem(&list, 0); // nothing below the last
    EXPECT_EQ(Items(list), "c3 a1 b2");
    ListMoveItem(&empty, 1);
}

TEST_F(ListTest, RemoveSelectsTheNextTheNewLastOrNothing) {
    list.setCurrentRow(-1);
    ListRemoveItem(&list); // nothing selected: nothing removed
    list.setCurrentRow(0);
    list.item(0)->setSelected(false); // current but unselected: the user sees no choice
    ListRemoveItem(&list);
    EXPECT_EQ(ListItemDataValue(&list), 0);
    list.setCurrentRow(1);
    ListRemoveItem(&list);
    EXPECT_EQ(Items(list), "a1 c3");
    EXPECT_EQ(ListItemDataValue(&list), 3);
    ListRemoveItem(&list);
    EXPECT_EQ(list.currentRow(), 0);
    ListRemoveItem(&list);
    EXPECT_EQ(list.currentRow(), -1);
    EXPECT_EQ(ListItemDataValue(&list), 0);
    ListRemoveItem(&list);
}

TEST_F(ListTest, SelectByDataFindsTheFirstMatchOrClears) {
    (new QListWidgetItem(QStringLiteral("twin"), &list))->setData(Qt::UserRole, 2);
    ListSelectItemData(&list, 2);
    EXPECT_EQ(list.currentRow(), 1);
    ListSelectItemData(&list, 42);
    EXPECT_TRUE(list.selectedItems().isEmpty());
    EXPECT_EQ(ListItemDataValue(&list), 0);

    QComboBox combo;
    ListAddItem(&combo, QStringLiteral("15 minutes"), 15);
    ListAddItem(&combo, QStringLiteral("1 hour"), 60);
    EXPECT_EQ(combo.itemText(0), "1 hour");
    ListSelectItemData(&combo, 15);
    EXPECT_EQ(ListItemDataValue(&combo), 15);
    ListSelectItemData(&combo, 7);
    EXPECT_EQ(ListItemDataValue(&combo), 0);
}

TEST(OptionGroupTest, IndexIsClampedAndMinusOneClearsEvenExclusiveButtons) {
    QWidget frame;
    QWidget other;
    QList<QRadioButton*> group{new QRadioButton(&frame), new QRadioButton(&frame),
                               new QRadioButton(&other)};
    EXPECT_EQ(SelectedOptionIndex(group), 0);
    SetOptionIndex(group, 7);
    EXPECT_EQ(SelectedOptionIndex(group), 2);
    SetOptionIndex(group, 1); // a button of another parent is cleared as well
    EXPECT_FALSE(group[2]->isChecked());
    SetOptionIndex(group, -4);
    EXPECT_TRUE(group[0]->isChecked());
    SetOptionIndex(group, -1);
    EXPECT_FALSE(group[0]->isChecked() || group[1]->isChecked() || group[2]->isChecked());
    EXPECT_EQ(SelectedOptionIndex(group), 0);
    group[1]->click(); // still exclusive afterwards
    group[0]->click();
    EXPECT_FALSE(group[1]->isChecked());
}

} // namespace
} // namespace quorvel
