// Load benchmark: reads netlist JSON files into views and reports, per file,
// the time the load took and the size of the view it made.
//
// Usage: nlw_load_bench [--flatten] [--prep] [--top NAME] FILE...
//   --flatten  flatten the hierarchy while loading
//   --prep     also run the preparation pass (external property lists)
// Exit status 1 when a file does not load.
#include <chrono>
#include <cstdio>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Util.h"
#include "reader/Nlw_JsonReader.h"
#include "reader/Nlw_Prep.h"

namespace {

// Just enough of a writer for the preparation pass: cells the property
// table knows are taken as they are offered.
class BenchWriter : public Nlw_NetlistWriter {
public:
    HelpFunction GetHelp() override { return nullptr; }
    const char** GetReservedWords() override { return nullptr; }
    unsigned char IsEscaped(const char*) override { return 0; }
    const char* Escape(const char* name, unsigned char) override { return name; }
    const char* GetRangeString(Nlw_NlBus*) override { return ""; }
    const char* GetIndexesString(DARRAY_Util_INT32*) override { return ""; }
    void WriteDesign() override {}
    void WriteHeader(Nlw_Writer*) override {}
    unsigned char AddIfSimulatableProperty(Nlw_NlBlock*, Vdm_Property* p,
                                           Vdm_Property* list) override {
        list->CreatePropertyString(p->GetName(), p->GetString() ? p->GetString() : "");
        return 1;
    }
};

double Seconds(std::chrono::steady_clock::time_point since) {
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - since).count();
}

struct Counts {
    size_t macros = 0, leaves = 0, signals = 0, pins = 0;
};

Counts Count(const Nlw_NlView& view) {
    Counts c;
    c.macros = view.GetNumMacros();
    for (Nlw_NlBlock* m : view.GetMacros()) {
        c.signals += m->GetSignals().size();
        for (Nlw_NlBlock* child : m->GetChildren())
            if (!child->IsMacro()) {
                ++c.leaves;
                c.pins += child->GetPinCount();
            }
    }
    return c;
}

}  // namespace

int main(int argc, char** argv) {
    Nlw_ReadOptions options;
    bool prep = false;
    std::vector<const char*> files;
    for (int i = 1; i < argc; ++i) {
        if (!std::strcmp(argv[i], "--flatten")) {
            options.flatten = true;
        } else if (!std::strcmp(argv[i], "--prep")) {
            prep = true;
        } else if (!std::strcmp(argv[i], "--top") && i + 1 < argc) {
            options.top = argv[++i];
        } else if (argv[i][0] == '-') {
            std::fprintf(stderr, "usage: %s [--flatten] [--prep] [--top NAME] FILE...\n", argv[0]);
            return 2;
        } else {
            files.push_back(argv[i]);
        }
    }
    int status = 0;
    for (const char* file : files) {
        auto view = std::make_unique<Nlw_NlView>();
        std::unique_ptr<Nlw_Design> design;
        auto start = std::chrono::steady_clock::now();
        if (!Nlw_JsonReader::Load(file, options, *view, design)) {
            status = 1;
            continue;
        }
        double load = Seconds(start);
        double prepTime = 0;
        if (prep) {
            BenchWriter nlw;
            nlw.SetView(view.get());
            auto p0 = std::chrono::steady_clock::now();
            std::unique_ptr<Ldm_TypeLib> lib(Nlw_Prep::LoadInstallationData(nlw));
            Nlw_Prep::PrepareProperties(nlw);
            prepTime = Seconds(p0);
        }
        Counts c = Count(*view);
        std::printf("%s: load %.3f s", file, load);
        if (prep) std::printf(", prep %.3f s", prepTime);
        std::printf("; %zu leaves, %zu macros, %zu signals, %zu leaf pins\n", c.leaves, c.macros,
                    c.signals, c.pins);
        std::fflush(stdout);
    }
    return status;
}
