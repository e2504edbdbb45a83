#pragma once

#include <string>

/// Writes a square PNG picture, a colour gradient, `pixels` wide. False if the file could not be written.
bool writeCover(const std::string& path, unsigned pixels);
