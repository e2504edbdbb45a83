#pragma once

/// The kind of process.
enum UAppType : int
{
    kAppTypeStandalone = 1, ///< a program of its own
    kAppTypePlugIn = 3      ///< hosted by another process, which has its own event loop
};
