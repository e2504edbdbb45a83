#pragma once

#include <string>

/// What the application asks of the operating system at its start. All paths are bytes, without a delimiter at the
/// end; empty where there is none. *Main thread*.
namespace PlatformServices
{
/// Lets the process open up to 10240 files, and gives it all the stack that it may have. A refusal is no error.
void raiseLimits();

/// The file of the running program.
std::string getExecutablePath();
/// Where users keep their settings.
std::string getConfigFolder();
/// Where users keep data that programs share.
std::string getDataFolder();
/// A folder for short-lived files of this user's programs of that name; made if needed, for the owner only.
std::string getTemporaryFolder(const std::string& name);
/// Makes the folder and what leads to it, for the owner only; whether it is there afterwards.
bool makePrivateFolder(const std::string& path);

/// How many bytes given to the socket the other side has not taken yet; -1 where that can't be told. Any thread.
int unsentBytes(int socket);

/// Hands a URL to the desktop's handler for its scheme. Any thread.
void openURL(const std::string& url);
} // namespace PlatformServices
