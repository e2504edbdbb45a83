// qzr: packs a folder into a resource file, lists, verifies and extracts one.

#include "tools/qzr/command.h"

int main(int argc, char** argv)
{
    return runQzr(argc, argv);
}
