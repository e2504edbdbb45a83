#pragma once

#include <string>

/// Writes a WAV file (mono, 16 bits, 44,100 a second) with one sine tone that fades in and out.
/// False if the file could not be written.
bool writeTone(const std::string& path, double seconds, double hertz = 440.0);
