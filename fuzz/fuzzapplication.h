#pragma once

#include "application/ghtmlbrowser.h"
#include "fuzz/fuzztext.h"
#include "uploadmanager/puploadmanagerapplication.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>

/// Takes what would go to the desktop's browser, and drops it.
class NoBrowser : public ICustomBrowser
{
public:
    Answer openURL(const char16*) override { return kShown; }
};

/// The application without its event loop, at home in a folder of its own, which goes with the process. It has no
/// token, so that it never asks the service.
class FuzzApplication
{
public:
    FuzzApplication()
    {
        char pattern[] = "/tmp/uploadmanager-fuzz-XXXXXX";
        require(mkdtemp(pattern) != nullptr);
        home = pattern;
        for (const char* variable : {"XDG_CONFIG_HOME", "XDG_DATA_HOME", "TMPDIR"})
            setenv(variable, home.c_str(), 1);
        setenv("VELLAMOOR_UI", "console", 1);
        GHTMLBrowser::setCustomBrowser(&browser);
    }
    FuzzApplication(const FuzzApplication&) = delete;
    ~FuzzApplication()
    {
        GHTMLBrowser::setCustomBrowser(nullptr);
        std::filesystem::remove_all(home);
    }

    /// Calls `use` with a new application, which is gone afterwards, as is what it stored.
    template <class Use>
    void run(Use use)
    {
        auto* app = new PUploadManagerApplication;
        use(*app);
        app->release();
        std::error_code ignored;
        for (const auto& entry :
             std::filesystem::directory_iterator(home + "/Vellamoor Upload Manager", ignored))
            std::filesystem::remove(entry.path(), ignored);
    }

    std::string write(const char* name, const uint8_t* data, size_t size) const
    {
        const std::string path = home + "/" + name;
        std::ofstream(path, std::ios::binary)
            .write(reinterpret_cast<const char*>(data), static_cast<std::streamsize>(size));
        return path;
    }

private:
    std::string home;
    NoBrowser browser;
};

inline FuzzApplication& fuzzApplication()
{
    static FuzzApplication application;
    return application;
}
