#include "ui/chat_select_attd_control.h"

#include <QCloseEvent>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLineEdit>
#include <QPushButton>
#include <QTableView>
#include <QVBoxLayout>
#include <cctype>

#include "platform/warning_window.h"
#include "ui/localized.h"
#include "ui/my_chat_controller.h"

namespace {

QPointer<ChatSelectAttdControl>& Single() {
    static QPointer<ChatSelectAttdControl> dialog;
    return dialog;
}

bool IsBlankText(const QString& text) {
    for (const char c : text.toUtf8())
        if (!std::isspace(static_cast<unsigned char>(c))) return false;
    return true;
}

}  // namespace

ChatSelectAttdControl* ChatSelectAttdControl::getInstance(int* created) {
    const bool make = !Single();
    if (make) Single() = new ChatSelectAttdControl;
    if (created) *created = make ? 1 : 0;
    return Single();
}

ChatSelectAttdControl* ChatSelectAttdControl::instance() {
    return Single();
}

// The layout "chatselectattendee": search row, one-column table, Refresh, Cancel and OK.
ChatSelectAttdControl::ChatSelectAttdControl()
    : QDialog(nullptr, Qt::Tool | Qt::WindowStaysOnTopHint),
      mTableView(new QTableView(this)),
      mTableDS(new AttdDataSource(this)),
      mFindTextField(new QLineEdit(this)),
      mOKButton(new QPushButton(Localized("OK"), this)) {
    setObjectName("chatselectattendee");
    setWindowTitle(Localized("Select an Attendee..."));
    setModal(false);
    auto* find = new QPushButton(Localized("Find"), this);
    auto* refresh = new QPushButton(Localized("Refresh"), this);
    auto* cancel = new QPushButton(Localized("Cancel"), this);
    auto* searchRow = new QHBoxLayout;
    searchRow->addWidget(mFindTextField, 1);
    searchRow->addWidget(find);
    auto* buttons = new QHBoxLayout;
    buttons->addWidget(refresh);
    buttons->addStretch(1);
    buttons->addWidget(cancel);
    buttons->addWidget(mOKButton);
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(searchRow);
    layout->addWidget(mTableView, 1);
    layout->addLayout(buttons);
    resize(260, 320);

    mTableView->setModel(mTableDS);
    mTableView->setSelectionBehavior(QAbstractItemView::SelectRows);
    mTableView->setSelectionMode(QAbstractItemView::SingleSelection);
    mTableView->setEditTriggers(QAbstractItemView::NoEditTriggers);
    mTableView->verticalHeader()->hide();
    mTableView->horizontalHeader()->setStretchLastSection(true);
    mTableView->setSortingEnabled(true);
    mTableView->horizontalHeader()->setSortIndicator(0, Qt::AscendingOrder);
    mOKButton->setEnabled(false);

    connect(find, &QPushButton::clicked, this, &ChatSelectAttdControl::onFind);
    connect(mFindTextField, &QLineEdit::returnPressed, this, &ChatSelectAttdControl::onFind);
    connect(refresh, &QPushButton::clicked, this, &ChatSelectAttdControl::onRefresh);
    connect(cancel, &QPushButton::clicked, this, &ChatSelectAttdControl::onCancel);
    connect(mOKButton, &QPushButton::clicked, this, &ChatSelectAttdControl::onOK);
    connect(mTableView->selectionModel(), &QItemSelectionModel::selectionChanged, this,
            &ChatSelectAttdControl::tableViewSelectionDidChange);
    connect(mTableDS, &QAbstractItemModel::modelReset, this,
            &ChatSelectAttdControl::tableViewSelectionDidChange);
}

ChatSelectAttdControl::~ChatSelectAttdControl() {
    if (Single() == this) Single() = nullptr;
}

void ChatSelectAttdControl::ClearTable() {
    mTableDS->ClearData();
}

void ChatSelectAttdControl::makeFront() {
    show();
    raise();
    activateWindow();
}

void ChatSelectAttdControl::addItemToTable(std::unique_ptr<AttendeeItem> item) {
    const bool ascending =
        mTableView->horizontalHeader()->sortIndicatorOrder() == Qt::AscendingOrder;
    mTableDS->addItem(std::move(item), ascending);
}

bool ChatSelectAttdControl::closeWarningDlg() {
    if (!m_bShowingWarningDlg) return false;
    CloseWarningWindow2();
    return true;
}

int ChatSelectAttdControl::SelectedRow() const {
    const QModelIndexList rows = mTableView->selectionModel()->selectedRows();
    return rows.isEmpty() ? -1 : rows.first().row();
}

void ChatSelectAttdControl::tableViewSelectionDidChange() {
    mOKButton->setEnabled(mTableDS->itemIDAtIndex(SelectedRow()) != 0);
}

void ChatSelectAttdControl::onFind() {
    const QString text = mFindTextField->text();
    if (text.isEmpty() || IsBlankText(text)) {
        ShowWarning("Type an attendee's name, then click Find.");
        return;
    }
    const int selected = SelectedRow();
    const int rows = mTableDS->numberOfRowsInTableView();
    const auto matches = [&](int row) {
        const QString name = mTableDS->itemNameAtIndex(row);
        return !name.isNull() && name.contains(text, Qt::CaseInsensitive);
    };
    int found = -1;
    for (int row = selected + 1; row < rows && found < 0; ++row)
        if (matches(row)) found = row;
    for (int row = 0; selected >= 0 && row <= selected && found < 0; ++row)
        if (matches(row)) found = row;
    if (found < 0) {
        ShowWarning("No attendee of that name is in the list.");
        return;
    }
    mTableView->selectRow(found);
    mTableView->scrollTo(mTableDS->index(found, 0));
    mTableView->setFocus();
}

void ChatSelectAttdControl::ShowWarning(const char* key) {
    const QByteArray title = Localized("Korvo Chat").toUtf8();
    const QByteArray message = Localized(key).toUtf8();
    m_bShowingWarningDlg = true;
    ++m_nNestedLoops;
    ShowWarningWindow2(title.constData(), message.constData());
    --m_nNestedLoops;
    m_bShowingWarningDlg = false;
    // Closed while the warning ran: the deletion waited for it.
    if (m_bClosing && m_nNestedLoops == 0) deleteLater();
}

void ChatSelectAttdControl::onRefresh() {
    if (mSuperController) mSuperController->popAttendeeList(this);
}

void ChatSelectAttdControl::onOK() {
    const std::uint32_t id = mTableDS->itemIDAtIndex(SelectedRow());
    if (mSuperController) mSuperController->onSelectedAttendee(id);
    Close();
}

void ChatSelectAttdControl::Close() {
    if (m_bClosing) return;
    m_bClosing = true;
    hide();
    if (Single() == this) Single() = nullptr;
    // The owner forgets the dialog before either can go away.
    const QPointer<MyChatController> owner = mSuperController;
    mSuperController = nullptr;
    if (owner) owner->popAttendeeList(nullptr);
    if (m_nNestedLoops == 0) deleteLater();
}

void ChatSelectAttdControl::closeEvent(QCloseEvent* event) {
    event->accept();
    Close();
}
