#include "platform/sound.h"

#include <utility>

#include "platform/trace.h"

namespace {

SoundPlayer& Player() {
    static SoundPlayer player;
    return player;
}

}  // namespace

void SetSoundPlayer(SoundPlayer player) {
    Player() = std::move(player);
}

void KVOPlaySoundFile(const char* path) {
    const char* file = path ? path : "";
    if (Player()) {
        Player()(file);
    } else {
        MacInfoTrace2("Sound", "play %s", file);
    }
}
