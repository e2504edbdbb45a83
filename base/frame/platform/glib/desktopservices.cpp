#include "storage/filesystem/desktopservices.h"

#include <gio/gio.h>
#include <memory>

namespace
{
constexpr int kAnswerMs = 3000;

struct Unreferencing
{
    void operator()(gpointer object) const { g_object_unref(object); }
};
struct Freeing
{
    void operator()(char* text) const { g_free(text); }
};
using File = std::unique_ptr<GFile, Unreferencing>;
using Text = std::unique_ptr<char, Freeing>;

File fileAt(const char* path)
{
    return File(g_file_new_for_path(path));
}

Text uriOf(const char* path)
{
    return Text(g_file_get_uri(fileAt(path).get()));
}

// Asks the running file manager to select the file.
bool askFileManager(const char* uri)
{
    const std::unique_ptr<GDBusConnection, Unreferencing> bus(
        g_bus_get_sync(G_BUS_TYPE_SESSION, nullptr, nullptr));
    if (!bus)
        return false;
    GVariantBuilder uris;
    g_variant_builder_init(&uris, G_VARIANT_TYPE("as"));
    g_variant_builder_add(&uris, "s", uri);
    GVariant* answer = g_dbus_connection_call_sync(
        bus.get(), "org.freedesktop.FileManager1", "/org/freedesktop/FileManager1",
        "org.freedesktop.FileManager1", "ShowItems", g_variant_new("(ass)", &uris, ""), nullptr,
        G_DBUS_CALL_FLAGS_NONE, kAnswerMs, nullptr, nullptr);
    if (!answer)
        return false;
    g_variant_unref(answer);
    return true;
}
} // namespace

// The desktop's handler gets the text as it is: GFile, which rewrites URLs, is asked only where no program has
// registered for the scheme.
bool DesktopServices::openUrl(const char* url)
{
    return g_uri_is_valid(url, G_URI_FLAGS_PARSE_RELAXED, nullptr) &&
           g_app_info_launch_default_for_uri(url, nullptr, nullptr);
}

bool DesktopServices::openFile(const char* path)
{
    return g_file_test(path, G_FILE_TEST_EXISTS) && openUrl(uriOf(path).get());
}

bool DesktopServices::showInFileManager(const char* path)
{
    if (!g_file_test(path, G_FILE_TEST_EXISTS))
        return false;
    if (askFileManager(uriOf(path).get()))
        return true;
    const Text folder(g_path_get_dirname(path));
    return openFile(folder.get());
}

bool DesktopServices::trash(const char* path)
{
    return g_file_trash(fileAt(path).get(), nullptr, nullptr);
}

bool DesktopServices::runProgram(const char* path, const char* argument)
{
    const char* arguments[] = {path, argument, nullptr};
    // glib never writes to the arguments; its interface is older than const.
    return g_spawn_async(nullptr, const_cast<char**>(arguments), nullptr, G_SPAWN_DEFAULT, nullptr, nullptr,
                         nullptr, nullptr);
}
