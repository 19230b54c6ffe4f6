#include "ui/my_chat_controller.h"

#include <QFrame>
#include <QHBoxLayout>
#include <QPushButton>
#include <QScrollBar>
#include <QTextBlockFormat>
#include <QTextCursor>
#include <QVBoxLayout>
#include <cstdint>

#include "platform/func_trace.h"
#include "ui/chat_menu_item.h"
#include "ui/chat_popup_button.h"
#include "ui/chat_select_attd_control.h"
#include "ui/chat_text_view.h"
#include "ui/chat_unit.h"
#include "ui/chat_view.h"
#include "ui/kvo_text_field.h"
#include "ui/localized.h"

namespace {

constexpr int kInputLimit = 1000;

unsigned Hex(const void* address) {
    return static_cast<unsigned>(reinterpret_cast<std::uintptr_t>(address));
}

QFont SystemFont(qreal size) {
    QFont font;
    font.setPointSizeF(size);
    return font;
}

// Line ends become paragraph ends: every LF, every CR, and CRs followed by an LF once (CR CR LF
// is one line end converted twice on its way, which users never meant as a blank line).
QString AsParagraphs(const QString& text) {
    QString result;
    result.reserve(text.size());
    for (qsizetype i = 0; i < text.size(); ++i) {
        if (text[i] != u'\r') {
            result += text[i];
            continue;
        }
        qsizetype next = i + 1;
        while (next < text.size() && text[next] == u'\r')
            ++next;
        if (next < text.size() && text[next] == u'\n') i = next;
        result += u'\n';
    }
    return result;
}

}  // namespace

MyChatController::MyChatController() {
    BuildLayout();
    MaxFilter filter;
    filter.setMax(kInputLimit);
    m_editView->setFormatter(filter);
    connect(m_userlist, &ChatPopUpButton::menuWillPopUp, this,
            &MyChatController::UserlistMenuPopup);
    connect(m_userlist, &ChatPopUpButton::menuDidEndTracking, this,
            &MyChatController::UserlistMenuEndTracking);
    // Only the user's choices (mouse, wheel, keyboard) are actions; changes made for the
    // engine never report a selection by themselves.
    connect(m_userlist, &QComboBox::activated, this, &MyChatController::OnItemChosen);
    connect(m_editView, &KvoTextField::sendRequested, this, &MyChatController::onSend);
    connect(m_sendButton, &QPushButton::clicked, this, &MyChatController::onSend);
}

void MyChatController::BuildLayout() {
    m_containerView = new ChatView;
    m_containerView->setObjectName("chatui");
    m_containerView->setSuperController(this);
    m_contentView = new QWidget(m_containerView);
    m_textView = new NSTextViewWithLinks(m_contentView);
    m_textView->setFrameShape(QFrame::NoFrame);
    auto* content = new QVBoxLayout(m_contentView);
    content->setContentsMargins(8, 8, 8, 0);
    content->addWidget(m_textView);

    m_whiteView = new WhiteView(m_containerView);
    m_sendToLabel = new QLabel(Localized("Send to:"), m_whiteView);
    m_sendToLabel->setStyleSheet("color: #999999");
    m_userlist = new ChatPopUpButton(m_whiteView);
    m_sendToLine = new QFrame(m_whiteView);
    m_sendToLine->setFrameShape(QFrame::HLine);
    m_sendToLine->setStyleSheet("color: #F2F2F2");
    m_editView = new KvoTextField(m_whiteView);
    m_editView->setFixedHeight(56);
    m_sendButton = new QPushButton(Localized("Send"), m_whiteView);
    auto* sendTo = new QHBoxLayout;
    sendTo->addWidget(m_sendToLabel);
    sendTo->addWidget(m_userlist, 1);
    auto* input = new QHBoxLayout;
    input->addWidget(m_editView, 1);
    input->addWidget(m_sendButton, 0, Qt::AlignBottom);
    auto* white = new QVBoxLayout(m_whiteView);
    white->setContentsMargins(8, 6, 8, 8);
    white->addLayout(sendTo);
    white->addWidget(m_sendToLine);
    white->addLayout(input);

    auto* root = new QVBoxLayout(m_containerView);
    root->setContentsMargins(0, 0, 0, 0);
    root->setSpacing(0);
    root->addWidget(m_contentView, 1);
    root->addWidget(m_whiteView);
}

MyChatController::~MyChatController() {
    *m_alive = false;
    if (mSelectAttControl) {
        mSelectAttControl->SetSuperController(nullptr);
        mSelectAttControl->Close();
    }
    if (!m_containerView) return;
    m_containerView->setSuperController(nullptr);
    if (m_superView) m_superView->removeEventFilter(m_containerView);
    // A panel of ours may still run its event loop further up the stack.
    if (m_nNestedLoops > 0) {
        m_containerView->hide();
        m_containerView->deleteLater();
    } else {
        delete m_containerView;
    }
}

QString MyChatController::GetLocalizedString(const QString& key) {
    return Localized(key);
}

void MyChatController::setSupperView(QWidget* view) {
    MacInfoTrace2(kChatTag, "SetSupperView, supperView = 0x%x", Hex(view));
    m_superView = view;
    if (view) {
        m_containerView->attachTo(view);
    } else {
        m_containerView->setGeometry(0, 0, 0, 0);
    }
    m_containerView->show();
    m_containerView->setSuperController(this);
}

void MyChatController::setSink(IChatCommSinkForChatUI* pSink) {
    MacInfoTrace2(kChatTag, "-(void)setSink, pSink = 0x%x", Hex(pSink));
    m_pSink = pSink;
    sendoutSelection();
}

void MyChatController::SendEvent(int message, void* iParam) {
    if (m_pSink) m_pSink->HandleUIMessage(message, iParam, nullptr);
}

void MyChatController::onSend() {
    MacInfoTrace2(kChatTag, "-(void)OnSend:(id)sender");
    if (!m_pSink) return;
    const QStandardItem* selected = m_userlist->itemAtIndex(m_userlist->currentIndex());
    if (selected && selected->text() == Localized("Select an Attendee...")) return;
    SendEvent(msg_SendChat, nullptr);
    if (m_editView) m_editView->setFocus();
}

void MyChatController::actionSelectUserList() {
    MacInfoTrace2(kChatTag, "- (IBAction)actionSelectUserList: select index = %d",
                  m_userlist->currentIndex());
    if (!m_pSink) return;
    if (mbSelectedUserLeave) {
        const int placeholder = PlaceholderIndex();
        if (placeholder >= 0) RemoveRow(placeholder);
        setChatInputEditable(true);
        mbSelectedUserLeave = false;
    }
    sendoutSelection();
    const QStandardItem* selected = m_userlist->itemAtIndex(m_userlist->currentIndex());
    const bool attendeeItem = selected && selected->text() == Localized("Select an Attendee...");
    if (mSelectAttControl && !attendeeItem) mSelectAttControl->onCancel();
    mbMenuPopup = false;
}

void MyChatController::OnItemChosen(int index) {
    const ChatMenuItem* item = ChatMenuItem::From(m_userlist->itemAtIndex(index));
    if (!item) return;
    // The attendee item's action opens the picker instead of selecting a target.
    if (item->action() == ChatItemAction::OpenAttendeeDialog) {
        mbMenuPopup = false;
        popAttendeeList(m_userlist);
    } else if (item->action() == ChatItemAction::Select) {
        actionSelectUserList();
    }
}

void MyChatController::popAttendeeList(QObject* sender) {
    if (!sender) {
        mSelectAttControl = nullptr;
        std::uint32_t none = 0;
        SendEvent(msg_AttendeeSelected, &none);
        return;
    }
    std::int32_t created = 0;
    ChatSelectAttdControl* dialog = ChatSelectAttdControl::getInstance(&created);
    mSelectAttControl = dialog;
    if (created) {
        dialog->SetSuperController(this);
    } else {
        dialog->ClearTable();
    }
    dialog->makeFront();
    SendEvent(msg_ShowAttendeeList, &created);
}

void MyChatController::onSelectedAttendee(std::uint32_t id) {
    SendEvent(msg_AttendeeSelected, &id);
}

ChatSelectAttdControl* MyChatController::attendeeDialog() const {
    return mSelectAttControl;
}

void MyChatController::sendoutSelection() {
    if (!m_userlist) return;
    std::int32_t index = m_userlist->currentIndex();
    if (mbNoSendToMode) {
        index = 0;
    } else if (mbSelectedUserLeave) {
        index = -1;
    }
    SendEvent(msg_SelectionChanged, &index);
    resetTooltip();
}

void MyChatController::resetTooltip() {
    const ChatMenuItem* item = m_userlist->selectedChatItem();
    m_userlist->setToolTip(item && item->isCompressed() ? item->localizedFullTitle() : QString());
}

void MyChatController::setChatInputEditable(bool editable) {
    if (m_editView) m_editView->setEditable(editable);
}

bool MyChatController::isScrollAtBottom() const {
    const QScrollBar* bar = m_textView->verticalScrollBar();
    return bar->value() == bar->maximum();
}

void MyChatController::scrollToTop() {
    m_textView->verticalScrollBar()->setValue(0);
}

void MyChatController::scrollToBottom() {
    QScrollBar* bar = m_textView->verticalScrollBar();
    bar->setValue(bar->maximum());
}

void MyChatController::onRecevie(const QString& message, bool isTitle) {
    MacInfoTrace2(kChatTag, "-(void)onRecevie: sender= %d,   msg = %s, bTitle = %d", 0,
                  message.toUtf8().constData(), isTitle);
    if (message.isEmpty()) return;
    QString text = message;
    if (!text.endsWith('\n') && !text.endsWith('\r')) text += '\r';
    if (!m_textView) return;
    // The transcript follows new lines only while the user looks at its end.
    const bool follow = isScrollAtBottom();
    // One edit for the whole line: the document lays out and repaints once, not per run.
    QTextCursor edit(m_textView->document());
    edit.beginEditBlock();
    if (isTitle) {
        onReceiveMsg(text, true, false);
    } else {
        const QByteArray utf8 = text.toUtf8();
        for (const CChatUnit& unit : CChatUnit::GetChatUnitListFromString(utf8.constData()))
            onReceiveMsg(QString::fromUtf8(unit.GetContent()), false, unit.IsText() == 0);
    }
    edit.endEditBlock();
    if (follow) scrollToBottom();
}

void MyChatController::onReceiveMsg(const QString& text, bool isTitle, bool isUrl) {
    MacInfoTrace2(kChatTag, "-(void)onReceiveMsg: message = %s, bTitle = %d",
                  text.toUtf8().constData(), isTitle);
    const QString paragraphs = AsParagraphs(text);
    QTextCursor cursor(m_textView->document());
    cursor.movePosition(QTextCursor::End);
    const int start = cursor.position();

    QTextBlockFormat block;
    QTextCharFormat format;
    format.setBackground(m_textView->palette().base());
    if (isTitle) {
        block.setBottomMargin(6);
        format.setFont(SystemFont(12));
        format.setForeground(QColor(0x99, 0x99, 0x99));
    } else {
        block.setBottomMargin(12);
        block.setLineHeight(4, QTextBlockFormat::LineDistanceHeight);
        format.setFont(SystemFont(14));
        format.setForeground(QColor(0x33, 0x33, 0x33));
    }
    cursor.setBlockFormat(block);
    cursor.insertText(paragraphs, format);
    const int length = cursor.position() - start;
    if (isUrl && !isTitle) createLink(start, length, text);
}

void MyChatController::createLink(int start, int length, const QString& link) {
    if (length <= 0) return;
    const QUrl url(link, QUrl::StrictMode);
    if (!url.isValid()) return;
    QTextCursor cursor(m_textView->document());
    cursor.setPosition(start);
    cursor.setPosition(start + length, QTextCursor::KeepAnchor);
    QTextCharFormat format;
    format.setAnchor(true);
    format.setAnchorHref(link);
    format.setForeground(QColor(Qt::blue));
    cursor.mergeCharFormat(format);
    m_textView->setUnderLine(false, start, length);
}
