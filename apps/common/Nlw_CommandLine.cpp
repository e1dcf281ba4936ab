#include "Nlw_CommandLine.h"

#include <cctype>
#include <cstring>
#include <functional>

#include "port/UT.h"

namespace {

enum class Arg {
    None,      // a switch
    Value,     // one value, required
    Optional,  // one value when the next word is not an option
    Bool,      // true or false
    Tagged,    // one value, then optionally the word "tag" and a name
};

struct Option {
    const char* name;
    Arg arg;
    // Applies the option; value is empty for switches. Returns an error text
    // or "" when the value is acceptable.
    std::function<std::string(Nlw_CommandLine&, const std::string&)> apply;
};

// An option that can have no effect here: accepted with its one warning,
// which says why.
std::string Ignore(Nlw_CommandLine& cl, const char* name, const char* why) {
    cl.ignored.push_back(std::string("Option '") + name + "' has no effect: " + why + "\n");
    return "";
}

bool ParseBool(const std::string& v, bool& out) {
    if (UT_STR::ICompare(v.c_str(), "true") == 0) {
        out = true;
        return true;
    }
    if (UT_STR::ICompare(v.c_str(), "false") == 0) {
        out = false;
        return true;
    }
    return false;
}

#define FLAG(expr)                                \
    [](Nlw_CommandLine& cl, const std::string&) { \
        expr;                                     \
        return std::string();                     \
    }
#define TEXT(setter)                                \
    [](Nlw_CommandLine& cl, const std::string& v) { \
        cl.params.setter(v.c_str());                \
        return std::string();                       \
    }
#define BOOL(setter)                                                       \
    [](Nlw_CommandLine& cl, const std::string& v) {                        \
        bool b;                                                            \
        if (!ParseBool(v, b)) return std::string("expects true or false"); \
        cl.params.setter(b);                                               \
        return std::string();                                              \
    }
#define IGNORE(name, why) \
    [](Nlw_CommandLine& cl, const std::string&) { return Ignore(cl, name, why); }

// -fn and -r are opposites: the last one given wins.
std::string Flatten(Nlw_CommandLine& cl, bool flatten) {
    cl.params.SetFlatten(flatten);
    cl.params.SetRetainHierarchy(!flatten);
    return "";
}

// Options both programs share, under the names both spell alike.
std::vector<Option> CommonOptions() {
    return {
        {"-aka", Arg::None, FLAG(cl.params.SetWriteAka(true))},
        {"-fn", Arg::None,
         [](Nlw_CommandLine& cl, const std::string&) { return Flatten(cl, true); }},
        {"-gp", Arg::Value, TEXT(SetGlobalSetResetPort)},
        {"-ism", Arg::None, FLAG(cl.params.SetWriteInstantiatedTimcells(true))},
        {"-insert_chipwide", Arg::Bool, BOOL(SetInsert_chipwide)},
        {"-ne", Arg::None, FLAG(cl.params.SetWriteEscapedNames(false))},
        {"-pf", Arg::None, FLAG(cl.params.SetWritePinFile(true))},
        {"-sdf_path", Arg::Optional, TEXT(SetSdfPath)},
        {"-shm", Arg::None, FLAG(cl.params.SetWriteShm(true))},
        {"-ti", Arg::Value, TEXT(SetRootInstanceName)},
        {"-tm", Arg::Value, TEXT(SetTopModuleName)},
        {"-tp", Arg::Value, TEXT(SetGlobalTristatePort)},
        {"-ul", Arg::None, FLAG(cl.params.SetWriteUseLib(true))},
        {"-w", Arg::None, FLAG(cl.params.SetOutputFileMode(Port::Stream::Replace))},
        {"--ub", Arg::None,
         IGNORE("--ub",
                "buses are always written as buses here; the option is accepted so that older "
                "command lines keep working.")},
        // The host's timing options.
        {"-timing", Arg::Value,
         [](Nlw_CommandLine& cl, const std::string& v) {
             cl.timing.source = v;
             return std::string();
         }},
        {"-timing_nets", Arg::Value,
         [](Nlw_CommandLine& cl, const std::string& v) {
             cl.timing.nets = v;
             return Nlw_CheckTimingNets(v);
         }},
    };
}

std::vector<Option> Qdb2verOptions() {
    std::vector<Option> o = CommonOptions();
    std::vector<Option> own = {
        {"-10ps", Arg::None, FLAG(cl.params.SetWritePsTimePrecision(false))},
        {"-cd", Arg::None, FLAG(cl.params.SetWriteCellDefine(true))},
        {"-log", Arg::Value, TEXT(SetLogFileName)},
        {"-quiet", Arg::None, FLAG(cl.quiet = true)},
        {"-r", Arg::None,
         [](Nlw_CommandLine& cl, const std::string&) { return Flatten(cl, false); }},
        {"-tf", Arg::None, FLAG(cl.params.SetWriteTestFile(true))},
        {"-verbose", Arg::None, FLAG(cl.debug = true)},
    };
    o.insert(o.end(), own.begin(), own.end());
    return o;
}

std::string SetModeSim(Nlw_CommandLine& cl, const std::string&) {
    cl.params.SetSimMode(true);
    cl.params.SetStaMode(false);
    cl.params.SetEcnMode(false);
    return "";
}

std::vector<Option> TesselOptions() {
    std::vector<Option> o = CommonOptions();
    std::vector<Option> own = {
        {"-ecn", Arg::Value,
         [](Nlw_CommandLine& cl, const std::string& v) {
             cl.params.SetEcnMode(true);
             cl.params.SetSimMode(false);
             cl.params.SetStaMode(false);
             cl.params.SetEcnTool(v.c_str());
             if (UT_STR::ICompare(v.c_str(), "formality") != 0 &&
                 UT_STR::ICompare(v.c_str(), "conformal") != 0)
                 cl.ignored.push_back("Equivalence tool '" + v +
                                      "' is not known (formality, conformal): the assertion file "
                                      "is written in the conformal form.\n");
             return std::string();
         }},
        {"-sim", Arg::None, SetModeSim},
        {"-sta", Arg::None,
         [](Nlw_CommandLine& cl, const std::string&) {
             cl.params.SetStaMode(true);
             cl.params.SetSimMode(false);
             cl.params.SetEcnMode(false);
             return std::string();
         }},
        {"-ofmt", Arg::Value,
         [](Nlw_CommandLine&, const std::string& v) {
             return UT_STR::ICompare(v.c_str(), "verilog") == 0 ? std::string()
                                                                : std::string("expects verilog");
         }},
        {"-bx", Arg::Value,
         [](Nlw_CommandLine& cl, const std::string& v) {
             cl.bramDir = v;
             return std::string();
         }},
        {"-bd", Arg::Tagged,
         [](Nlw_CommandLine& cl, const std::string& v) {
             // The value arrives as "file" or "file\ntag".
             size_t cut = v.find('\n');
             cl.bramData.push_back(
                 {v.substr(0, cut), cut == std::string::npos ? "" : v.substr(cut + 1)});
             return std::string();
         }},
        {"-dir", Arg::Value, TEXT(SetOutputDir)},
        {"-intstyle", Arg::Value,
         [](Nlw_CommandLine& cl, const std::string& v) {
             if (v != "qde" && v != "qflow" && v != "silent")
                 return std::string("expects qde, qflow or silent");
             cl.params.SetIntStyle(v.c_str());
             cl.intStyle = v;
             return std::string();
         }},
        {"-insert_pp_buffers", Arg::Bool,
         [](Nlw_CommandLine& cl, const std::string& v) {
             bool b;
             if (!ParseBool(v, b)) return std::string("expects true or false");
             cl.ppBuffers = b;
             return std::string();
         }},
        {"-qdm", Arg::Value, TEXT(SetQdmFileName)},
        {"-mhf", Arg::None, FLAG(cl.params.SetMHFMode(true))},
        {"-module", Arg::None, FLAG(cl.module = true)},
        {"-qcf", Arg::Value,
         [](Nlw_CommandLine& cl, const std::string& v) {
             cl.qcfFile = v;
             return std::string();
         }},
        {"-s", Arg::Value,
         [](Nlw_CommandLine& cl, const std::string& v) {
             // "-s 5" and "-s -5" name the same grade.
             std::string speed = v[0] == '-' ? v.substr(1) : v;
             if (speed.empty()) return std::string("expects a speed grade");
             cl.params.SetSpeed(speed.c_str());
             return std::string();
         }},
        {"-funcells", Arg::None, FLAG(cl.params.SetFuncellMode(true))},
        {"-core", Arg::None, FLAG(cl.params.SetFuncellMode(true); cl.core = true)},
        {"-sdf_anno", Arg::Bool, BOOL(SetSdfAnnotate)},
        {"-tb", Arg::None, FLAG(cl.params.SetWriteTestFile(true))},
        {"-vcd", Arg::None, FLAG(cl.params.SetWriteVcd(true))},
        {"--10ps", Arg::None, FLAG(cl.params.SetWritePsTimePrecision(false))},
        {"--cd", Arg::None, FLAG(cl.params.SetWriteCellDefine(true))},
        {"--log", Arg::Value, TEXT(SetLogFileName)},
        {"--quiet", Arg::None, FLAG(cl.quiet = true)},
        {"--r", Arg::None,
         [](Nlw_CommandLine& cl, const std::string&) { return Flatten(cl, false); }},
        {"--verbose", Arg::None, FLAG(cl.debug = true)},
        {"--debug", Arg::None, FLAG(cl.debug = true)},
        {"--cleanup", Arg::None,
         IGNORE("--cleanup",
                "every file is written to a temporary file that is renamed into place or removed "
                "before the program ends, so no run leaves anything to clean up.")},
        {"--suh", Arg::Bool, BOOL(SetWriteSetupHoldNotes)},
        {"--wraplog", Arg::Value,
         [](Nlw_CommandLine& cl, const std::string& v) {
             cl.wrapLog = v;
             return std::string();
         }},
    };
    o.insert(o.end(), own.begin(), own.end());
    return o;
}

bool LooksLikeOption(const std::string& w) {
    return w.size() > 1 && w[0] == '-';
}

// The extension of the file name part, in lower case; "" when none.
std::string FileExtension(const std::string& path) {
    size_t slash = path.rfind('/');
    size_t dot = path.rfind('.');
    if (dot == std::string::npos || (slash != std::string::npos && dot < slash)) return "";
    std::string ext = path.substr(dot + 1);
    for (char& c : ext) c = static_cast<char>(tolower(static_cast<unsigned char>(c)));
    return ext;
}

}  // namespace

Nlw_CommandLine Nlw_ParseCommandLine(Nlw_Program program, const std::vector<std::string>& args) {
    Nlw_CommandLine cl;
    const std::vector<Option> options =
        program == Nlw_Program::Qdb2ver ? Qdb2verOptions() : TesselOptions();
    std::vector<std::string> files;
    for (size_t i = 0; i < args.size() && cl.error.empty(); ++i) {
        const std::string& w = args[i];
        if (w == "-h" || w == "-help" || w == "--help") {
            cl.help = true;
            if (i + 1 < args.size() && !LooksLikeOption(args[i + 1])) cl.helpTopic = args[++i];
            continue;
        }
        if (w == "--version" || w == "-version") {
            cl.version = true;
            continue;
        }
        if (!LooksLikeOption(w)) {
            files.push_back(w);
            continue;
        }
        const Option* opt = nullptr;
        for (const Option& o : options)
            if (w == o.name) opt = &o;
        if (!opt) {
            cl.error = "Unknown option '" + w + "'.";
            break;
        }
        std::string value;
        switch (opt->arg) {
            case Arg::None:
                break;
            case Arg::Value:
            case Arg::Bool:
            case Arg::Tagged:
                if (i + 1 >= args.size()) {
                    cl.error = "Option '" + w + "' needs a value.";
                    continue;
                }
                value = args[++i];
                if (value.empty()) {
                    cl.error = "Option '" + w + "' needs a value.";
                    continue;
                }
                if (opt->arg == Arg::Tagged && i + 2 < args.size() && args[i + 1] == "tag")
                    value += "\n" + args[i + 2], i += 2;
                break;
            case Arg::Optional:
                if (i + 1 < args.size() && !LooksLikeOption(args[i + 1])) {
                    // The optional value is taken only when a file name still
                    // follows it, so that "-sdf_path in.json" reads in.json as
                    // the input file.
                    size_t rest = 0;
                    for (size_t j = i + 2; j < args.size(); ++j)
                        if (!LooksLikeOption(args[j])) ++rest;
                    if (rest > 0 || !files.empty()) value = args[++i];
                }
                break;
        }
        if (opt->arg == Arg::Optional && value.empty()) continue;
        std::string problem = opt->apply(cl, value);
        if (!problem.empty()) cl.error = "Option '" + w + "' " + problem + ", not '" + value + "'.";
    }
    if (!cl.error.empty() || cl.help || cl.version) return cl;
    if (cl.intStyle == "silent") cl.quiet = true;
    // A module for instantiation in a larger design brings no chipwide
    // module and no test fixture of its own.
    if (cl.module) {
        cl.params.SetInsert_chipwide(false);
        if (cl.params.GetWriteTestFile()) {
            cl.params.SetWriteTestFile(false);
            Ignore(cl, "-tb",
                   "with -module the netlist is a module for a larger design, which brings its "
                   "own test bench.");
        }
    }
    if (files.empty()) {
        cl.error = "No input file name given.";
        return cl;
    }
    if (files.size() > 2) {
        cl.error = "Unexpected argument '" + files[2] + "'.";
        return cl;
    }
    cl.params.SetInputFileName(files[0].c_str());
    cl.params.SetInputFileType(FileExtension(files[0]).c_str());
    std::string out = files.size() > 1 ? Nlw_GivenOutputName(files[1])
                                       : Nlw_DefaultOutputName(files[0], cl.params.GetOutputDir());
    cl.params.SetOutputFileName(out.c_str());
    cl.params.SetOutputFileNamed(files.size() > 1);
    return cl;
}

std::string Nlw_DefaultOutputName(const std::string& input, const char* dir) {
    if (dir && *dir) {
        std::string d = dir;
        if (d.back() != '/') d += '/';
        return d + UT_PATH::GetBase(input.c_str()) + ".v";
    }
    return UT_PATH::GetRoot(input.c_str()) + ".v";
}

std::string Nlw_GivenOutputName(const std::string& name) {
    std::string ext = FileExtension(name);
    return ext == "v" ? name : name + ".v";
}
