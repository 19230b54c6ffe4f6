#include "ui/warning_box.h"

#include <QApplication>
#include <QMessageBox>
#include <QPointer>

#include "platform/trace.h"
#include "platform/warning_window.h"

namespace {

QList<QPointer<QMessageBox>>& Showing() {
    static QList<QPointer<QMessageBox>> boxes;
    return boxes;
}

void ShowBox(const char* title, const char* message) {
    // A host without widgets gets the warning as a log line, as it would without this box.
    if (!qobject_cast<QApplication*>(QCoreApplication::instance())) {
        MacWarnTrace2("Chat", "warning \"%s\": %s", title, message);
        return;
    }
    QMessageBox box(QMessageBox::Warning, QString::fromUtf8(title), QString::fromUtf8(message),
                    QMessageBox::Ok);
    // Names in a warning come from peers: never read them as markup.
    box.setTextFormat(Qt::PlainText);
    Showing().append(&box);
    box.exec();
    Showing().removeAll(&box);
}

void CloseBoxes() {
    for (const QPointer<QMessageBox>& box : Showing())
        if (box) box->reject();
}

}  // namespace

void InstallQtWarningBox() {
    SetWarningPresenter(ShowBox, CloseBoxes);
}
