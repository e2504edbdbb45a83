#include "application/applicationsteps.h"

ApplicationSteps ApplicationSteps::none;
ApplicationSteps* ApplicationSteps::current = &ApplicationSteps::none;

void ApplicationSteps::set(ApplicationSteps* steps)
{
    current = steps ? steps : &none;
}
