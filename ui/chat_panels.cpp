#include "ui/chat_panels.h"

#include <QDesktopServices>
#include <QFileDialog>
#include <QMessageBox>
#include <QPointer>

#include "ui/localized.h"

namespace {

// Non-native dialogs, so panels look and behave the same everywhere, offscreen included.
class QtPanels final : public ChatPanelProvider {
public:
    bool RunSavePanel(QWidget* parent, const QString& title, const QString& proposedName,
                      const QString& requiredSuffix, QString* path) override {
        QFileDialog dialog(parent, title, QString(), QString("*.%1").arg(requiredSuffix));
        dialog.setOption(QFileDialog::DontUseNativeDialog);
        dialog.setAcceptMode(QFileDialog::AcceptSave);
        dialog.setDefaultSuffix(requiredSuffix);
        dialog.selectFile(proposedName);
        return Run(dialog, path);
    }

    bool RunOpenPanel(QWidget* parent, const QString& title, const QStringList& suffixes,
                      QString* path) override {
        QStringList patterns;
        for (const QString& suffix : suffixes)
            patterns << "*." + suffix;
        QFileDialog dialog(parent, title, QString(), patterns.join(' '));
        dialog.setOption(QFileDialog::DontUseNativeDialog);
        dialog.setFileMode(QFileDialog::ExistingFile);
        return Run(dialog, path);
    }

    void AbortPanels() override {
        for (const QPointer<QFileDialog>& dialog : m_running)
            if (dialog) dialog->reject();
    }

    bool ConfirmOpenLink(QWidget* parent, const QUrl& url) override {
        QMessageBox box(QMessageBox::Question, Localized("Korvo Chat"),
                        Localized("Open this link?") + "\n" + url.toString(),
                        QMessageBox::Open | QMessageBox::Cancel, parent);
        box.setTextFormat(Qt::PlainText);
        return box.exec() == QMessageBox::Open;
    }

    void OpenLink(const QUrl& url) override { QDesktopServices::openUrl(url); }

private:
    bool Run(QFileDialog& dialog, QString* path) {
        m_running.append(&dialog);
        const int result = dialog.exec();
        m_running.removeAll(&dialog);
        const QStringList files = dialog.selectedFiles();
        if (result != QDialog::Accepted || files.isEmpty()) return false;
        if (path) *path = files.first();
        return true;
    }

    QList<QPointer<QFileDialog>> m_running;
};

std::shared_ptr<ChatPanelProvider>& Installed() {
    static std::shared_ptr<ChatPanelProvider> provider;
    return provider;
}

}  // namespace

void SetChatPanelProvider(std::shared_ptr<ChatPanelProvider> provider) {
    Installed() = std::move(provider);
}

std::shared_ptr<ChatPanelProvider> CurrentChatPanelProvider() {
    if (!Installed()) Installed() = std::make_shared<QtPanels>();
    return Installed();
}
