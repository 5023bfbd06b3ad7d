#pragma once
// A list the web-data object fills: the window binds it to a combo box, tests
// and other callers use StringListCombo.

#include <QList>
#include <QString>
#include <QStringList>

namespace quorvel {

class ComboSink {
public:
    virtual ~ComboSink() = default;
    virtual void Clear() = 0;
    virtual void AddItem(const QString& text, int itemData) = 0;
    virtual void SetCurrentIndex(int index) = 0;
};

class StringListCombo : public ComboSink {
public:
    void Clear() override {
        items.clear();
        itemData.clear();
        current = -1;
    }
    void AddItem(const QString& text, int data) override {
        items << text;
        itemData << data;
    }
    void SetCurrentIndex(int index) override { current = index; }

    QStringList items;
    QList<int> itemData;
    int current = -1;
};

// Fill a list with the address, interval and data-type choices.
void LoadIPAddresses(ComboSink& combo);
void LoadIntervals(ComboSink& combo);
void LoadDataTypes(ComboSink& combo);

} // namespace quorvel
