#pragma once

#include <string>

/// Registers `browser`, a path, as what opens "https" URLs for a user whose data and configuration folders (as the
/// base directory rules name them) are the ones given. The folders are made. False if that could not be written.
bool registerBrowser(const std::string& browser, const std::string& dataHome, const std::string& configHome);
