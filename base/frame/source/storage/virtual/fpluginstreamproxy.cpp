#include "storage/virtual/fpluginstreamproxy.h"

#include "storage/virtual/ffilesystemadapter.h"

FPluginStreamProxy::FPluginStreamProxy(IBStream* plainStream, FFileSystemAdapter* itsFileSystem)
    : IStreamProxy(plainStream),
      files(itsFileSystem)
{
}

FPluginStreamProxy::~FPluginStreamProxy()
{
    if (files)
        files->notifyStreamDestruction(getPlainStream());
}
