#pragma once

/// What the desktop does with files and URLs; each gives false where it can't. Texts are bytes as the
/// platform takes them. Defined by the platform. Main thread.
namespace DesktopServices
{
/// Opens a URL with the default program of its scheme. The URL is handed on byte for byte.
bool openUrl(const char* url);
/// Opens a document with the default program of its kind.
bool openFile(const char* path);
bool showInFileManager(const char* path);
/// Moves a file or folder to the trash of its volume.
bool trash(const char* path);
/// Starts a program that goes on by itself; `argument` may be null.
bool runProgram(const char* path, const char* argument);
} // namespace DesktopServices
