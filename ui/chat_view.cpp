#include "ui/chat_view.h"

#include <QEvent>
#include <QPainter>

#include "api/ui_protocol.h"
#include "ui/my_chat_controller.h"

ChatView::ChatView(QWidget* parent) : QWidget(parent) {
    setAutoFillBackground(false);
}

void ChatView::attachTo(QWidget* superView) {
    if (!superView) return;
    setParent(superView);
    superView->installEventFilter(this);
    setGeometry(0, 0, superView->width(), superView->height());
}

void ChatView::paintEvent(QPaintEvent*) {
    QPainter(this).fillRect(rect(), QColor(0xFF, 0xFF, 0xFF));
}

bool ChatView::eventFilter(QObject* watched, QEvent* event) {
    if (event->type() == QEvent::Resize && watched == parent()) {
        setGeometry(0, 0, parentWidget()->width(), parentWidget()->height());
        if (mSuperController)
            mSuperController->HandleCommand(msg_PanelStatusChanged, nullptr, nullptr);
    }
    return QWidget::eventFilter(watched, event);
}

void WhiteView::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    painter.fillRect(rect(), QColor(0xFF, 0xFF, 0xFF));
    painter.setPen(QPen(QColor(0xF2, 0xF2, 0xF2), 1));
    // Qt's y grows downwards: the top edge is the line half a point below y = 0.
    painter.drawLine(QPointF(0, 0.5), QPointF(width(), 0.5));
}
