#include "application/onetimeprocedure.h"
#include "application/uapplication.h"
#include "network/messenger/nmessenger.h"

namespace
{
/// What other programs on the network are told of this one.
void tellProgram(String& name, String& version)
{
    if (!gApplication)
        return;
    name.assign(gApplication->getName());
    version.assign(gApplication->getVersion());
}

bool registerProgram()
{
    NMessenger::setProgramInfo(&tellProgram);
    return true;
}

OneTimeProcedure program("network program", 0, &registerProgram);
} // namespace
