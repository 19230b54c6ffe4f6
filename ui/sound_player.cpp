#include "ui/sound_player.h"

#include <QCoreApplication>
#include <QFile>
#include <QPointer>
#include <QSoundEffect>
#include <QUrl>

#include "platform/func_trace.h"
#include "platform/sound.h"

namespace {

// A RIFF file of form WAVE: the only kind the chat sound may be.
bool IsWaveFile(QFile& file) {
    const QByteArray header = file.read(12);
    return header.size() == 12 && header.startsWith("RIFF") && header.mid(8, 4) == "WAVE";
}

// One effect for the process, made on first use and gone with the application.
QSoundEffect* Effect() {
    static QPointer<QSoundEffect> effect;
    if (!effect) effect = new QSoundEffect(QCoreApplication::instance());
    return effect;
}

}  // namespace

bool PlayWavFile(const char* path) {
    const QString file = QString::fromUtf8(path ? path : "");
    QFile wav(file);
    if (file.isEmpty() || !wav.open(QIODevice::ReadOnly)) {
        MacWarnTrace2(kChatTag, "chat sound \"%s\" cannot be read; nothing plays",
                      file.toUtf8().constData());
        return false;
    }
    if (!IsWaveFile(wav)) {
        MacWarnTrace2(kChatTag, "chat sound \"%s\" is not a WAV file; nothing plays",
                      file.toUtf8().constData());
        return false;
    }
    if (!QCoreApplication::instance()) {
        MacWarnTrace2(kChatTag, "chat sound \"%s\": no Qt application to play it",
                      file.toUtf8().constData());
        return false;
    }
    QSoundEffect* effect = Effect();
    effect->setSource(QUrl::fromLocalFile(file));
    effect->play();
    return true;
}

void InstallQtSoundPlayer() {
    SetSoundPlayer([](const char* path) { PlayWavFile(path); });
}
