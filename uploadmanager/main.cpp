#include "application/iplatformeventhandler.h"
#include "application/outofmemory.h"
#include "application/platformservices.h"
#include "uploadmanager/puploadmanagerapplication.h"

// Ahead of all objects that are made before main, most of which need memory.
[[gnu::constructor(101)]] static void beginInWords()
{
    endInWordsWithoutMemory();
}

int AppMain()
{
    PUploadManagerApplication* application = new PUploadManagerApplication;
    application->run();
    application->release();
    return 0;
}

int main(int argc, char** argv)
{
    Argc = argc;
    Argv = argv;
    PlatformServices::raiseLimits();
    // The platform's side exists before any other object of the framework.
    IPlatformEventHandler::instance();
    return AppMain();
}
