// Usage texts of the two host programs.
#include "Nlw_Verilog.h"
#include "port/Port.h"
#include "port/UT.h"

// The missing blanks before some options belong to the texts.
const char* const Nlw_Verilog::kQdb2verSynopsis =
    "qdb2ver [-10ps] [-aka] [-cd] [-fn] [-gp <port_name>] [-ism] [-log <log_file>] [-ne] [-pf] "
    "[-quiet] [-r] [-sdf_path [<path>]] [-shm] [-tf] [-ti <top_instance_name>] "
    "[-tm <top_module_name>] [-tp <port_name>] [-ul] [-verbose] [-w] [--ub] <infile> "
    "[<outfile[.v]>]";

const char* const Nlw_Verilog::kTesselSynopsis =
    "tessel [-ecn <tool_name>] [-sim] [-sta] [-ofmt verilog] [-aka] [-bx <BRAM_output_dir>] "
    "{-bd <BRAM_data_file>[tag <tagName>]} [-dir <dir_name>] [-fn] [-gp <port_name>] "
    "[-intstyle qde|qflow|silent] [-ism] [-insert_chipwide <true_or_false>] "
    "[-insert_pp_buffers <true_or_false>][-ne] [-qdm <qdm_file>] [-mhf] [-module] "
    "[-qcf <qcf_file>] [-pf] [-s <speed>][-sdf_anno <true_or_false>] [-sdf_path [<path>]] "
    "[-shm] [-tb] [-ti <top_instance_name>][-tm <top_module_name>] [-tp <port_name>] [-ul] "
    "[-vcd] [-w] [--10ps] [--cd] [--log <log_file>][--quiet] [--r] [--verbose] [--debug] "
    "[--cleanup] [--suh <true_or_false>] [--wraplog <log_file>] [--ub] <infile> "
    "[<outfile[.v]>]";

namespace {

// Every line of a help text is one status message.
void IssueLines(const char* const* lines) {
    for (; *lines != nullptr; ++lines) NLW_MSG().issueStatus("%s", *lines);
}

const char* const kQdb2verHelp[] = {
    "\n",
    "   -10ps               Set time precision to be 10 ps (the default is 1 ps).\n",
    "   -aka                Write Also-Know-As names as comments.\n",
    "   -cd                 Write `celldefine/`endcelldefine (Cadence only).\n",
    "   -gp port_name       Bring out global reset/set net as port.\n",
    "   -insert_chipwide true|false   insert chipwide module into netlist\n",
    "   -fn                 Flatten verilog netlist.\n",
    "   -ism                Include timcell modules in verilog file.\n",
    "   -log log_file       Name the log file.\n",
    "   -ne                 Do not escape names.\n",
    "   -pf                 Generate pin file (Cadence only).\n",
    "   -quiet              Reduce the screen output.\n",
    "   -r                  Retain hierarchy in verilog file.\n",
    "   -sdf_path [path]    Full path to sdf file used in $sdf_annotate.\n",
    "   -shm                Write $shm* statements in testfixture (Cadence only).\n",
    "   -tf                 Generate testfixture file.\n",
    "   -ti top_inst_name   Name top-level testbench instance as desired.\n",
    "   -tm top_module_name Name top-level module as desired.\n",
    "   -tp port_name       Bring out global tristate net as port.\n",
    "   -ul                 Include `uselib in verilog file (Cadence only).\n",
    "   -verbose            Display processing messages in verbose mode.\n",
    "   -w                  Overwrite the output file.\n",
    "   <infile>            Input file: '.qdb', or '.qda'. (the '.qdb' extension\n",
    "                       must be specified if the input is an '.qdb' file.)\n",
    "   <outfile>           Output file name (default is '<infile>.v')\n\n",
    "qdb2ver translates an QDB file (QDBBUILD output) or an QDA file (QDBANNO output) into an "
    "Verilog netlist which is defined in terms of Vornix Simulation Primitives (Timcells). The "
    "netlist should be used with supported simulation, static timing analysis and formal "
    "verification software tools. Non-simulatable components (such as boundary scan) are "
    "omitted. When the input is QDA, a SDF (Standard Delay Format) file containing timing "
    "information in accordance with Vornix Timcells specification will be generated.\n\n",
    nullptr,
};

const char* const kTesselHelp[] = {
    "\n",
    "Use \"tessel -h <netlist_type>\" to display netlist-specific options. \n",
    "Valid netlist_types are: \n\n",
    "    equivalence or ecn (display options for equivalence checking netlist)\n",
    "    simulation  or sim (display options for simulation netlist)\n",
    "    static      or sta (display options for static timing analysis netlist)\n\n",
    "tessel extracts design data from the input file and generates netlist compatible with "
    "supported equivalence checking, simulation or static timing analysis tools.\n\n",
    nullptr,
};

}  // namespace

// The stand-alone translator gets its option list; every other program the
// overview, which ends the run.
Nlw_NetlistWriter::HelpFunction Nlw_Verilog::GetHelp() {
    if (UT_STR::_ICompare(GetApplicationName(), "qdb2ver") == 0) return &Nlw_Verilog::Help;
    return &Nlw_Verilog::TesselHelp;
}

void Nlw_Verilog::Help() {
    IssueLines(kQdb2verHelp);
}

void Nlw_Verilog::TesselHelp() {
    IssueLines(kTesselHelp);
    Port_MsgDispatcher::exit(0);
}
