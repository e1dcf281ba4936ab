// tessel's option lists, one per netlist type ("tessel -h sim").
#include <cstring>

#include "Nlw_CommandLine.h"
#include "port/UT.h"

namespace {

enum : unsigned { kSim = 1, kSta = 2, kEcn = 4, kAll = kSim | kSta | kEcn };

struct HelpLine {
    unsigned types;
    const char* option;  // with its arguments
    const char* text;
};

// In the order of the synopsis; the options tessel adds come after -ul.
const HelpLine kLines[] = {
    {kEcn, "-ecn tool_name",
     "Write an equivalence checking netlist for the tool (formality, conformal)."},
    {kSim, "-sim", "Write a simulation netlist (the default)."},
    {kSta, "-sta", "Write a static timing analysis netlist and its translation file."},
    {kAll, "-ofmt verilog", "Output format; verilog is the only one."},
    {kAll, "-aka", "Write Also-Know-As names as comments."},
    {kSim, "-bx BRAM_output_dir", "Write each block RAM's initial contents as a memory file."},
    {kSim, "-bd file [tag name]", "Take block RAM contents from a memory file (repeatable)."},
    {kAll, "-dir dir_name", "Write the output files into the directory."},
    {kAll, "-fn", "Flatten verilog netlist."},
    {kSim, "-gp port_name", "Bring out global reset/set net as port."},
    {kAll, "-intstyle qde|qflow|silent", "Message style: full, one line each, or warnings only."},
    {kSim, "-ism", "Include timcell modules in verilog file."},
    {kSim, "-insert_chipwide true|false", "Insert chipwide module into netlist."},
    {kSim, "-insert_pp_buffers true|false", "Buffer each top-level input for pulse limits."},
    {kAll, "-ne", "Do not escape names."},
    {kEcn, "-qdm qdm_file", "Design map file for the assertion file."},
    {kAll, "-mhf", "Write one netlist file per module."},
    {kAll, "-module", "Write the top as a module for a larger design (no chipwide, no fixture)."},
    {kSta, "-qcf qcf_file", "Check the constraint names of the physical constraints file."},
    {kSim, "-pf", "Generate pin file."},
    {kAll, "-s speed", "Speed grade of the pin map and of nominal timing."},
    {kSim, "-sdf_anno true|false", "Write $sdf_annotate into the netlist (default true)."},
    {kSim, "-sdf_path [path]", "Full path to sdf file used in $sdf_annotate."},
    {kSim, "-shm", "Write $shm* statements in testfixture."},
    {kSim, "-tb", "Generate testfixture file."},
    {kSim, "-ti top_inst_name", "Name top-level testbench instance as desired."},
    {kAll, "-tm top_module_name", "Name top-level module as desired."},
    {kSim, "-tp port_name", "Bring out global tristate net as port."},
    {kSim, "-ul", "Include `uselib in verilog file."},
    {kSim, "-funcells", "Write functional models (funcells), without timing checks."},
    {kSim, "-core", "Write functional models as black boxes for synthesis (a core)."},
    {kSim, "-vcd", "Write $dump* statements in testfixture."},
    {kAll, "-w", "Overwrite the output file."},
    {kAll, "--10ps", "Set time precision to be 10 ps (the default is 1 ps)."},
    {kAll, "--cd", "Write `celldefine/`endcelldefine."},
    {kAll, "--log log_file", "Name the log file."},
    {kAll, "--quiet", "Reduce the screen output."},
    {kAll, "--r", "Retain hierarchy in verilog file (the default; undoes -fn)."},
    {kAll, "--verbose", "Display processing messages in verbose mode."},
    {kAll, "--debug", "Display debug traces."},
    {kAll, "--cleanup", "Accepted; no run leaves files to clean up."},
    {kSim, "--suh true|false", "Closing notes on setup and hold simulation (default true)."},
    {kAll, "--wraplog log_file", "Append the messages to the log file."},
    {kAll, "--ub", "Accepted; buses are always written as buses."},
    {kAll, "<infile>", "Input file: a netlist JSON file."},
    {kAll, "<outfile>", "Output file name (default is '<infile>.v')"},
};

unsigned TypeOf(const std::string& name) {
    const char* n = name.c_str();
    if (UT_STR::ICompare(n, "simulation") == 0 || UT_STR::ICompare(n, "sim") == 0) return kSim;
    if (UT_STR::ICompare(n, "static") == 0 || UT_STR::ICompare(n, "sta") == 0) return kSta;
    if (UT_STR::ICompare(n, "equivalence") == 0 || UT_STR::ICompare(n, "ecn") == 0) return kEcn;
    return 0;
}

}  // namespace

std::vector<std::string> Nlw_TesselOptionHelp(const std::string& netlistType) {
    std::vector<std::string> lines;
    const unsigned type = TypeOf(netlistType);
    if (type == 0) return lines;
    lines.push_back("\n");
    for (const HelpLine& l : kLines) {
        if ((l.types & type) == 0) continue;
        // The explanation starts in column 24, or after three blanks when
        // the option is longer.
        std::string line = "   ";
        line += l.option;
        line += std::strlen(l.option) < 20 ? std::string(20 - std::strlen(l.option), ' ') : "   ";
        line += l.text;
        line += '\n';
        lines.push_back(line);
    }
    lines.push_back("\n");
    return lines;
}
