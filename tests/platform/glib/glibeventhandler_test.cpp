#include "application/uapplication.h"
#include "application/ucontroller.h"
#include "foundation/object/iptr.h"

#include <glib.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <string>

TEST(GlibEventHandler, APlugInGetsItsPulseFromTheLoopOfItsHost)
{
    struct Client : CmObject
    {
        int notify(FMessage*) override { return ++pulses; }
        int pulses = 0;
    } client;
    std::string folder = (std::filesystem::temp_directory_path() / "plug-in-XXXXXX").string();
    ASSERT_TRUE(mkdtemp(folder.data()));
    setenv("HOME", folder.c_str(), 1);
    setenv("TMPDIR", folder.c_str(), 1);

    auto application = adopt(new UApplication(kAppTypePlugIn, "Plug-in"));
    gController->addIdle(&client);
    while (client.pulses < 3)
        g_main_context_iteration(nullptr, TRUE);
    gController->removeIdle(&client);
    application = nullptr;
    EXPECT_EQ(gController, nullptr);

    unsetenv("TMPDIR");
    std::filesystem::remove_all(folder);
}
