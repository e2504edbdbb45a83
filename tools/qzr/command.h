#pragma once

/// Does what the arguments of `main` say. 0 where all went well, 1 where something is wrong with a file, 2 for wrong
/// arguments; the reason goes to standard error.
int runQzr(int argc, char** argv);
