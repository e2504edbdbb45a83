#include "tools/browser/browserhome.h"

#include <filesystem>
#include <fstream>

bool registerBrowser(const std::string& browser, const std::string& dataHome, const std::string& configHome)
{
    const std::filesystem::path applications = std::filesystem::path(dataHome) / "applications";
    std::error_code error;
    std::filesystem::create_directories(applications, error);
    std::filesystem::create_directories(configHome, error);

    std::ofstream entry(applications / "stand-in-browser.desktop");
    entry << "[Desktop Entry]\nType=Application\nName=Stand-in browser\nExec=\"" << browser
          << "\" %u\nMimeType=x-scheme-handler/https;\nNoDisplay=true\n";

    std::ofstream defaults(std::filesystem::path(configHome) / "mimeapps.list");
    defaults << "[Default Applications]\nx-scheme-handler/https=stand-in-browser.desktop\n";
    return entry.flush().good() && defaults.flush().good();
}
