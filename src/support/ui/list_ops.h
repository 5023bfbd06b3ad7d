#pragma once
// Operations on the window's lists: each item carries a 32-bit number in
// Qt::UserRole (its item data); "selected" is the item the list highlights,
// which is not always the current one (Ctrl+arrow moves only the focus, and a
// click on the empty part of the list leaves the current row without any
// selection).

#include <cstdint>

class QComboBox;
class QListWidget;
class QString;

namespace quorvel {

// The row of the selected item; -1 when none is selected.
int ListSelectedRow(const QListWidget* list);

// Inserts the text before the selected item, or appends it when none is
// selected; stores the data and selects the new item.
void ListAddItem(QListWidget* list, const QString& text, std::int32_t data);
void ListAddItem(QComboBox* list, const QString& text, std::int32_t data);

// Direction 1 swaps the selected item (text and data) with the one above, any
// other value with the one below; the moved item stays selected. Nothing
// happens when there is no neighbour on that side.
void ListMoveItem(QListWidget* list, int direction);

// Removes the selected item and selects the item now at its place, the new
// last item when the removed one was last, or nothing when the list is empty.
void ListRemoveItem(QListWidget* list);

// Data of the selected item; 0 when nothing is selected.
std::int32_t ListItemDataValue(const QListWidget* list);
std::int32_t ListItemDataValue(const QComboBox* list);

// Selects the first item with that data; nothing when there is none.
void ListSelectItemData(QListWidget* list, std::int32_t value);
void ListSelectItemData(QComboBox* list, std::int32_t value);

} // namespace quorvel
