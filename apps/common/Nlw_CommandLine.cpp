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
};

struct Option {
    const char* name;
    Arg arg;
    // Applies the option; value is empty for switches. Returns an error text
    // or "" when the value is acceptable.
    std::function<std::string(Nlw_CommandLine&, const std::string&)> apply;
};

// An option whose data this host does not have: accepted with a warning.
std::string Ignore(Nlw_CommandLine& cl, const std::string&, const char* name) {
    cl.ignored.push_back(name);
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
#define IGNORE(name) [](Nlw_CommandLine& cl, const std::string& v) { return Ignore(cl, v, name); }

// Options both programs share, under the names both spell alike.
std::vector<Option> CommonOptions() {
    return {
        {"-aka", Arg::None, FLAG(cl.params.SetWriteAka(true))},
        {"-fn", Arg::None, FLAG(cl.params.SetFlatten(true))},
        {"-gp", Arg::Value, IGNORE("-gp")},
        {"-ism", Arg::None, FLAG(cl.params.SetWriteInstantiatedTimcells(true))},
        {"-insert_chipwide", Arg::Bool, BOOL(SetInsert_chipwide)},
        {"-ne", Arg::None, FLAG(cl.params.SetWriteEscapedNames(false))},
        {"-pf", Arg::None, FLAG(cl.params.SetWritePinFile(true))},
        {"-sdf_path", Arg::Optional, TEXT(SetSdfPath)},
        {"-shm", Arg::None, FLAG(cl.params.SetWriteShm(true))},
        {"-ti", Arg::Value, TEXT(SetRootInstanceName)},
        {"-tm", Arg::Value, TEXT(SetTopModuleName)},
        {"-tp", Arg::Value, IGNORE("-tp")},
        {"-ul", Arg::None, FLAG(cl.params.SetWriteUseLib(true))},
        {"-w", Arg::None, FLAG(cl.params.SetOutputFileMode(Port::Stream::Replace))},
        {"--ub", Arg::None, IGNORE("--ub")},
    };
}

std::vector<Option> Qdb2verOptions() {
    std::vector<Option> o = CommonOptions();
    std::vector<Option> own = {
        {"-10ps", Arg::None, FLAG(cl.params.SetWritePsTimePrecision(false))},
        {"-cd", Arg::None, FLAG(cl.params.SetWriteCellDefine(true))},
        {"-log", Arg::Value, TEXT(SetLogFileName)},
        {"-quiet", Arg::None, FLAG(cl.quiet = true)},
        {"-r", Arg::None, FLAG(cl.params.SetRetainHierarchy(true))},
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
        {"-bx", Arg::Value, IGNORE("-bx")},
        {"-bd", Arg::Value, IGNORE("-bd")},
        {"-dir", Arg::Value, TEXT(SetOutputDir)},
        {"-intstyle", Arg::Value,
         [](Nlw_CommandLine& cl, const std::string& v) {
             if (v != "qde" && v != "qflow" && v != "silent")
                 return std::string("expects qde, qflow or silent");
             cl.params.SetIntStyle(v.c_str());
             if (v == "silent") cl.quiet = true;
             return std::string();
         }},
        {"-insert_pp_buffers", Arg::Bool,
         [](Nlw_CommandLine& cl, const std::string& v) {
             bool b;
             if (!ParseBool(v, b)) return std::string("expects true or false");
             return Ignore(cl, v, "-insert_pp_buffers");
         }},
        {"-qdm", Arg::Value, TEXT(SetQdmFileName)},
        {"-mhf", Arg::None, FLAG(cl.params.SetMHFMode(true))},
        {"-module", Arg::None, IGNORE("-module")},
        {"-qcf", Arg::Value, IGNORE("-qcf")},
        {"-s", Arg::Value, IGNORE("-s")},
        {"-sdf_anno", Arg::Bool, BOOL(SetSdfAnnotate)},
        {"-tb", Arg::None, FLAG(cl.params.SetWriteTestFile(true))},
        {"-vcd", Arg::None, FLAG(cl.params.SetWriteVcd(true))},
        {"--10ps", Arg::None, FLAG(cl.params.SetWritePsTimePrecision(false))},
        {"--cd", Arg::None, FLAG(cl.params.SetWriteCellDefine(true))},
        {"--log", Arg::Value, TEXT(SetLogFileName)},
        {"--quiet", Arg::None, FLAG(cl.quiet = true)},
        {"--r", Arg::None, FLAG(cl.params.SetRetainHierarchy(true))},
        {"--verbose", Arg::None, FLAG(cl.debug = true)},
        {"--debug", Arg::None, FLAG(cl.debug = true)},
        {"--cleanup", Arg::None, IGNORE("--cleanup")},
        {"--suh", Arg::Bool,
         [](Nlw_CommandLine& cl, const std::string& v) {
             bool b;
             if (!ParseBool(v, b)) return std::string("expects true or false");
             return Ignore(cl, v, "--suh");
         }},
        {"--wraplog", Arg::Value, IGNORE("--wraplog")},
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
                if (i + 1 >= args.size()) {
                    cl.error = "Option '" + w + "' needs a value.";
                    continue;
                }
                value = args[++i];
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
