// The host's sound service: the component asks it to play the incoming-chat sound file. A
// window host installs real playback; by default a request becomes a log line.
#pragma once

#include <functional>

// Plays the sound file at path.
using SoundPlayer = std::function<void(const char* path)>;

// Installs how sound files are played; an empty player restores the default (a log line).
void SetSoundPlayer(SoundPlayer player);

// Plays the sound file at path; a null path counts as empty.
void KVOPlaySoundFile(const char* path);
