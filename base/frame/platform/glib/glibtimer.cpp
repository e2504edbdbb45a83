#include "platform/glib/glibtimer.h"

#include "foundation/object/iptr.h"

namespace
{
// One below the priority at which windows are painted.
constexpr int kPriority = G_PRIORITY_HIGH_IDLE + 21;
} // namespace

bool GlibTimer::timersEnabled = true;

IPlatformTimer* IPlatformTimer::make(ITimerCallback* callback, unsigned intervalMs)
{
    return new GlibTimer(callback, intervalMs);
}

GlibTimer::GlibTimer(ITimerCallback* tickCallback, unsigned intervalMs)
    : callback(tickCallback),
      source(g_timeout_source_new(intervalMs))
{
    g_source_set_priority(source, kPriority);
    g_source_set_can_recurse(source, TRUE);
    g_source_set_callback(source, &GlibTimer::tick, this, nullptr);
    g_source_attach(source, nullptr);
}

gboolean GlibTimer::tick(gpointer timer)
{
    // The tick may release its timer.
    const IPtr<GlibTimer> held(static_cast<GlibTimer*>(timer));
    if (timersEnabled)
        held->callback->onTimer();
    return G_SOURCE_CONTINUE;
}

void GlibTimer::stopSource()
{
    if (!source)
        return;
    g_source_destroy(source);
    g_source_unref(source);
    source = nullptr;
}
