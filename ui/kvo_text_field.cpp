#include "ui/kvo_text_field.h"

#include <QKeyEvent>

KvoTextField::KvoTextField(QWidget* parent) : QPlainTextEdit(parent) {
    setTabChangesFocus(true);
    connect(this, &QPlainTextEdit::textChanged, this,
            [this] { m_filter.isPartialStringValid(toPlainText()); });
}

QString KvoTextField::stringValue() const {
    return m_filter.getObjectValue(toPlainText());
}

void KvoTextField::setEditable(bool editable) {
    setEnabled(editable);
    setReadOnly(!editable);
}

void KvoTextField::keyPressEvent(QKeyEvent* event) {
    const bool enter = event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter;
    if (enter && !(event->modifiers() & Qt::ShiftModifier)) {
        emit sendRequested();
        return;
    }
    if (enter) {
        insertPlainText("\n");
        return;
    }
    QPlainTextEdit::keyPressEvent(event);
}
