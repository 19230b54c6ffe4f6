// The two plain views of the chat window: the white root view that follows the host view's
// size, and the white panel behind the send-to row with a hairline along its top.
#pragma once

#include <QPointer>
#include <QWidget>

class MyChatController;

class ChatView final : public QWidget {
    Q_OBJECT

public:
    explicit ChatView(QWidget* parent = nullptr);

    void setSuperController(MyChatController* controller) { mSuperController = controller; }
    // Follows the size of the view it is placed in from now on.
    void attachTo(QWidget* superView);

protected:
    void paintEvent(QPaintEvent* event) override;
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    QPointer<MyChatController> mSuperController;
};

class WhiteView final : public QWidget {
    Q_OBJECT

public:
    explicit WhiteView(QWidget* parent = nullptr) : QWidget(parent) {}

protected:
    void paintEvent(QPaintEvent* event) override;
};
