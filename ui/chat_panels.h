// The modal panels and link prompts the chat window runs. The default shows Qt dialogs; a
// test or a scripted host installs its own answers instead.
#pragma once

#include <QString>
#include <QStringList>
#include <QUrl>
#include <memory>

class QWidget;

class ChatPanelProvider {
public:
    virtual ~ChatPanelProvider() = default;
    // Runs a modal save panel; true with *path set when the user confirmed a file.
    virtual bool RunSavePanel(QWidget* parent, const QString& title, const QString& proposedName,
                              const QString& requiredSuffix, QString* path) = 0;
    // Runs a modal open panel for one file with one of suffixes; true with *path set when
    // the user confirmed one.
    virtual bool RunOpenPanel(QWidget* parent, const QString& title, const QStringList& suffixes,
                              QString* path) = 0;
    // Ends the running panels as cancelled.
    virtual void AbortPanels() = 0;
    // Asks before opening a link that may start a program or read local files.
    virtual bool ConfirmOpenLink(QWidget* parent, const QUrl& url) = 0;
    // Opens a link with the desktop's default handler.
    virtual void OpenLink(const QUrl& url) = 0;
};

// Installs the provider every chat window uses; null restores the Qt dialogs.
void SetChatPanelProvider(std::shared_ptr<ChatPanelProvider> provider);
// The provider in use (kept alive by the caller's copy while a panel runs).
std::shared_ptr<ChatPanelProvider> CurrentChatPanelProvider();
