#include "storage/filesystem/fsystemshell.h"

#include "storage/filesystem/desktopservices.h"
#include "storage/filesystem/diskname.h"
#include "storage/filesystem/platformfiles.h"
#include "storage/path/filenametext.h"
#include "storage/path/fnpath.h"

bool FSystemShell::executeURL(const char16* url)
{
    return url && *url && DesktopServices::openUrl(FileNameText::toBytes(ConstString(url)).c_str());
}

bool FSystemShell::execute(const char16* command, const FNPath* argument)
{
    const FNPath path(command, FPath::kFile);
    const std::string bytes = DiskName::find(path);
    if (bytes.empty())
        return false;
    if (!PlatformFiles::isExecutable(bytes))
        return DesktopServices::openFile(bytes.c_str());
    const std::string argumentBytes = argument ? DiskName::find(*argument) : std::string();
    return DesktopServices::runProgram(bytes.c_str(), argument ? argumentBytes.c_str() : nullptr);
}

bool FSystemShell::showInBrowser(const FNPath* path)
{
    return path && DesktopServices::showInFileManager(DiskName::find(*path).c_str());
}
