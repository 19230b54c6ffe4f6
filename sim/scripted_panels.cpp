#include "sim/scripted_panels.h"

bool ScriptedPanels::RunSavePanel(QWidget*, const QString&, const QString&, const QString&,
                                  QString* path) {
    return Run(true, path);
}

bool ScriptedPanels::RunOpenPanel(QWidget*, const QString&, const QStringList&, QString* path) {
    return Run(false, path);
}

bool ScriptedPanels::Run(bool bSave, QString* path) {
    std::string chosen;
    if (!m_answer || !m_answer(bSave, &chosen)) return false;
    if (path) *path = QString::fromStdString(chosen);
    return true;
}
