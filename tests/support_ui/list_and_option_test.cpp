#include "support/ui/list_ops.h"
#include "support/ui/option_group.h"
#include "support/ui/status_label.h"

#include <QApplication>
#include <QComboBox>
#include <QLabel>
#include <QListWidget>
#include <QRadioButton>
#include <QWidget>

#include <gtest/gtest.h>

#include <vector>

namespace quorvel {
namespace {

QStringList Texts(const QListWidget& list) {
    QStringList texts;
    for (int row = 0; row < list.count(); ++row)
        texts << list.item(row)->text();
    return texts;
}

// A list "a" 1, "b" 2, "c" 3.
class ListTest : public ::testing::Test {
protected:
    ListTest() {
        for (auto [text, data] : {std::pair{"a", 1}, {"b", 2}, {"c", 3}}) {
            auto* item = new QListWidgetItem(QString::fromLatin1(text), &list);
            item->setData(Qt::UserRole, data);
        }
    }
    QListWidget list;
    QListWidget empty;
};

TEST_F(ListTest, AddInsertsBeforeTheSelectionOrAppends) {
    list.setCurrentRow(0);
    ListAddItem(&list, QStringLiteral("new"), 9);
    EXPECT_EQ(Texts(list), QStringList({"new", "a", "b", "c"}));
    EXPECT_EQ(list.currentRow(), 0);
    EXPECT_EQ(ListItemDataValue(&list), 9);

    list.setCurrentRow(-1);
    ListAddItem(&list, QStringLiteral("last"), 10);
    EXPECT_EQ(Texts(list).last(), "last");
    EXPECT_EQ(list.currentRow(), 4);

    ListAddItem(&empty, QStringLiteral("only"), -7);
    EXPECT_EQ(empty.count(), 1);
    EXPECT_EQ(ListItemDataValue(&empty), -7);
}

TEST_F(ListTest, MoveSwapsWithTheNeighbourAndKeepsTheSelection) {
    list.setCurrentRow(2);
    ListMoveItem(&list, 1);
    EXPECT_EQ(Texts(list), QStringList({"a", "c", "b"}));
    EXPECT_EQ(list.currentRow(), 1);
    EXPECT_EQ(ListItemDataValue(&list), 3);

    list.setCurrentRow(0);
    ListMoveItem(&list, 2);
    EXPECT_EQ(Texts(list), QStringList({"c", "a", "b"}));
    EXPECT_EQ(ListItemDataValue(&list), 1);
    EXPECT_EQ(list.item(0)->data(Qt::UserRole).toInt(), 3);
}

TEST_F(ListTest, MoveWithoutNeighbourChangesNothing) {
    list.setCurrentRow(0);
    ListMoveItem(&list, 1);
    list.setCurrentRow(2);
    ListMoveItem(&list, 0);
    EXPECT_EQ(Texts(list), QStringList({"a", "b", "c"}));
    EXPECT_EQ(list.currentRow(), 2);
    ListMoveItem(&empty, 1);
    EXPECT_EQ(empty.count(), 0);
}

TEST_F(ListTest, RemoveSelectsTheNextTheNewLastOrNothing) {
    list.setCurrentRow(1);
    ListRemoveItem(&list);
    EXPECT_EQ(Texts(list), QStringList({"a", "c"}));
    EXPECT_EQ(ListItemDataValue(&list), 3);

    ListRemoveItem(&list); // the last one: the new last is selected
    EXPECT_EQ(Texts(list), QStringList({"a"}));
    EXPECT_EQ(list.currentRow(), 0);

    ListRemoveItem(&list);
    EXPECT_EQ(list.count(), 0);
    EXPECT_EQ(list.currentRow(), -1);
    EXPECT_EQ(ListItemDataValue(&list), 0);
    ListRemoveItem(&list); // nothing left: nothing happens
}

TEST_F(ListTest, RemoveWithoutSelectionKeepsEveryItem) {
    list.setCurrentRow(-1);
    ListRemoveItem(&list);
    EXPECT_EQ(list.count(), 3);
}

TEST_F(ListTest, SelectByDataFindsTheFirstMatchOrClears) {
    auto* twin = new QListWidgetItem(QStringLiteral("b2"), &list);
    twin->setData(Qt::UserRole, 2);
    ListSelectItemData(&list, 2);
    EXPECT_EQ(list.currentRow(), 1);
    ListSelectItemData(&list, 42);
    EXPECT_EQ(list.currentRow(), -1);
    EXPECT_TRUE(list.selectedItems().isEmpty());
    EXPECT_EQ(ListItemDataValue(&list), 0);
    ListSelectItemData(&empty, 1);
    EXPECT_EQ(empty.currentRow(), -1);
}

TEST(ComboListTest, DataOperationsOnAComboBox) {
    QComboBox combo;
    EXPECT_EQ(ListItemDataValue(&combo), 0);
    ListAddItem(&combo, QStringLiteral("15 minutes"), 15);
    ListAddItem(&combo, QStringLiteral("1 hour"), 60); // before the selected one
    EXPECT_EQ(combo.itemText(0), "1 hour");
    EXPECT_EQ(ListItemDataValue(&combo), 60);
    ListSelectItemData(&combo, 15);
    EXPECT_EQ(combo.currentIndex(), 1);
    ListSelectItemData(&combo, 7);
    EXPECT_EQ(combo.currentIndex(), -1);
    EXPECT_EQ(ListItemDataValue(&combo), 0);
}

// Three buttons of one exclusive group, as the window's option frames have.
class OptionGroupTest : public ::testing::Test {
protected:
    OptionGroupTest() {
        for (int i = 0; i < 3; ++i)
            buttons.push_back(new QRadioButton(&frame));
    }
    std::vector<bool> States() const {
        std::vector<bool> states;
        for (const QRadioButton* button : buttons)
            states.push_back(button->isChecked());
        return states;
    }
    QWidget frame;
    std::vector<QRadioButton*> buttons;
};

TEST_F(OptionGroupTest, NothingSelectedReadsAsTheFirst) {
    EXPECT_EQ(SelectedOptionIndex(buttons), 0);
    SetOptionIndex(buttons, 2);
    EXPECT_EQ(SelectedOptionIndex(buttons), 2);
    EXPECT_EQ(States(), std::vector<bool>({false, false, true}));
}

TEST_F(OptionGroupTest, IndexIsClampedToTheGroup) {
    SetOptionIndex(buttons, 7);
    EXPECT_EQ(States(), std::vector<bool>({false, false, true}));
    SetOptionIndex(buttons, -4);
    EXPECT_EQ(States(), std::vector<bool>({true, false, false}));
}

TEST_F(OptionGroupTest, MinusOneClearsEveryButtonEvenExclusiveOnes) {
    SetOptionIndex(buttons, 1);
    SetOptionIndex(buttons, -1);
    EXPECT_EQ(States(), std::vector<bool>({false, false, false}));
    EXPECT_TRUE(buttons[1]->autoExclusive());
    // Clicking still works exclusively afterwards.
    buttons[0]->click();
    buttons[2]->click();
    EXPECT_EQ(States(), std::vector<bool>({false, false, true}));
}

TEST_F(OptionGroupTest, ButtonsWithDifferentParentsStillActAsOneGroup) {
    QWidget other;
    QList<QRadioButton*> mixed{buttons[0], new QRadioButton(&other)};
    SetOptionIndex(mixed, 0);
    SetOptionIndex(mixed, 1);
    EXPECT_FALSE(mixed[0]->isChecked());
    EXPECT_EQ(SelectedOptionIndex(mixed), 1);
    SetOptionIndex(std::vector<QRadioButton*>{}, 0); // empty group: nothing to do
}

TEST(StatusLabelTest, HighlightedWhileItShowsText) {
    QLabel label;
    SetStatusLabel(&label, QStringLiteral("Connecting"));
    EXPECT_EQ(label.text(), "Connecting");
    EXPECT_TRUE(label.autoFillBackground());
    EXPECT_EQ(label.palette().color(QPalette::Window), QColor(255, 251, 240));

    SetStatusLabel(&label, QString());
    EXPECT_EQ(label.text(), "");
    EXPECT_EQ(label.palette().color(QPalette::Window),
              QApplication::palette(&label).color(QPalette::Button));
    SetStatusLabel(nullptr, QStringLiteral("nobody sees this"));
}

} // namespace
} // namespace quorvel
