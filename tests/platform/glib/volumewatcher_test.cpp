#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/path/fnpath.h"

#include <glib.h>
#include <gtest/gtest.h>

#include <sched.h>
#include <sys/mount.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <string>

namespace
{
constexpr int kNotPermitted = 77;

class Subscriber : public CmObject
{
public:
    int notify(FMessage* message) override
    {
        FString root;
        FCast(FNPath, message->get("kRootPath"))->getFullPath(root);
        heard += std::string(message->getMessageID()) + " " + root.text8() + "\n";
        return 1;
    }

    std::string heard;
};

/// Mounts of its own, which nobody else sees and which end with the process.
bool makePrivateMounts()
{
    return unshare(CLONE_NEWNS) == 0 && mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0 &&
           mount("none", "/mnt", "tmpfs", 0, nullptr) == 0 && mkdir("/mnt/stick", 0700) == 0;
}

void deliverUntilHeard(const Subscriber& subscriber, const std::string& beginning)
{
    while (subscriber.heard.compare(0, beginning.size(), beginning) != 0)
    {
        g_main_context_iteration(nullptr, TRUE);
        gMessenger->deliverMessages();
    }
}

int plugInAndOut()
{
    if (!makePrivateMounts())
        return kNotPermitted;
    gMessenger = FMessenger::instance();
    FNFileSystem files;
    Subscriber subscriber;
    files.subscribeToMountEvent(&subscriber);
    if (mount("none", "/mnt/stick", "tmpfs", 0, nullptr) != 0)
        return 1;
    deliverUntilHeard(subscriber, "VolMount /mnt/stick\n");
    if (umount("/mnt/stick") != 0)
        return 2;
    deliverUntilHeard(subscriber, "VolMount /mnt/stick\nVolUnmount /mnt/stick\n");
    files.unsubscribeFromMountEvent(&subscriber);
    return 0;
}
} // namespace

TEST(VolumeWatcher, TellsSubscribersOfVolumesThatComeAndGo)
{
    const pid_t child = fork();
    if (child == 0)
        _exit(plugInAndOut());
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFEXITED(status));
    if (WEXITSTATUS(status) == kNotPermitted)
        GTEST_SKIP() << "this user may not mount anything";
    EXPECT_EQ(WEXITSTATUS(status), 0);
}
