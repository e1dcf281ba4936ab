// The command lines of the two programs: options into run parameters.
#pragma once

#include <string>
#include <vector>

#include "Nlw_AppTiming.h"
#include "framework/Nlw_Params.h"

enum class Nlw_Program { Qdb2ver, Tessel };

// What the command line asked for besides the run parameters.
struct Nlw_CommandLine {
    Nlw_Params params;
    bool help = false;         // -h: print the help text
    std::string helpTopic;     // tessel -h <netlist_type>
    bool version = false;      // --version: print the program's version
    bool debug = false;        // --debug or -verbose: debug traces on the console
    bool quiet = false;        // -quiet, -intstyle silent
    Nlw_TimingOptions timing;  // -timing, -timing_nets
    // Options accepted but without effect here, in the order given; each
    // gets its one warning (the text, which names the option and says why).
    std::vector<std::string> ignored;
    std::string intStyle = "qde";  // -intstyle: qde, qflow or silent
    std::string wrapLog;           // --wraplog: a log the messages are appended to
    bool module = false;           // -module: a module to be instantiated
    bool core = false;             // -core: modules as black boxes (with -funcells)
    bool ppBuffers = false;        // -insert_pp_buffers true
    std::string qcfFile;           // -qcf
    std::string bramDir;           // -bx
    struct BramData {
        std::string file, tag;
    };
    std::vector<BramData> bramData;  // -bd file [tag name], in the order given
    // Set when the command line is unusable; the program prints the synopsis.
    std::string error;
};

// The option list of tessel for one netlist type ("sim", "sta" or "ecn",
// or their long names), one help line per option; empty for another type.
std::vector<std::string> Nlw_TesselOptionHelp(const std::string& netlistType);

// Parses args (without the program name). Never fails hard: problems are
// reported in result.error.
Nlw_CommandLine Nlw_ParseCommandLine(Nlw_Program program, const std::vector<std::string>& args);

// The default output file: the input's root with ".v", or its base name
// with ".v" in dir when one is given.
std::string Nlw_DefaultOutputName(const std::string& input, const char* dir);
// An output file name the user gave: ".v" is added unless it ends in it.
std::string Nlw_GivenOutputName(const std::string& name);
