#pragma once

#include "application/urlprotocols.h"
#include "containers/sequence/cmarray.h"
#include "foundation/text/cmstring.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/uploadthread.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <string>
#include <vector>

/// Reads what the application keeps to itself.
struct ApplicationProbe
{
    static std::vector<std::string> texts(const CmArray& array)
    {
        std::vector<std::string> result;
        for (int i = 0; i < array.total(); i++)
        {
            FString text(*static_cast<CmString*>(array.at(i)));
            text.toMultiByte(kEncodingUtf8);
            result.emplace_back(text.text8());
        }
        return result;
    }
    static std::vector<std::string> generalErrors(PUploadManagerApplication& app)
    {
        return texts(app.generalErrors);
    }
    static std::vector<std::string> uploadErrors(PUploadManagerApplication& app)
    {
        return texts(app.uploadErrors);
    }
    static std::string fatalError(PUploadManagerApplication& app)
    {
        FString text(app.fatalErrorText);
        text.toMultiByte(kEncodingUtf8);
        return text.text8();
    }
    static int waiting(PUploadManagerApplication& app) { return app.requests.total(); }
    static int finished(PUploadManagerApplication& app) { return app.finishedRequests.total(); }
    static int failed(PUploadManagerApplication& app) { return app.failedRequests.total(); }
    static void cancel(PUploadManagerApplication& app) { app.setCancelRequested(true); }
    static bool isCancelled(PUploadManagerApplication& app) { return app.isCancelRequested(); }
    static void waitForThread(PUploadManagerApplication& app) { app.uploadThread->waitDead(-1); }
    static bool quitsAtIdle(PUploadManagerApplication& app) { return app.quitAtIdle; }
    static VlmrApplication* product(PUploadManagerApplication& app, const char* name)
    {
        return app.findProduct(name);
    }
};

/// The application without its event loop, at home in a folder of its own.
class ApplicationTest : public testing::Test
{
protected:
    void SetUp() override
    {
        char pattern[] = "/tmp/uploadmanager-test-XXXXXX";
        ASSERT_NE(mkdtemp(pattern), nullptr);
        home = pattern;
        setenv("XDG_CONFIG_HOME", home.c_str(), 1);
        setenv("XDG_DATA_HOME", home.c_str(), 1);
        setenv("VELLAMOOR_UI", "console", 1);
        registerUrlProtocols();
        restart();
    }
    void TearDown() override
    {
        app->release();
        std::filesystem::remove_all(home);
    }

    /// A process of its own begins with the application: what is kept comes from files.
    void restart()
    {
        if (app)
            app->release();
        app = new PUploadManagerApplication;
    }

    std::string write(const std::string& name, const std::string& content)
    {
        std::string path = home + "/" + name;
        std::ofstream(path, std::ios::binary) << content;
        return path;
    }
    std::string userFile(const std::string& name) { return home + "/Vellamoor Upload Manager/" + name; }
    static std::string read(const std::string& path)
    {
        std::ifstream file(path, std::ios::binary);
        return std::string(std::istreambuf_iterator<char>(file), {});
    }

    std::string home;
    PUploadManagerApplication* app = nullptr;
};

using Texts = std::vector<std::string>;
