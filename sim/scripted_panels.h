// The chat windows' save and open panels and link prompts, answered from the scenario's
// script instead of by a user, so that a run never waits on a modal window.
#pragma once

#include <functional>
#include <string>

#include "ui/chat_panels.h"

class ScriptedPanels final : public ChatPanelProvider {
public:
    // Gives the next scripted answer for a save (true) or open (false) panel: true with a
    // path, false for cancel.
    using Answer = std::function<bool(bool bSave, std::string* path)>;

    explicit ScriptedPanels(Answer answer) : m_answer(std::move(answer)) {}

    bool RunSavePanel(QWidget*, const QString&, const QString&, const QString&,
                      QString* path) override;
    bool RunOpenPanel(QWidget*, const QString&, const QStringList&, QString* path) override;
    void AbortPanels() override {}
    // Links are never opened from a scenario.
    bool ConfirmOpenLink(QWidget*, const QUrl&) override { return false; }
    void OpenLink(const QUrl&) override {}

private:
    bool Run(bool bSave, QString* path);

    Answer m_answer;
};
