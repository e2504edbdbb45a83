#include "platform/glib/glibhandover.h"

#include <cctype>

namespace
{
// A first process that quits just now doesn't answer any more; a moment later its name is free.
constexpr int kAttempts = 20;
constexpr gulong kPauseMicroseconds = 50000;

// What the first process answers to a later one, which is that one's exit code.
constexpr int kTaken = 0;
constexpr int kNotTaken = 1;

/// A name on the bus for "Some Program": letters and digits behind the maker's own prefix.
std::string busName(const char16_t* name)
{
    std::string id = "com.vellamoor.";
    for (; *name; name++)
        if (*name < 0x80 && isalnum(static_cast<int>(*name)))
            id += static_cast<char>(*name);
    return id;
}

void ignoreActivation(GApplication*, gpointer) {}
} // namespace

bool GlibHandOver::start(const char16_t* name, int argc, char** argv)
{
    id = busName(name);
    for (int attempt = 0; attempt < kAttempts; attempt++)
    {
        if (meetOthers())
        {
            if (!g_application_get_is_remote(application))
                return true;
            if (handOver(argc, argv))
                return false;
        }
        g_usleep(kPauseMicroseconds);
    }
    // Nobody takes the arguments, so nobody but this process can work on them.
    return true;
}

bool GlibHandOver::meetOthers()
{
    stop();
    application = g_application_new(id.c_str(), G_APPLICATION_HANDLES_COMMAND_LINE);
    g_signal_connect(application, "command-line", G_CALLBACK(&GlibHandOver::onCommandLine), this);
    g_signal_connect(application, "activate", G_CALLBACK(&ignoreActivation), nullptr);
    // The application takes this very connection while it is held.
    GDBusConnection* bus = g_bus_get_sync(G_BUS_TYPE_SESSION, nullptr, nullptr);
    // A bus that goes is no reason to end in the midst of an upload, nor without having begun one.
    if (bus)
        g_dbus_connection_set_exit_on_close(bus, FALSE);
    const bool isRegistered = g_application_register(application, nullptr, nullptr);
    g_clear_object(&bus);
    return isRegistered;
}

bool GlibHandOver::handOver(int argc, char** argv)
{
    return g_application_run(application, argc, argv) == kTaken;
}

void GlibHandOver::stop()
{
    // A process whose answer got lost would work on its arguments again.
    const bool isRegistered = application && g_application_get_is_registered(application);
    GDBusConnection* bus = isRegistered ? g_application_get_dbus_connection(application) : nullptr;
    if (bus)
        g_dbus_connection_flush_sync(bus, nullptr, nullptr);
    g_clear_object(&application);
}

int GlibHandOver::onCommandLine(GApplication*, GApplicationCommandLine* line, gpointer self)
{
    IArgumentReceiver& receiver = static_cast<GlibHandOver*>(self)->receiver;
    if (!receiver.takesArguments())
        return kNotTaken;

    int count = 0;
    gchar** arguments = g_application_command_line_get_arguments(line, &count);
    const gchar* folder = g_application_command_line_get_cwd(line);
    for (int i = 1; i < count; i++)
        receiver.receiveArgument(arguments[i], folder ? folder : "");
    g_strfreev(arguments);
    return kTaken;
}
