#include "application/applicationsteps.h"

#include "network/messenger/nmessenger.h"

ApplicationSteps ApplicationSteps::none;
ApplicationSteps* ApplicationSteps::current = &ApplicationSteps::none;

void ApplicationSteps::set(ApplicationSteps* steps)
{
    current = steps ? steps : &none;
}

void ApplicationSteps::stopNetMessenger()
{
    if (gNetMessenger)
        gNetMessenger->stop();
}
