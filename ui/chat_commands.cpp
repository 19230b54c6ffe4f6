// The engine's commands as the chat window carries them out, and the placeholder item that
// stands in for a send-to target who left.
#include <QApplication>
#include <QFile>
#include <QLayout>
#include <QSaveFile>
#include <QSignalBlocker>
#include <QStringDecoder>
#include <cstdint>

#include "platform/func_trace.h"
#include "ui/chat_menu_item.h"
#include "ui/chat_panels.h"
#include "ui/chat_popup_button.h"
#include "ui/chat_select_attd_control.h"
#include "ui/chat_text_view.h"
#include "ui/chat_view.h"
#include "ui/kvo_text_field.h"
#include "ui/localized.h"
#include "ui/my_chat_controller.h"

namespace {

// The text of a UTF-8 string; false when it is not valid UTF-8.
bool FromUtf8(const char* bytes, std::size_t length, QString* text) {
    QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless);
    const QString decoded = decoder.decode(QByteArrayView(bytes, static_cast<qsizetype>(length)));
    if (decoder.hasError()) return false;
    *text = decoded;
    return true;
}

bool FromUtf8(const std::string& bytes, QString* text) {
    return FromUtf8(bytes.data(), bytes.size(), text);
}

std::int32_t IntAt(const void* param) {
    return *static_cast<const std::int32_t*>(param);
}

// The index some commands pass by value in the out slot.
int IndexByValue(void* param) {
    return static_cast<std::int32_t>(reinterpret_cast<std::intptr_t>(param));
}

// Line ends as the engine sends them: every LF and CR becomes CR, and two in a row one.
std::string NormalisedLineEnds(const std::string& text) {
    std::string crs = text;
    for (char& c : crs)
        if (c == '\n') c = '\r';
    std::string result;
    result.reserve(crs.size());
    for (std::size_t i = 0; i < crs.size(); ++i) {
        result += crs[i];
        if (crs[i] == '\r' && i + 1 < crs.size() && crs[i + 1] == '\r') ++i;
    }
    return result;
}

}  // namespace

int MyChatController::HandleCommand(int command, void* inParam, void* outParam) {
    // While a selected user has left, indexes from the engine never count the placeholder.
    bool takenOut = false;
    if (mbSelectedUserLeave && m_userlist->numberOfItems() > 0) {
        const int placeholder = PlaceholderIndex();
        if (placeholder >= 0) {
            RemoveRow(placeholder);
            takenOut = true;
        }
    }
    const std::shared_ptr<bool> alive = m_alive;
    RunCommand(command, inParam, outParam, takenOut);
    if (!*alive) return 0;
    const int last = m_userlist->numberOfItems() - 1;
    if (takenOut && mbSelectedUserLeave) {
        if (PlaceholderIndex() < 0) AppendPlaceholder();
        if (mbNoSendToMode) {
            updateSendToArea();
        } else {
            const QSignalBlocker block(m_userlist);
            m_userlist->setCurrentIndex(m_userlist->numberOfItems() - 1);
            setChatInputEditable(false);
        }
    } else if (!takenOut && mbSelectedUserLeave && mbMenuPopup) {
        const QSignalBlocker block(m_userlist);
        m_userlist->setCurrentIndex(last);
    }
    return 0;
}

int MyChatController::RunCommand(int command, void* inParam, void* outParam, bool takenOut) {
    switch (command) {
        case msg_ClearChat:
            m_editView->clear();
            m_textView->clear();
            break;
        case msg_FocusInput:
            FocusInput();
            break;
        case msg_AllowUserInput:
            if (inParam) {
                const std::int32_t allowEdit = mbSelectedUserLeave ? 0 : IntAt(inParam);
                MacInfoTrace2(kChatTag,
                              "CocoaUI Receive a message msg_AllowUserInput , allowEdit = %d",
                              allowEdit);
                setChatInputEditable((allowEdit & 0xFF) != 0);
            }
            break;
        case msg_HideUserList:
            if (inParam) {
                const std::int8_t hide = *static_cast<const std::int8_t*>(inParam);
                MacInfoTrace2(kChatTag,
                              "CocoaUI Receive a message msg_HideUserList , hideFlag = %d", hide);
                m_userlist->setHidden(hide != 0);
            }
            break;
        case msg_ShowText:
        case msg_ShowTitle:
            if (inParam) {
                const char* text = static_cast<const char*>(inParam);
                QString message;
                if (FromUtf8(text, std::strlen(text), &message))
                    onRecevie(message, command == msg_ShowTitle);
            }
            break;
        case msg_InsertMenuItem:
            InsertMenuItem(static_cast<const MenuStatus*>(inParam),
                           static_cast<const std::int32_t*>(outParam));
            break;
        case msg_RemoveMenuItem:
            if (inParam) RemoveMenuItem(IntAt(inParam));
            break;
        case msg_SelectedUserLeft:
            if (inParam) SelectedUserLeft(IntAt(inParam), takenOut);
            break;
        case msg_RenameMenuItem:
            RenameMenuItem(static_cast<const std::string*>(inParam), IndexByValue(outParam));
            break;
        case msg_SelectMenuItem:
            if (inParam) SelectMenuItem(IntAt(inParam));
            break;
        case msg_SelectMenuItemAndAllowInput:
            if (inParam) SelectMenuItemAndAllowInput(IntAt(inParam), takenOut);
            break;
        case msg_UpdateMenuItem:
            UpdateMenuItem(static_cast<const MenuStatus*>(inParam), IndexByValue(outParam));
            break;
        case msg_EnableUserList:
            if (!m_userlist->isEnabled()) m_userlist->setEnabled(true);
            break;
        case msg_DisableUserList:
            if (m_userlist->isEnabled()) m_userlist->setEnabled(false);
            break;
        case msg_NoSendToItems:
            handleNoSendToItems();
            break;
        case msg_RebuildMenu:
            RebuildMenu(static_cast<const MenuStatusList*>(inParam));
            break;
        case msg_PanelStatusChanged:
            PanelStatusChanged();
            break;
        case msg_CloseAllDialogs:
            CurrentChatPanelProvider()->AbortPanels();
            break;
        case msg_GetInputText:
            GetInputText(static_cast<std::string*>(inParam));
            break;
        case msg_ClearInput:
            m_editView->clear();
            break;
        case msg_SaveChatPanel:
            RunSavePanel(static_cast<std::int32_t*>(inParam), static_cast<std::string*>(outParam));
            break;
        case msg_OpenChatPanel:
            RunOpenPanel(static_cast<std::int32_t*>(inParam), static_cast<std::string*>(outParam));
            break;
        case msg_WriteTextFile:
            WriteTextFile(static_cast<const char*>(inParam), static_cast<const char*>(outParam));
            break;
        case msg_ReadTextFile:
            ReadTextFile(static_cast<const char*>(inParam), static_cast<std::string*>(outParam));
            break;
        case msg_AddAttendee:
            AddAttendee(static_cast<const AttendeeRecord*>(inParam));
            break;
        case msg_CloseAttendeeDialog:
            if (mSelectAttControl) mSelectAttControl->onCancel();
            break;
        case msg_CloseAttendeeWarning:
            CloseAttendeeWarning(static_cast<std::int32_t*>(outParam));
            break;
        default:  // msg_ShowChat, msg_SendDone and unknown ids change nothing
            break;
    }
    return 0;
}

QString MyChatController::PlaceholderTitle() const {
    return Localized("--- Please Select ---");
}

int MyChatController::PlaceholderIndex() const {
    return m_userlist->indexOfItemWithTitle(PlaceholderTitle());
}

void MyChatController::AppendPlaceholder() {
    const QSignalBlocker block(m_userlist);
    m_userlist->menu()->appendRow(new ChatMenuItem(PlaceholderTitle(), ChatItemAction::Select));
}

void MyChatController::RemoveRow(int index) {
    const QSignalBlocker block(m_userlist);
    if (ChatMenuItem* item = ChatMenuItem::From(m_userlist->itemAtIndex(index)))
        item->setAction(ChatItemAction::None);
    m_userlist->menu()->removeRow(index);
}

void MyChatController::ClosePopupFromCode() {
    mbMenuPopup = false;
    m_userlist->hidePopup();
}

void MyChatController::UserlistMenuPopup() {
    mbMenuPopup = true;
    if (!mbSelectedUserLeave || m_userlist->numberOfItems() == 0) return;
    const int placeholder = PlaceholderIndex();
    if (placeholder >= 0) RemoveRow(placeholder);
    const QSignalBlocker block(m_userlist);
    m_userlist->setCurrentIndex(-1);
}

void MyChatController::UserlistMenuEndTracking() {
    if (!mbMenuPopup) return;
    mbMenuPopup = false;
    if (!mbSelectedUserLeave) return;
    if (PlaceholderIndex() < 0) AppendPlaceholder();
    const QSignalBlocker block(m_userlist);
    m_userlist->setCurrentIndex(m_userlist->numberOfItems() - 1);
}

float MyChatController::PopupWidth() const {
    return m_userlist ? static_cast<float>(m_userlist->width()) : 0.0f;
}

void MyChatController::FocusInput() {
    QWidget* window = m_editView ? m_editView->window() : nullptr;
    if (!window || !m_containerView->isVisible()) return;
    window->activateWindow();
    // Moving to the view after the input, as the key-view chain would, would take the focus
    // away from the input the user is about to type in: the input keeps it.
    m_editView->setFocus(Qt::OtherFocusReason);
}

void MyChatController::InsertMenuItem(const MenuStatus* entry, const std::int32_t* position) {
    if (!entry) return;
    const int count = m_userlist->numberOfItems();
    int at = position ? std::min<std::int32_t>(*position, count) : -1;
    if (at < 0) at = count;
    QStandardItem* item = nullptr;
    if (entry->bSeparator) {
        item = ChatMenuItem::NewSeparator();
    } else {
        auto* chatItem = new ChatMenuItem(QString(), ChatItemAction::Select);
        chatItem->setEnabled(entry->bEnabled);
        chatItem->setHasExternalTag(static_cast<int>(entry->dwExternalTag));
        QString title;
        if (FromUtf8(entry->strTitle, &title)) {
            chatItem->setIsGroup(entry->nGroupID != -1);
            chatItem->setText(title);
            chatItem->setFullTitle(title);
            chatItem->compressTitlewithWidth(PopupWidth() - 40.0f);
        }
        item = chatItem;
    }
    const QSignalBlocker block(m_userlist);
    const bool noneSelected = m_userlist->currentIndex() < 0;
    m_userlist->menu()->insertRow(at, item);
    // A list box selects the first row put into it by itself; the engine selects by command.
    if (noneSelected) m_userlist->setCurrentIndex(-1);
    resetTooltip();
}

void MyChatController::RemoveMenuItem(int index) {
    if (index < 0 || index >= m_userlist->numberOfItems()) return;
    RemoveRow(index);
    resetTooltip();
}

void MyChatController::SelectedUserLeft(int index, bool takenOut) {
    if (mbMenuPopup) ClosePopupFromCode();
    mbMenuPopup = false;
    if (index >= 0 && index < m_userlist->numberOfItems()) RemoveRow(index);
    const bool alreadyShown = mbSelectedUserLeave && (PlaceholderIndex() >= 0 || takenOut);
    if (!alreadyShown) {
        AppendPlaceholder();
        const QSignalBlocker block(m_userlist);
        m_userlist->setCurrentIndex(m_userlist->numberOfItems() - 1);
    }
    mbSelectedUserLeave = true;
    // Nobody to send to until the user picks a new target.
    setChatInputEditable(false);
    sendoutSelection();
    if (QWidget* focused = QApplication::focusWidget();
        focused && m_containerView->isAncestorOf(focused))
        focused->clearFocus();
    m_userlist->viewDidEndLiveResize2();
    resetTooltip();
}

void MyChatController::RenameMenuItem(const std::string* title, int index) {
    ChatMenuItem* item = ChatMenuItem::From(m_userlist->itemAtIndex(index));
    if (!title || !item || PlaceholderIndex() >= 0) return;
    QString text;
    if (FromUtf8(*title, &text)) {
        item->setText(text);
        item->setFullTitle(text);
    }
    item->compressTitlewithWidth(PopupWidth() - 40.0f);
    resetTooltip();
}

void MyChatController::SelectMenuItem(int index) {
    if (mbSelectedUserLeave) {
        sendoutSelection();
        return;
    }
    if (mSelectAttControl) {
        const int attendee = m_userlist->indexOfItemWithTitle(Localized("Select an Attendee..."));
        const QSignalBlocker block(m_userlist);
        if (attendee >= 0 && attendee != m_userlist->currentIndex())
            m_userlist->setCurrentIndex(attendee);
        return;
    }
    if (index >= m_userlist->numberOfItems() || index == m_userlist->currentIndex()) return;
    {
        const QSignalBlocker block(m_userlist);
        m_userlist->setCurrentIndex(index < 0 ? -1 : index);
    }
    m_selectedIndex = index;
    sendoutSelection();
}

void MyChatController::SelectMenuItemAndAllowInput(int index, bool takenOut) {
    if (index >= m_userlist->numberOfItems()) return;
    if (index == m_userlist->currentIndex() && !takenOut) return;
    {
        const QSignalBlocker block(m_userlist);
        m_userlist->setCurrentIndex(index < 0 ? -1 : index);
    }
    m_selectedIndex = index;
    mbSelectedUserLeave = false;
    sendoutSelection();
    setChatInputEditable(true);
}

void MyChatController::UpdateMenuItem(const MenuStatus* entry, int index) {
    ChatMenuItem* item = ChatMenuItem::From(m_userlist->itemAtIndex(index));
    if (!entry || !item || PlaceholderIndex() >= 0) return;
    item->setEnabled(entry->bEnabled);
    QString title;
    if (!entry->bSeparator && !entry->strTitle.empty() && FromUtf8(entry->strTitle, &title))
        item->compressTitlewithWidth(PopupWidth() - 40.0f);
    resetTooltip();
}

void MyChatController::RebuildMenu(const MenuStatusList* entries) {
    const QSignalBlocker block(m_userlist);
    while (m_userlist->numberOfItems() > 0)
        RemoveRow(0);
    if (!entries) return;
    const QString attendeeTitle = Localized("Select an Attendee...");
    int selected = -1;
    for (const MenuStatus& entry : *entries) {
        if (entry.bSelected && selected < 0) selected = m_userlist->numberOfItems();
        if (entry.bSeparator && entry.strTitle.empty()) {
            m_userlist->menu()->appendRow(ChatMenuItem::NewSeparator());
            continue;
        }
        auto* item = new ChatMenuItem(QString(), ChatItemAction::Select);
        QString title;
        if (FromUtf8(entry.strTitle, &title)) {
            item->setText(title);
            item->setFullTitle(title);
        }
        if (entry.nGroupID != -1) {
            item->setIsGroup(true);
            QFont bold = QApplication::font();
            bold.setBold(true);
            item->setFont(bold);
            item->setForeground(entry.bEnabled ? QColor(Qt::black) : QColor(Qt::gray));
        }
        item->setHasExternalTag(static_cast<int>(entry.dwExternalTag));
        item->setEnabled(entry.bEnabled);
        if (item->text() == attendeeTitle) item->setAction(ChatItemAction::OpenAttendeeDialog);
        m_userlist->menu()->appendRow(item);
    }
    // The new list shows the engine's selected entry, or nothing when it has none, rather
    // than the first row a list box selects by itself.
    m_userlist->setCurrentIndex(selected);
    m_userlist->viewDidEndLiveResize2();
}

void MyChatController::PanelStatusChanged() {
    if (mbMenuPopup) {
        ClosePopupFromCode();
        if (mbSelectedUserLeave) {
            if (PlaceholderIndex() < 0) AppendPlaceholder();
            const QSignalBlocker block(m_userlist);
            m_userlist->setCurrentIndex(m_userlist->numberOfItems() - 1);
        }
    }
    mbMenuPopup = false;
    m_userlist->viewDidEndLiveResize2();
}

void MyChatController::GetInputText(std::string* text) const {
    if (!text) return;
    *text = NormalisedLineEnds(m_editView->stringValue().toStdString());
}

void MyChatController::RunSavePanel(std::int32_t* confirmed, std::string* path) {
    const std::shared_ptr<ChatPanelProvider> panels = CurrentChatPanelProvider();
    const std::shared_ptr<bool> alive = m_alive;
    QString chosen;
    ++m_nNestedLoops;
    const bool ok = panels->RunSavePanel(m_containerView, Localized("Save Chat As"),
                                         Localized("Chat.txt"), "txt", &chosen);
    if (!*alive) return;
    --m_nNestedLoops;
    if (confirmed) *confirmed = ok ? 1 : 0;
    if (ok && path) *path = chosen.toStdString();
}

void MyChatController::RunOpenPanel(std::int32_t* confirmed, std::string* path) {
    const std::shared_ptr<ChatPanelProvider> panels = CurrentChatPanelProvider();
    const std::shared_ptr<bool> alive = m_alive;
    QString chosen;
    ++m_nNestedLoops;
    const bool ok =
        panels->RunOpenPanel(m_containerView, Localized("Open Chat"), {"txt", "kcf"}, &chosen);
    if (!*alive) return;
    --m_nNestedLoops;
    if (confirmed) *confirmed = ok ? 1 : 0;
    if (ok && path && !chosen.isEmpty()) *path = chosen.toStdString();
}

void MyChatController::WriteTextFile(const char* path, const char* content) {
    QString file;
    QString text;
    if (!path || !content || !FromUtf8(path, std::strlen(path), &file) ||
        !FromUtf8(content, std::strlen(content), &text))
        return;
    QSaveFile out(file);
    if (!out.open(QIODevice::WriteOnly)) return;
    out.write(text.toUtf8());
    out.commit();
}

void MyChatController::ReadTextFile(const char* path, std::string* content) {
    if (!path || !content) return;
    QFile in(QString::fromUtf8(path));
    if (!in.open(QIODevice::ReadOnly)) return;
    const QByteArray bytes = in.readAll();
    QString text;
    if (in.error() == QFileDevice::NoError && FromUtf8(bytes.constData(), bytes.size(), &text))
        *content = text.toStdString();
}

void MyChatController::AddAttendee(const AttendeeRecord* record) {
    if (!record) return;
    QString name;
    if (!FromUtf8(record->strName, &name)) name = QString::fromUtf8(record->strName);
    auto item = std::make_unique<AttendeeItem>(name, record->dwNodeID);
    if (mSelectAttControl) mSelectAttControl->addItemToTable(std::move(item));
}

void MyChatController::CloseAttendeeWarning(std::int32_t* showing) {
    if (!showing) return;
    *showing = mSelectAttControl && mSelectAttControl->closeWarningDlg() ? 1 : 0;
}

void MyChatController::handleNoSendToItems() {
    relayoutMsgContentView();
    hideSendToItems();
}

void MyChatController::relayoutMsgContentView() {
    // The layouts hand the send-to row's height to the transcript once the row is hidden.
    m_containerView->layout()->invalidate();
}

void MyChatController::hideSendToItems() {
    mbNoSendToMode = true;
    m_userlist->setHidden(true);
    m_sendToLabel->setHidden(true);
    m_sendToLine->setHidden(true);
    m_editView->setPlaceholderString(Localized("Type chat message, and send..."));
}

void MyChatController::updateSendToArea() {
    if (!m_userlist->isEnabled()) m_userlist->setEnabled(true);
    const QSignalBlocker block(m_userlist);
    if (m_userlist->currentIndex() != 0) m_userlist->setCurrentIndex(0);
    setChatInputEditable(true);
}
