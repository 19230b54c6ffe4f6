// The attendee picker's table model: rows in display order, kept sorted by name as they
// arrive; changing the sort direction reverses them.
#pragma once

#include <QAbstractTableModel>
#include <memory>
#include <vector>

#include "ui/attendee_item.h"

class AttdDataSource final : public QAbstractTableModel {
    Q_OBJECT

public:
    explicit AttdDataSource(QObject* parent = nullptr) : QAbstractTableModel(parent) {}

    int numberOfRowsInTableView() const { return static_cast<int>(mArray.size()); }
    // Inserts item before the first row ordered after it (names compared ignoring case), so
    // equal names keep their arrival order. Null is ignored.
    void addItem(std::unique_ptr<AttendeeItem> item, bool ascending);
    // The row's name, or a null string outside the rows.
    QString itemNameAtIndex(int index) const;
    // The row's id, or 0 outside the rows.
    std::uint32_t itemIDAtIndex(int index) const;
    void ClearData();
    bool ascending() const { return mAscending; }

    int rowCount(const QModelIndex& parent = QModelIndex()) const override;
    int columnCount(const QModelIndex& parent = QModelIndex()) const override;
    QVariant data(const QModelIndex& index, int role) const override;
    QVariant headerData(int section, Qt::Orientation orientation, int role) const override;
    // Reverses the rows when the direction differs from the current one (two rows or more).
    void sort(int column, Qt::SortOrder order) override;

private:
    std::vector<std::unique_ptr<AttendeeItem>> mArray;
    bool mAscending = true;
};
