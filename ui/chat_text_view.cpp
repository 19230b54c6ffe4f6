#include "ui/chat_text_view.h"

#include <QApplication>
#include <QContextMenuEvent>
#include <QMenu>
#include <QMouseEvent>
#include <QTextCursor>

#include "ui/chat_panels.h"
#include "ui/localized.h"

namespace {

// Schemes a peer's link may use without asking the user first.
bool OpensDirectly(const QUrl& url) {
    const QString scheme = url.scheme().toLower();
    return scheme == "http" || scheme == "https" || scheme == "ftp" || scheme == "mailto";
}

}  // namespace

NSTextViewWithLinks::NSTextViewWithLinks(QWidget* parent) : QTextEdit(parent) {
    setReadOnly(true);
    setUndoRedoEnabled(false);
    setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    viewport()->setMouseTracking(true);
}

void NSTextViewWithLinks::clickedOnLink(const QString& link) {
    const QUrl url(link, QUrl::StrictMode);
    if (link.isEmpty() || !url.isValid()) {
        QApplication::beep();
        return;
    }
    const QString lower = url.toString().toLower();
    if (lower.startsWith("www.")) {
        Open(QUrl("http://" + lower));
        return;
    }
    if (!OpensDirectly(url) && !CurrentChatPanelProvider()->ConfirmOpenLink(this, url)) return;
    Open(url);
}

void NSTextViewWithLinks::Open(const QUrl& url) {
    if (m_opener) {
        m_opener(url);
    } else {
        CurrentChatPanelProvider()->OpenLink(url);
    }
}

void NSTextViewWithLinks::setUnderLine(bool underline, int start, int length) {
    QTextCursor cursor(document());
    cursor.setPosition(start);
    cursor.setPosition(start + length, QTextCursor::KeepAnchor);
    QTextCharFormat format;
    format.setFontUnderline(underline);
    cursor.mergeCharFormat(format);
    viewport()->update();
}

void NSTextViewWithLinks::changeFontStyle(bool bold, bool italic, int start, int length) {
    QTextCursor cursor(document());
    cursor.setPosition(start);
    cursor.setPosition(start + length, QTextCursor::KeepAnchor);
    QFont font = this->font();
    font.setBold(bold);
    font.setItalic(italic);
    QTextCharFormat format;
    format.setFont(font);
    cursor.mergeCharFormat(format);
}

void NSTextViewWithLinks::selectMenu(int tag) {
    if (tag == 0) copy();
    if (tag == 2) selectAll();
}

void NSTextViewWithLinks::mousePressEvent(QMouseEvent* event) {
    m_pressedAnchor =
        event->button() == Qt::LeftButton ? anchorAt(event->position().toPoint()) : QString();
    QTextEdit::mousePressEvent(event);
}

void NSTextViewWithLinks::mouseMoveEvent(QMouseEvent* event) {
    const bool overLink = !anchorAt(event->position().toPoint()).isEmpty();
    viewport()->setCursor(overLink ? Qt::PointingHandCursor : Qt::IBeamCursor);
    QTextEdit::mouseMoveEvent(event);
}

void NSTextViewWithLinks::mouseReleaseEvent(QMouseEvent* event) {
    QTextEdit::mouseReleaseEvent(event);
    if (event->button() != Qt::LeftButton || m_pressedAnchor.isEmpty()) return;
    const QString anchor = anchorAt(event->position().toPoint());
    const bool dragged = textCursor().hasSelection();
    if (anchor == m_pressedAnchor && !dragged) clickedOnLink(anchor);
    m_pressedAnchor.clear();
}

void NSTextViewWithLinks::contextMenuEvent(QContextMenuEvent* event) {
    QMenu menu(this);
    menu.addAction(Localized("Copy"), this, [this] { selectMenu(0); });
    menu.addAction(Localized("Select All"), this, [this] { selectMenu(2); });
    menu.exec(event->globalPos());
}
