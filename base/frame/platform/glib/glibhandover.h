#pragma once

#include <gio/gio.h>

#include <string>

/// Gets what the processes of this program were started with. Main thread.
class IArgumentReceiver
{
public:
    /// False while the process is about to end: later processes then look after themselves.
    virtual bool takesArguments() = 0;
    /// One argument in its own bytes, and the folder in which the process was started; empty if that is unknown.
    virtual void receiveArgument(const std::string& argument, const std::string& folder) = 0;

protected:
    ~IArgumentReceiver() = default;
};

/// Keeps one process of the program a session: the first owns its name on the session bus, and later ones hand
/// their arguments over to it.
///
/// Without a session bus every process is a first one. Handing over touches no display. *Main thread*.
class GlibHandOver
{
public:
    /// `receiver` is borrowed; it gets the arguments of later processes while the main loop runs.
    explicit GlibHandOver(IArgumentReceiver& argumentReceiver) : receiver(argumentReceiver) {}
    GlibHandOver(const GlibHandOver&) = delete;
    ~GlibHandOver() { stop(); }

    /// False where another process has the name and has taken the arguments. `name` is that of the program, in plain
    /// words.
    bool start(const char16_t* name, int argc, char** argv);
    /// Gives the name back: the next start is a first one again.
    void stop();

private:
    /// Whether it is clear who is the first; the process that has the name may be ending.
    bool meetOthers();
    bool handOver(int argc, char** argv);
    static int onCommandLine(GApplication*, GApplicationCommandLine* line, gpointer self);

    IArgumentReceiver& receiver;
    std::string id;
    GApplication* application = nullptr;
};
