// The run of one program: command line, design, writer, exit code.
#pragma once

#include "Nlw_CommandLine.h"

// Runs the program on its arguments (without the program name) and returns
// the exit code: 0 on success, 1 when an error was reported while writing,
// 2 for an unusable command line or a design file that cannot be read.
int Nlw_RunProgram(Nlw_Program program, int argc, const char* const* argv);
