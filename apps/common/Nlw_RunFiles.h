// The files a run reads and writes, checked before anything is opened for
// writing.
#pragma once

#include "framework/Nlw_Params.h"

// Adds the design file (and the design map, when given) to the run's inputs,
// then refuses a log file (the -log one or wrapLog, when not empty) or an
// output file that would overwrite any input: one error naming both files.
// Options that read further files add them with Nlw_Params::AddInputFile
// before this check.
bool Nlw_CheckRunFiles(Nlw_Params& params, const char* wrapLog = nullptr);
