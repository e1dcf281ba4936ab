// The program's own changes to the model and its side files, each made for
// one option after the design is read (see docs/programs.md).
#pragma once

#include <string>
#include <vector>

#include "Nlw_CommandLine.h"

class Nlw_NlView;
class Nlw_Params;
class Nlw_NetlistWriter;
class Nlw_Timing;

// -gp / -tp: brings the global set/reset (setReset true) or tristate net out
// as an input port of the top module named portName. The net marked as that
// global (when it is undriven) or else a new net of the port's name is
// joined to the port, becomes the view's global signal driven from that port
// (connection value 2, its network's "VL_FLOATVAL" kept or 0), and carries
// "NLW_CHIPWIDE_NET" naming the chipwide net ("GSR" or "GTS") the netlist
// drives from it. Returns false, after one error, when the top module
// already has a port of that name.
bool Nlw_AddGlobalPort(Nlw_NlView& view, const char* portName, bool setReset);

// -insert_pp_buffers true: puts a buffer cell (V_BUF) between each input
// port of the top module and the logic it feeds, so that a simulator has a
// path on which to apply its pulse limits. Returns the number inserted.
size_t Nlw_InsertPathPulseBuffers(Nlw_NlView& view);

// -qcf: checks that every name the constraints file constrains exists in the
// design; one warning per name that does not. False, after one error, when
// the file cannot be read.
bool Nlw_CheckQcfFile(const Nlw_NlView& view, const char* fileName);

// -bd: loads block RAM contents from memory files into the block RAMs'
// initial contents parameters (after the preparation pass). False, after
// one error naming the file, when a file cannot be read or is malformed.
bool Nlw_LoadBlockRamData(Nlw_NetlistWriter& nlw,
                          const std::vector<Nlw_CommandLine::BramData>& data);
// -bx: writes each block RAM's initial contents as a memory file into dir.
// False, after one error, when the directory cannot be made.
bool Nlw_WriteBlockRamFiles(Nlw_NetlistWriter& nlw, const char* dir);

// -s with -timing nominal: scales the nominal delays to the speed grade -s
// names, by the factor of the device data list "NominalSpeedGrade"; one
// warning for a grade the list does not give.
void Nlw_ApplySpeedGrade(Nlw_NetlistWriter& nlw, Nlw_Timing& timing);
