// The chat input: a text field with a placeholder and a formatter limiting its length.
// Return sends; Shift+Return starts a new line.
#pragma once

#include <QPlainTextEdit>

#include "ui/input_filters.h"

class KvoTextField final : public QPlainTextEdit {
    Q_OBJECT

public:
    explicit KvoTextField(QWidget* parent = nullptr);

    // The text as the formatter takes it (at most its limit in characters).
    QString stringValue() const;
    void setStringValue(const QString& text) { setPlainText(text); }
    void setPlaceholderString(const QString& text) { setPlaceholderText(text); }
    void setFormatter(const MaxFilter& filter) { m_filter = filter; }
    MaxFilter& formatter() { return m_filter; }
    // Enabled and editable together.
    void setEditable(bool editable);

signals:
    // Return was pressed.
    void sendRequested();

protected:
    void keyPressEvent(QKeyEvent* event) override;

private:
    MaxFilter m_filter;
};
