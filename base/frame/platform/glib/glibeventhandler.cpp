#include "platform/glib/glibeventhandler.h"

#include "application/applicationsteps.h"
#include "application/uapplication.h"
#include "application/ucontroller.h"
#include "application/urlscheme.h"

#include <glib-unix.h>

#include <csignal>
#include <cstring>
#include <utility>

namespace
{
// Milliseconds.
constexpr unsigned kPulse = 16;
constexpr unsigned kPlugInPulse = 20;

std::string currentFolder()
{
    gchar* folder = g_get_current_dir();
    const std::string result = folder;
    g_free(folder);
    return result;
}

/// The path that an argument means: desktops hand files over as paths or as "file" URLs.
std::string pathOf(const std::string& argument, const std::string& folder)
{
    if (gchar* path = g_filename_from_uri(argument.c_str(), nullptr, nullptr))
    {
        const std::string result = path;
        g_free(path);
        return result;
    }
    if (argument.front() == '/' || folder.empty())
        return argument;
    const size_t start = argument.compare(0, 2, "./") == 0 ? 2 : 0;
    return folder + (folder.back() == '/' ? "" : "/") + argument.substr(start);
}

/// Blanks what follows the path of a URL: it may be secret, and everybody can read it in the list of processes.
void hideQuery(char* argument)
{
    const char* end = strpbrk(argument, ":/?#");
    if (!end || *end != ':')
        return; // a path
    if (char* query = strpbrk(argument, "?#"))
        memset(query, 0, strlen(query));
}

/// A file is refused while the user has something to answer.
void openFile(const std::string& bytes)
{
    if (!gApplication || gApplication->isModal())
        return;
    auto path = adopt(new FNPath(FPath::kFile));
    path->fromPlatformPath(bytes.c_str());
    gApplication->openFile(path, nullptr);
}
} // namespace

IPlatformEventHandler* IPlatformEventHandler::instance()
{
    static const IPtr<GlibEventHandler> handler = adopt(new GlibEventHandler);
    return handler.get();
}

GlibEventHandler::GlibEventHandler() : loop(g_main_loop_new(nullptr, FALSE)) {}

GlibEventHandler::~GlibEventHandler()
{
    close(true);
    g_main_loop_unref(loop);
}

int32 GlibEventHandler::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IPlatformEventHandler::iid))
        return offerInterface<IPlatformEventHandler>(this, object);
    return FObject::queryInterface(interfaceID, object);
}

// Start and end

bool GlibEventHandler::open(int appType)
{
    if (appType == kAppTypePlugIn)
    {
        timer = adopt(IPlatformTimer::make(this, kPlugInPulse));
        return true;
    }
    if (!Argv || !gApplication)
        return true;
    const std::vector<std::string> arguments(Argv, Argv + Argc);
    std::vector<char*> pointers;
    for (const std::string& argument : arguments)
        pointers.push_back(const_cast<char*>(argument.c_str()));
    for (int i = 1; i < Argc; i++)
        hideQuery(Argv[i]);
    if (!handOver.start(gApplication->getName(), Argc, pointers.data()))
        return false;
    collectArguments(arguments);
    watchTermination();
    return true;
}

void GlibEventHandler::close(bool)
{
    if (timer)
        timer->stop();
    timer = nullptr;
    for (guint source : std::exchange(terminationSources, {}))
        g_source_remove(source);
    handOver.stop();
    startList.clear();
}

void GlibEventHandler::collectArguments(const std::vector<std::string>& arguments)
{
    const std::string folder = currentFolder();
    for (size_t i = 1; i < arguments.size(); i++)
        startList.push_back({arguments[i], folder});
}

void GlibEventHandler::watchTermination()
{
    for (int signal : {SIGTERM, SIGHUP})
    {
        terminationSources.push_back(g_unix_signal_add(signal, &GlibEventHandler::onTermination, this));
        // Only the first one is a question: a second ends a process that can't answer at once.
        struct sigaction action;
        sigaction(signal, nullptr, &action);
        action.sa_flags |= static_cast<int>(SA_RESETHAND);
        sigaction(signal, &action, nullptr);
    }
}

gboolean GlibEventHandler::onTermination(gpointer)
{
    UController::canTerminate();
    return G_SOURCE_CONTINUE;
}

// Run

void GlibEventHandler::runPlatformEventLoop()
{
    isRunning = true;
    runningApplication = gApplication;
    timer = adopt(IPlatformTimer::make(this, kPulse));
    g_idle_add_full(G_PRIORITY_DEFAULT, &GlibEventHandler::onLaunched, this, nullptr);
    g_main_loop_run(loop);
}

void GlibEventHandler::quitPlatformEventLoop()
{
    if (!isRunning)
        return;
    timer->stop();
    timer = nullptr;
    isRunning = false;
    ApplicationSteps::get().clearClipboard();
    releaseApplication();
    g_main_loop_quit(loop);
}

void GlibEventHandler::releaseApplication()
{
    // Not the last reference: this is called by operations of the application itself, and of its controller. Both
    // go when whoever built the application releases it, after the loop.
    runningApplication = nullptr;
}

void GlibEventHandler::onTimer()
{
    // An event loop within a pulse turns the timer too: it must not start a pulse from the middle of another.
    const bool wasInPulse = std::exchange(inPulse, true);
    if (gController && !wasInPulse)
        pulse();
    inPulse = wasInPulse;
}

void GlibEventHandler::pulse()
{
    gController->onIdle(false);
    if (gController && gController->isFlushEnabled())
        doUpdates();
}

void GlibEventHandler::doUpdates()
{
    ApplicationSteps::get().flushWindows();
}

void GlibEventHandler::doNextEvent()
{
    g_main_context_iteration(nullptr, TRUE);
}

bool GlibEventHandler::eventPending()
{
    return g_main_context_pending(nullptr) != FALSE;
}

// Files and URLs

gboolean GlibEventHandler::onLaunched(gpointer self)
{
    static_cast<GlibEventHandler*>(self)->deliverStartList();
    return G_SOURCE_REMOVE;
}

void GlibEventHandler::deliverStartList()
{
    for (const Start& start : std::exchange(startList, {}))
        receiveArgument(start.argument, start.folder);
    if (gApplication)
        gApplication->performStartupActions();
}

bool GlibEventHandler::takesArguments()
{
    return gController && !gController->isDone();
}

void GlibEventHandler::receiveArgument(const std::string& argument, const std::string& folder)
{
    if (argument.empty() || !takesArguments())
        return;
    if (IURLSchemeHandler* handler = URLScheme::findHandler(argument.c_str()))
        handler->openURL(argument.c_str());
    else
        openFile(pathOf(argument, folder));
}
