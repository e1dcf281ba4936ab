#include "Nlw_AppTiming.h"

#include <sys/stat.h>

#include <cstring>
#include <string>
#include <unordered_set>
#include <vector>

#include "Nlw_HostSteps.h"
#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Params.h"
#include "framework/Nlw_Timing.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "port/UT.h"
#include "reader/Nlw_Liberty.h"
#include "reader/Nlw_NominalTiming.h"
#include "reader/Nlw_SdfReader.h"

namespace {

bool SameFile(const std::string& a, const std::string& b) {
    struct stat sa, sb;
    return stat(a.c_str(), &sa) == 0 && stat(b.c_str(), &sb) == 0 && sa.st_dev == sb.st_dev &&
           sa.st_ino == sb.st_ino;
}

// The timing files the writer will write, named as its drivers name them.
std::vector<std::string> OutputTimingFiles(const Nlw_Params& params, const Nlw_NlView& view) {
    const std::string out = UT_STR::OrEmpty(params.GetOutputFileName());
    const char* sdfPath = params.GetSdfPath();
    std::vector<std::string> names;
    if (params.GetMHFMode()) {
        std::string prefix;
        if (sdfPath) {
            prefix = sdfPath;
            if (!prefix.empty()) prefix += '/';
        } else {
            Port::FileName fileName(out.c_str());
            prefix = UT_STR::OrEmpty(fileName.GetPath());
        }
        const UT_DARRAY<Nlw_NlBlock*>& macros = view.GetMacros();
        for (size_t i = 0; i < macros.GetCount(); ++i)
            if (macros[i]) names.push_back(prefix + macros[i]->GetFileBaseName() + ".sdf");
    } else if (sdfPath) {
        const std::string base = UT_PATH::GetBase(UT_PATH::InternalPath(out.c_str()).c_str());
        names.push_back(*sdfPath ? std::string(sdfPath) + '/' + base + ".sdf" : base + ".sdf");
    } else {
        names.push_back(UT_PATH::GetRoot(out.c_str()) + ".sdf");
    }
    return names;
}

// Simulators split an SDF instance path at every "." even when the file
// escapes it (Icarus Verilog then finds no instance "u1" for a cell that a
// flattening synthesis named "u1.r"). Cells of an annotated design are
// therefore renamed "u1_r" (made unique among their siblings), the original
// name kept as the also-known-as name, so that the netlist and its timing
// file name them alike.
void RenameDottedInstances(Nlw_NlView& view) {
    const UT_DARRAY<Nlw_NlBlock*>& macros = view.GetMacros();
    for (size_t i = 0; i < macros.GetCount(); ++i) {
        Nlw_NlBlock* macro = macros[i];
        if (macro == nullptr) continue;
        std::unordered_set<std::string> taken;
        bool dotted = false;
        for (Nlw_NlBlock* child : macro->GetChildren()) {
            taken.insert(child->GetWritableName());
            dotted = dotted || std::strchr(child->GetWritableName(), '.') != nullptr;
        }
        if (!dotted) continue;
        for (Nlw_NlBlock* child : macro->GetChildren()) {
            const char* old = child->GetWritableName();
            if (std::strchr(old, '.') == nullptr) continue;
            std::string name = old;
            for (char& c : name)
                if (c == '.') c = '_';
            std::string unique = name;
            for (int k = 1; taken.count(unique); ++k) unique = name + '_' + std::to_string(k);
            taken.insert(unique);
            if (child->GetAka() == nullptr) child->SetAka(old);
            child->SetWritableName(unique.c_str());
        }
    }
}

}  // namespace

std::string Nlw_CheckTimingNets(const std::string& value) {
    if (value == "interconnect" || value == "port" || value == "iopath") return "";
    return "expects interconnect, port or iopath";
}

bool Nlw_AttachTiming(const Nlw_TimingOptions& options, Nlw_Params& params, Nlw_NlView& view,
                      Nlw_NetlistWriter& writer, std::unique_ptr<Nlw_Timing>& timing) {
    if (options.source.empty()) return true;
    timing.reset(new Nlw_Timing);
    if (options.nets == "port") timing->netMode = Nlw_Timing::NetMode::Port;
    if (options.nets == "iopath") timing->netMode = Nlw_Timing::NetMode::IoPath;

    if (options.source == "nominal") {
        const char* lib = Port_Env::GetDataFileName("nlw_cells.lib", 0);
        if (lib == nullptr) {
            NLW_MSG().issueError(
                "The installation has no timing of its cell library (data/nlw_cells.lib); "
                "-timing nominal needs it.\n");
            return false;
        }
        Nlw_Liberty library;
        if (!library.Load(lib)) return false;
        NLW_MSG().issueStatus("Taking nominal delays from '%s' ...\n", lib);
        Nlw_NominalTiming::Make(library, view, *timing);
        Nlw_ApplySpeedGrade(writer, *timing);
    } else {
        for (const std::string& name : OutputTimingFiles(params, view)) {
            if (SameFile(name, options.source)) {
                NLW_MSG().issueError(
                    "The timing file '%s' would be written over the input timing file '%s'; "
                    "give the netlist another name or the timing files another directory "
                    "(-sdf_path).\n",
                    name.c_str(), options.source.c_str());
                return false;
            }
        }
        NLW_MSG().issueStatus("Reading timing file '%s' ...\n", options.source.c_str());
        if (!Nlw_SdfReader::Load(options.source.c_str(), view, *timing)) return false;
    }

    RenameDottedInstances(view);
    params.SetInputFileType("qda");
    params.SetWriteSdfFile(true);
    writer.SetTiming(timing.get());
    // The modules that read a timing file: each module of a netlist of one
    // file per module reads its own; a netlist of one file reads the
    // design's one file in its top module.
    const UT_DARRAY<Nlw_NlBlock*>& macros = view.GetMacros();
    for (size_t i = 0; i < macros.GetCount(); ++i) {
        Nlw_NlBlock* macro = macros[i];
        if (macro && (params.GetMHFMode() || macro->GetParent() == nullptr))
            macro->AddProperty(Vdm_Property::NewBool("NLW_SDFANNOTATED", true));
    }
    return true;
}

void Nlw_PrintTimingHelp() {
    static const char* const kLines[] = {
        "   -timing file.sdf|nominal  Delays for the netlist: the SDF file place and route\n",
        "                       wrote for the design, or nominal delays of the shipped cell\n",
        "                       library. Writes the timing file <outfile>.sdf.\n",
        "   -timing_nets interconnect|port|iopath  How net delays are written: INTERCONNECT\n",
        "                       entries (default), PORT delays, or added to the paths of the\n",
        "                       driven cells (for Icarus Verilog before release 13).\n",
    };
    Port_MsgManData msg = Port_MsgManData::createObject("NetListWriters");
    for (const char* line : kLines) msg.issueStatus("%s", line);
}
