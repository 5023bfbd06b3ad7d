#include "support/ui/list_ops.h"

#include <QComboBox>
#include <QItemSelectionModel>
#include <QListWidget>

#include <algorithm>

namespace quorvel {

namespace {

std::int32_t DataOf(const QVariant& data) {
    return data.isValid() ? data.toInt() : 0;
}

int FindData(const QListWidget* list, std::int32_t value) {
    for (int row = 0; row < list->count(); ++row) {
        if (DataOf(list->item(row)->data(Qt::UserRole)) == value) return row;
    }
    return -1;
}

int SelectedRow(const QListWidget* list) {
    return ListSelectedRow(list);
}

} // namespace

int ListSelectedRow(const QListWidget* list) {
    const QListWidgetItem* item = list->currentItem();
    if (item != nullptr && item->isSelected()) return list->currentRow();
    const QModelIndexList rows = list->selectionModel()->selectedRows();
    return rows.isEmpty() ? -1 : rows.first().row();
}

void ListAddItem(QListWidget* list, const QString& text, std::int32_t data) {
    const int selected = SelectedRow(list);
    const int row = selected >= 0 ? selected : list->count();
    auto* item = new QListWidgetItem(text);
    item->setData(Qt::UserRole, data);
    list->insertItem(row, item);
    list->setCurrentRow(row);
}

void ListAddItem(QComboBox* list, const QString& text, std::int32_t data) {
    const int selected = list->currentIndex();
    const int row = selected >= 0 ? selected : list->count();
    list->insertItem(row, text, data);
    list->setCurrentIndex(row);
}

void ListMoveItem(QListWidget* list, int direction) {
    const int row = SelectedRow(list);
    const int target = direction == 1 ? row - 1 : row + 1;
    if (row < 0 || target < 0 || target >= list->count()) return;
    // Swap text and data in place, so the selection changes only once.
    QListWidgetItem* moving = list->item(row);
    QListWidgetItem* other = list->item(target);
    for (const int role : {int(Qt::DisplayRole), int(Qt::UserRole)}) {
        const QVariant saved = moving->data(role);
        moving->setData(role, other->data(role));
        other->setData(role, saved);
    }
    list->setCurrentRow(target);
}

void ListRemoveItem(QListWidget* list) {
    const int row = SelectedRow(list);
    if (row < 0) return;
    delete list->takeItem(row);
    const int count = list->count();
    list->setCurrentRow(count == 0 ? -1 : std::min(row, count - 1));
}

std::int32_t ListItemDataValue(const QListWidget* list) {
    const int row = SelectedRow(list);
    return row >= 0 ? DataOf(list->item(row)->data(Qt::UserRole)) : 0;
}

std::int32_t ListItemDataValue(const QComboBox* list) {
    return list->currentIndex() >= 0 ? DataOf(list->currentData(Qt::UserRole)) : 0;
}

void ListSelectItemData(QListWidget* list, std::int32_t value) {
    list->setCurrentRow(FindData(list, value));
}

void ListSelectItemData(QComboBox* list, std::int32_t value) {
    list->setCurrentIndex(list->findData(value, Qt::UserRole, Qt::MatchExactly));
}

} // namespace quorvel
