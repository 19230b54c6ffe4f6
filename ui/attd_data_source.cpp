#include "ui/attd_data_source.h"

#include "ui/localized.h"

void AttdDataSource::addItem(std::unique_ptr<AttendeeItem> item, bool ascending) {
    mAscending = ascending;
    if (!item) return;
    const QString name = item->name();
    auto at = mArray.begin();
    for (; at != mArray.end(); ++at) {
        const int order = QString::compare((*at)->name(), name, Qt::CaseInsensitive);
        if (ascending ? order > 0 : order < 0) break;
    }
    const int row = static_cast<int>(at - mArray.begin());
    beginInsertRows(QModelIndex(), row, row);
    mArray.insert(at, std::move(item));
    endInsertRows();
}

QString AttdDataSource::itemNameAtIndex(int index) const {
    return index >= 0 && index < numberOfRowsInTableView() ? mArray[index]->name() : QString();
}

std::uint32_t AttdDataSource::itemIDAtIndex(int index) const {
    return index >= 0 && index < numberOfRowsInTableView() ? mArray[index]->lID() : 0;
}

void AttdDataSource::ClearData() {
    beginResetModel();
    mArray.clear();
    endResetModel();
}

int AttdDataSource::rowCount(const QModelIndex& parent) const {
    return parent.isValid() ? 0 : numberOfRowsInTableView();
}

int AttdDataSource::columnCount(const QModelIndex& parent) const {
    return parent.isValid() ? 0 : 1;
}

QVariant AttdDataSource::data(const QModelIndex& index, int role) const {
    if (role != Qt::DisplayRole || !index.isValid()) return QVariant();
    return itemNameAtIndex(index.row());
}

QVariant AttdDataSource::headerData(int section, Qt::Orientation orientation, int role) const {
    if (role != Qt::DisplayRole || orientation != Qt::Horizontal || section != 0) return QVariant();
    return Localized("Name");
}

void AttdDataSource::sort(int, Qt::SortOrder order) {
    const bool ascending = order == Qt::AscendingOrder;
    if (mArray.size() < 2 || ascending == mAscending) return;
    mAscending = ascending;
    beginResetModel();
    std::reverse(mArray.begin(), mArray.end());
    endResetModel();
}
