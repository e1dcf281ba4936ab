#include "Nlw_App.h"

#include <malloc.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <memory>
#include <new>
#include <string>
#include <vector>

#include "Nlw_HostSteps.h"
#include "Nlw_MessageStyle.h"
#include "Nlw_RunFiles.h"
#include "Nlw_Verilog.h"
#include "framework/Nlw_Timing.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_NlBuilder.h"
#include "port/Port.h"
#include "port/UT.h"
#include "reader/Nlw_DesignMapReader.h"
#include "reader/Nlw_JsonReader.h"
#include "reader/Nlw_Prep.h"

namespace {

const char* ProgramName(Nlw_Program program) {
    return program == Nlw_Program::Qdb2ver ? "qdb2ver" : "tessel";
}

// The command as the file headers show it: words separated by blanks, a word
// holding a blank in double quotes.
std::string CommandText(Nlw_Program program, const std::vector<std::string>& args) {
    std::string text = ProgramName(program);
    for (const std::string& a : args) {
        text += ' ';
        if (a.find_first_of(" \t") != std::string::npos)
            text += '"' + a + '"';
        else
            text += a;
    }
    return text;
}

int UsageError(Nlw_Program program, const std::string& problem) {
    Port_MsgManData msg = Port_MsgManData::createObject(ProgramName(program));
    msg.issueError("%s\n", problem.c_str());
    std::fprintf(stderr, "Usage: %s\n",
                 program == Nlw_Program::Qdb2ver ? Nlw_Verilog::kQdb2verSynopsis
                                                 : Nlw_Verilog::kTesselSynopsis);
    return 2;
}

// The input file as given, or with ".json" when it has no extension and
// only that file exists.
std::string ResolveInput(const std::string& name) {
    if (Port::File::exist(name.c_str())) return name;
    bool hasExtension = UT_PATH::GetRoot(name.c_str()) != name;
    if (!hasExtension && Port::File::exist((name + ".json").c_str())) return name + ".json";
    return name;
}

// The names -tm and -ti give are written as they stand: each must be one
// Verilog identifier once escaped, and the top module may not take the name
// of the device's chipwide module that the netlist holds beside it.
std::string CheckGivenNames(const Nlw_Params& params) {
    const std::pair<const char*, const char*> given[] = {{"-tm", params.GetTopModuleName()},
                                                         {"-ti", params.GetRootInstanceName()}};
    for (const auto& g : given) {
        if (!g.second) continue;
        if (!*g.second) return std::string("Option ") + g.first + " needs a non-empty name.";
        for (const char* p = g.second; *p; ++p) {
            const unsigned char c = static_cast<unsigned char>(*p);
            if (c <= ' ' || c == 0x7f || c == '`')
                return std::string("Option ") + g.first + " '" + g.second +
                       "': a name cannot hold blanks, control characters or backticks.";
        }
    }
    if (params.GetTopModuleName() && std::string(params.GetTopModuleName()) == "chipwide")
        return "Option -tm 'chipwide': that is the name of the device's chipwide module.";
    return "";
}

// Traces how long each stage of the run took (debug channel).
class StageClock {
public:
    void Trace(const char* stage) {
        auto now = std::chrono::steady_clock::now();
        Port_MsgManData::debugStub("%s took %.3f s\n", stage,
                                   std::chrono::duration<double>(now - last_).count());
        last_ = now;
    }

private:
    std::chrono::steady_clock::time_point last_ = std::chrono::steady_clock::now();
};

// The design model of the last run. It is deliberately not freed when the
// run ends: releasing a model of a million blocks object by object takes
// longer than the operating system needs to reclaim the whole process. The
// pointer keeps it reachable for leak checkers; a later run in the same
// process frees the previous model first.
std::unique_ptr<Nlw_NlView>& KeptView() {
    static auto* kept = new std::unique_ptr<Nlw_NlView>();
    return *kept;
}

// The options that change the model before it is written. False when the
// design cannot take them (the message is issued).
bool ApplyModelOptions(const Nlw_CommandLine& cl, Nlw_NlView& view) {
    const Nlw_Params& params = cl.params;
    if (params.GetGlobalSetResetPort() &&
        !Nlw_AddGlobalPort(view, params.GetGlobalSetResetPort(), true))
        return false;
    if (params.GetGlobalTristatePort() &&
        !Nlw_AddGlobalPort(view, params.GetGlobalTristatePort(), false))
        return false;
    if (cl.ppBuffers) Nlw_InsertPathPulseBuffers(view);
    if (const char* speed = params.GetSpeed()) {
        // The part name reads device-package-speed; -s replaces the speed.
        const char* part = view.GetPartName();
        if (part == nullptr) {
            Port_MsgManData::createObject("NetListWriters")
                .issueWarning(
                    "Option '-s': the design names no part, so the pin map has no speed grade; "
                    "speed grade %s is used for timing only.\n",
                    speed);
        } else {
            std::string name = part;
            const size_t first = name.find('-');
            const size_t second =
                first == std::string::npos ? std::string::npos : name.find('-', first + 1);
            if (first == std::string::npos)
                name += "--";
            else if (second == std::string::npos)
                name += "-";
            else
                name.erase(second + 1);
            name += speed;
            Nlw_NlBuilder(&view).SetDevice(name.substr(0, name.find('-')).c_str(), name.c_str());
        }
    }
    return true;
}

int RunProgram(Nlw_Program program, int argc, const char* const* argv) {
    std::vector<std::string> args;
    for (int i = 1; i < argc; ++i) args.emplace_back(argv[i]);
    Nlw_CommandLine cl = Nlw_ParseCommandLine(program, args);

    if (cl.version && cl.error.empty()) {
        std::printf("%s (nlw-verilog) %s\n", ProgramName(program), NLW_VERSION);
        return 0;
    }
    if (cl.help) {
        // "tessel -h <netlist_type>" asks for the options of that netlist
        // type: the option list; without a known type tessel prints its
        // overview (which ends the program).
        static const char* const kNetlistTypes[] = {"equivalence", "ecn",    "simulation",
                                                    "sim",         "static", "sta"};
        bool known = false;
        for (const char* type : kNetlistTypes)
            if (UT_STR::ICompare(cl.helpTopic.c_str(), type) == 0) known = true;
        if (program == Nlw_Program::Tessel && known) {
            for (const std::string& line : Nlw_TesselOptionHelp(cl.helpTopic))
                Port_MsgManData::createObject("NetListWriters").issueStatus("%s", line.c_str());
            Nlw_PrintTimingHelp();
            return 0;
        }
        Nlw_Verilog help = program == Nlw_Program::Qdb2ver ? Nlw_Verilog() : Nlw_Verilog("tessel");
        help.GetHelp()();
        Nlw_PrintTimingHelp();
        return 0;
    }
    if (!cl.error.empty()) return UsageError(program, cl.error);
    const std::string nameProblem = CheckGivenNames(cl.params);
    if (!nameProblem.empty()) return UsageError(program, nameProblem);

    Port_MsgManager& messages = Port_MsgManager::Instance();
    messages.SetQuiet(cl.quiet);
    messages.SetDebug(cl.debug);
    Port_MsgManData msg = Port_MsgManData::createObject(ProgramName(program));
    Nlw_Params& params = cl.params;
    std::string input = ResolveInput(params.GetInputFileName());
    params.SetInputFileName(input.c_str());
    for (const Nlw_CommandLine::BramData& bd : cl.bramData)
        params.AddInputFile("block RAM data", bd.file.c_str());
    params.AddInputFile("constraints", cl.qcfFile.c_str());
    if (!Nlw_CheckRunFiles(params, cl.wrapLog.c_str())) return 2;
    if (params.GetLogFileName() && !messages.OpenLog(params.GetLogFileName())) {
        msg.issueError("Cannot open log file '%s'.\n", params.GetLogFileName());
        return 2;
    }
    Nlw_MessageStyle style(cl.intStyle, cl.debug);
    if (!cl.wrapLog.empty() && !style.OpenWrapLog(cl.wrapLog.c_str())) {
        msg.issueError("Cannot open log file '%s'.\n", cl.wrapLog.c_str());
        return 2;
    }
    for (const std::string& warning : cl.ignored) msg.issueWarning("%s", warning.c_str());

    // The folders of the output files (-dir) and of the timing files
    // (-sdf_path, when timing is written) are made when missing.
    for (const char* dir :
         {params.GetOutputDir(), cl.timing.source.empty() ? nullptr : params.GetSdfPath()}) {
        if (dir == nullptr || *dir == '\0') continue;
        std::error_code ec;
        std::filesystem::create_directories(dir, ec);
        if (ec) {
            msg.issueError("Cannot make the output directory '%s': %s.\n", dir,
                           ec.message().c_str());
            return 2;
        }
    }
    params.SetCommandLine(CommandText(program, args).c_str());
    const char* vornix = Port_Env::GetEnv("VORNIX");
    const Port::PathList& roots = Port::VornixPath::GetInstance();
    params.SetVornix(vornix ? vornix : roots.size() > 0 ? roots[0] : "");

    KeptView().reset(new Nlw_NlView);
    Nlw_NlView& view = *KeptView();
    std::unique_ptr<Nlw_Design> design;
    Nlw_ReadOptions readOptions;
    readOptions.flatten = params.GetFlatten();
    msg.issueStatus("Reading design file '%s' ...\n", input.c_str());
    StageClock clock;
    if (!Nlw_JsonReader::Load(input.c_str(), readOptions, view, design)) return 2;
    clock.Trace("Reading the design");
    // The design map names modules as the design file does (before -tm);
    // it is checked before anything is written, so a bad one leaves no
    // files behind.
    std::vector<AnnoVacuum> designMap;
    if (params.GetQdmFileName() &&
        !Nlw_DesignMapReader::Load(params.GetQdmFileName(), view, designMap))
        return 2;
    if (params.GetTopModuleName() && view.GetRootMacro())
        view.GetRootMacro()->GetType()->SetName(view.Intern(params.GetTopModuleName()));
    if (!ApplyModelOptions(cl, view)) return 2;

    Nlw_Verilog writer = program == Nlw_Program::Qdb2ver ? Nlw_Verilog() : Nlw_Verilog("tessel");
    writer.SetParams(&params);
    writer.SetView(&view);
    writer.SetDesign(design.get());
    writer.SetIsVornixCore(cl.core);
    writer.GetAnnoVacuums() = std::move(designMap);
    std::unique_ptr<Ldm_TypeLib> typeLib(Nlw_Prep::LoadInstallationData(writer));
    writer.SetTypeLib(typeLib.get());
    Nlw_Prep::PrepareProperties(writer);
    clock.Trace("Preparing the properties");
    if (!cl.bramData.empty() && !Nlw_LoadBlockRamData(writer, cl.bramData)) return 2;
    if (!cl.qcfFile.empty() && !Nlw_CheckQcfFile(view, cl.qcfFile.c_str())) return 2;
    std::unique_ptr<Nlw_Timing> timing;
    if (!Nlw_AttachTiming(cl.timing, params, view, writer, timing)) return 2;
    if (timing) clock.Trace("Reading the timing");
    writer.WriteDesign();
    if (!cl.bramDir.empty()) Nlw_WriteBlockRamFiles(writer, cl.bramDir.c_str());
    clock.Trace("Writing");

    int errors =
        messages.GetCount(Port_MsgLevel::Error) + messages.GetCount(Port_MsgLevel::Internal);
    messages.CloseLog();
    return errors > 0 ? 1 : 0;
}

}  // namespace

int Nlw_RunProgram(Nlw_Program program, int argc, const char* const* argv) {
#if defined(__GLIBC__) && defined(M_ARENA_MAX)
    // One heap for every thread of the run. A second heap spares the two
    // threads that read modules some waiting on each other, but what the
    // reading thread frees stays in its heap, and the peak of a run then
    // depends on which thread happens to allocate what (1.44 to 1.59 GiB on
    // the same 1M-cell design, against a steady 1.41 GiB with one heap).
    mallopt(M_ARENA_MAX, 1);
#endif
    // Memory runs out on a design too large for the machine: said as such,
    // and no file of the run is left behind (the open run removes its
    // temporaries as it unwinds).
    try {
        return RunProgram(program, argc, argv);
    } catch (const std::bad_alloc&) {
        Port_MsgManData::createObject(ProgramName(program))
            .issueError("Out of memory: the design does not fit in the memory of this machine.\n");
        Port_MsgManager::Instance().CloseLog();
        return 2;
    }
}
