#include "storage/virtual/fpluginstreamproxy.h"

#include "storage/virtual/ffilesystemadapter.h"

FPluginStreamProxy::FPluginStreamProxy(IBStream* plainStream, FFileSystemAdapter* itsFileSystem)
    : IStreamProxy(plainStream),
      files(itsFileSystem)
{
}

FPluginStreamProxy::~FPluginStreamProxy()
{
    // The component's stream goes first: once the adapter is told, the component itself may.
    IBStream* const gone = plain;
    plain = nullptr;
    if (files)
        files->notifyStreamDestruction(gone);
}
