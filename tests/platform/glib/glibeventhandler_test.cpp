#include "application/uapplication.h"
#include "application/ucontroller.h"
#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/object/iptr.h"

#include <glib.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <string>

namespace
{
/// Counts pulses; at a posted message it runs a loop of its own for a while, in the middle of a pulse.
struct Client : CmObject
{
    int notify(FMessage* message) override
    {
        if (message->isType("Idle"))
            return ++pulses;
        const int before = pulses;
        bool isOver = false;
        g_timeout_add(
            100,
            [](gpointer over)
            {
                *static_cast<bool*>(over) = true;
                return G_SOURCE_REMOVE;
            },
            &isOver);
        while (!isOver)
            g_main_context_iteration(nullptr, TRUE);
        nested = pulses - before;
        return 1;
    }
    int pulses = 0;
    int nested = -1;
};
} // namespace

TEST(GlibEventHandler, APlugInGetsItsPulseFromTheLoopOfItsHost)
{
    Client client;
    std::string folder = (std::filesystem::temp_directory_path() / "plug-in-XXXXXX").string();
    ASSERT_TRUE(mkdtemp(folder.data()));
    setenv("HOME", folder.c_str(), 1);
    setenv("TMPDIR", folder.c_str(), 1);

    auto application = adopt(new UApplication(kAppTypePlugIn, "Plug-in"));
    gController->addIdle(&client);
    while (client.pulses < 3)
        g_main_context_iteration(nullptr, TRUE);

    gMessenger->postMessage(&client, new FMessage("dwell"));
    while (client.nested < 0)
        g_main_context_iteration(nullptr, TRUE);
    EXPECT_EQ(client.nested, 0);
    const int afterwards = client.pulses;
    while (client.pulses == afterwards)
        g_main_context_iteration(nullptr, TRUE);
    gController->removeIdle(&client);
    application = nullptr;
    EXPECT_EQ(gController, nullptr);

    unsetenv("TMPDIR");
    std::filesystem::remove_all(folder);
}
