#include "sim/qt_window.h"

#include <QPixmap>
#include <QStandardItem>
#include <QTableView>

#include "ui/chat_menu_item.h"
#include "ui/chat_popup_button.h"
#include "ui/chat_select_attd_control.h"
#include "ui/kvo_text_field.h"
#include "ui/localized.h"
#include "ui/my_chat_controller.h"

QtSimWindow::QtSimWindow(const QString& title)
    : m_controller(std::make_unique<MyChatController>()) {
    m_host.setWindowTitle(title);
    m_host.resize(420, 360);
    // On screen the windows cascade, so that every participant's stays visible.
    static int opened = 0;
    m_host.move(40 + 36 * (opened % 12), 40 + 28 * (opened % 12));
    ++opened;
    m_controller->SetSuperView(&m_host);
    m_host.show();
}

QtSimWindow::~QtSimWindow() {
    // The picker belongs to the process, not to one window; close it only when it is ours.
    if (ChatSelectAttdControl* picker = ChatSelectAttdControl::instance())
        if (m_controller->attendeeDialog() == picker) picker->onCancel();
}

void QtSimWindow::SetSuperView(void*) {}

void QtSimWindow::SetSink(IChatCommSinkForChatUI* sink) {
    m_controller->SetSink(sink);
}

int QtSimWindow::HandleCommand(int command, void* inParam, void* outParam) {
    return m_controller->HandleCommand(command, inParam, outParam);
}

std::vector<PopupItem> QtSimWindow::Popup() const {
    std::vector<PopupItem> popup;
    const ChatPopUpButton* button = m_controller->userlist();
    const QString placeholder = Localized("--- Please Select ---");
    for (int i = 0; i < button->numberOfItems(); ++i) {
        const QStandardItem* row = button->itemAtIndex(i);
        PopupItem item;
        item.separator = ChatMenuItem::IsSeparator(row);
        const ChatMenuItem* chat = ChatMenuItem::From(button->itemAtIndex(i));
        const QString title = chat && chat->hasFullTitle() ? chat->fullTitle() : row->text();
        if (!item.separator) item.title = title.toStdString();
        item.enabled = row->isEnabled();
        item.selected = i == button->currentIndex();
        item.placeholder = !item.separator && row->text() == placeholder;
        popup.push_back(item);
    }
    return popup;
}

bool QtSimWindow::InputEnabled() const {
    return m_controller->editView()->isEnabled();
}

std::string QtSimWindow::InputText() const {
    return m_controller->editView()->toPlainText().toStdString();
}

bool QtSimWindow::TypeAndSend(const std::string& text) {
    if (!InputEnabled()) return false;
    m_controller->editView()->setPlainText(QString::fromStdString(text));
    m_controller->onSend();
    return true;
}

bool QtSimWindow::Choose(int index) {
    ChatPopUpButton* button = m_controller->userlist();
    if (!button->isEnabled() || !button->isVisible() || index < 0 ||
        index >= button->numberOfItems())
        return false;
    const QStandardItem* row = button->itemAtIndex(index);
    if (ChatMenuItem::IsSeparator(row) || !row->isEnabled()) return false;
    // What a click on the item does: the popup takes it, then reports the choice.
    button->setCurrentIndex(index);
    emit button->activated(index);
    return true;
}

bool QtSimWindow::PickAttendee(const std::string& name) {
    const int entry =
        m_controller->userlist()->indexOfItemWithTitle(Localized("Select an Attendee..."));
    if (entry < 0 || !Choose(entry)) return false;
    ChatSelectAttdControl* picker = ChatSelectAttdControl::instance();
    if (!picker) return false;
    const AttdDataSource* rows = picker->dataSource();
    for (int row = 0; row < rows->numberOfRowsInTableView(); ++row) {
        if (rows->itemNameAtIndex(row).toStdString() != name) continue;
        picker->tableView()->selectRow(row);
        picker->onOK();
        return true;
    }
    picker->onCancel();
    return false;
}

void QtSimWindow::CloseAttendeePicker() {
    if (ChatSelectAttdControl* picker = ChatSelectAttdControl::instance()) picker->onCancel();
}

bool QtSimWindow::SavePicture(const std::string& path) {
    return m_host.grab().save(QString::fromStdString(path), "PNG");
}
