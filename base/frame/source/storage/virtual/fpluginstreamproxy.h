#pragma once

#include "storage/virtual/istreamproxy.h"

class FFileSystemAdapter;

/// A stream that is open in a component's file system, and keeps that mounted. One thread at a time.
class FPluginStreamProxy : public IStreamProxy
{
    DECLARE_TYPE(FPluginStreamProxy, IStreamProxy)

    /// Adds a reference to both; the adapter counts the stream until it is told of its end.
    FPluginStreamProxy(IBStream* plainStream, FFileSystemAdapter* itsFileSystem);
    ~FPluginStreamProxy() override;

private:
    IPtr<FFileSystemAdapter> files;
};
