#pragma once

#include "foundation/thread/iplatformtimer.h"

#include <glib.h>

/// A timer on the default main context.
///
/// It stays just below painting, so that slow ticks can't starve it, and ticks also in loops that are run inside a
/// tick. *Main thread*.
class GlibTimer : public IPlatformTimer
{
    DECLARE_TYPE(GlibTimer, IPlatformTimer)

    GlibTimer(ITimerCallback* tickCallback, unsigned intervalMs);
    GlibTimer(const GlibTimer&) = delete;
    ~GlibTimer() override { stopSource(); }

    void stop() override { stopSource(); }

    /// While false, no timer ticks.
    static bool timersEnabled;

private:
    static gboolean tick(gpointer timer);
    void stopSource();

    ITimerCallback* callback;
    GSource* source;
};
