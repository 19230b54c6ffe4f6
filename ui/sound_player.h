// The incoming-chat sound in a Qt host: WAV files played through Qt Multimedia. A missing,
// unreadable or non-WAV file is logged and nothing plays; no audio device is no error.
#pragma once

// Makes KVOPlaySoundFile play through Qt Multimedia.
void InstallQtSoundPlayer();

// Plays the WAV file at path; false (after a log line) when the file cannot be played.
bool PlayWavFile(const char* path);
