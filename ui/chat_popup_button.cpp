#include "ui/chat_popup_button.h"

#include <QApplication>
#include <QPainter>
#include <QStyleOptionComboBox>
#include <QStylePainter>

#include "ui/chat_menu_item.h"
#include "ui/localized.h"

void ChatPopUpButtonCell::drawTitleWithFrame(QPainter& painter, const QRect& frame,
                                             const QString& title) {
    QFont font = QApplication::font("QMdiSubWindowTitleBar");
    font.setPointSizeF(14);
    painter.save();
    painter.setFont(font);
    painter.setPen(QColor(0x66, 0x66, 0x66));
    const int y = frame.y() + static_cast<int>((frame.height() - 16) * 0.5);
    const QRect rect(frame.x() + 10, y, frame.width() - 10, 16);
    painter.drawText(rect, Qt::AlignLeft | Qt::AlignVCenter | Qt::TextSingleLine, title);
    painter.restore();
}

ChatPopUpButton::ChatPopUpButton(QWidget* parent)
    : QComboBox(parent), m_model(new QStandardItemModel(this)) {
    setModel(m_model);
    setSizeAdjustPolicy(QComboBox::AdjustToMinimumContentsLengthWithIcon);
    setMinimumContentsLength(4);
}

QStandardItem* ChatPopUpButton::itemAtIndex(int index) const {
    return index >= 0 && index < m_model->rowCount() ? m_model->item(index) : nullptr;
}

int ChatPopUpButton::indexOfItemWithTitle(const QString& title) const {
    for (int i = 0; i < m_model->rowCount(); ++i) {
        const QStandardItem* item = m_model->item(i);
        const ChatMenuItem* chatItem = ChatMenuItem::From(m_model->item(i));
        const QString itemTitle =
            chatItem && chatItem->hasFullTitle() ? chatItem->fullTitle() : item->text();
        if (!ChatMenuItem::IsSeparator(item) && itemTitle == title) return i;
    }
    return -1;
}

ChatMenuItem* ChatPopUpButton::selectedChatItem() const {
    return ChatMenuItem::From(itemAtIndex(currentIndex()));
}

void ChatPopUpButton::viewDidEndLiveResize2() {
    const bool placeholderShown = indexOfItemWithTitle(Localized("--- Please Select ---")) >= 0;
    const float width = static_cast<float>(this->width()) - 40.0f;
    QString tooltip;
    for (int i = 0; i < m_model->rowCount(); ++i) {
        ChatMenuItem* item = ChatMenuItem::From(m_model->item(i));
        if (!item) continue;
        if (!placeholderShown && item->hasFullTitle()) item->compressTitlewithWidth(width);
        if (i == currentIndex() && item->isCompressed()) tooltip = item->localizedFullTitle();
    }
    setToolTip(placeholderShown ? QString() : tooltip);
}

void ChatPopUpButton::showPopup() {
    m_menuOpen = true;
    emit menuWillPopUp();
    QComboBox::showPopup();
}

void ChatPopUpButton::hidePopup() {
    QComboBox::hidePopup();
    if (!m_menuOpen) return;
    m_menuOpen = false;
    emit menuDidEndTracking();
}

void ChatPopUpButton::paintEvent(QPaintEvent*) {
    QStylePainter painter(this);
    QStyleOptionComboBox option;
    initStyleOption(&option);
    option.currentText.clear();
    painter.drawComplexControl(QStyle::CC_ComboBox, option);
    const QRect field =
        style()->subControlRect(QStyle::CC_ComboBox, &option, QStyle::SC_ComboBoxEditField, this);
    ChatPopUpButtonCell::drawTitleWithFrame(painter, QRect(0, 0, field.right() + 1, height()),
                                            currentText());
}

void ChatPopUpButton::resizeEvent(QResizeEvent* event) {
    QComboBox::resizeEvent(event);
    viewDidEndLiveResize2();
}
