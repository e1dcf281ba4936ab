// Library modules copied from the installation: the chipwide module of the
// global signals and the source models of the instantiated cells, with the
// two device-data maps that govern the models.
#include <string>
#include <unordered_set>

#include "Nlw_VerilogWriter.h"
#include "framework/Nlw_Params.h"
#include "model/Nlw_Nl.h"
#include "port/PM.h"
#include "port/Port.h"
#include "port/UT.h"

void Nlw_VerilogWriter::InitBigEndingTimcellMap() {
    InitNameMap(bigEndingTimcellMap_, "BigEndingTimcell", false);
}

void Nlw_VerilogWriter::InitRecursiveInclusionMap() {
    InitNameMap(recursiveInclusionMap_, "RecursiveInclusion", true);
}

void Nlw_VerilogWriter::InitNameMap(NameMap& map, const char* key, bool trace) {
    PM_DEVKEY devkey("vdm2ver.acd", GetNlw()->GetPmPic(), 0, 1, 1);
    for (int index = 0;; ++index) {
        const char* item = devkey.getstringbykey(key, ",", index, nullptr, 0);
        if (!item) break;
        // "KEY" alone stands for itself; "KEY:A:B" gives (KEY, A), (KEY, B).
        std::vector<Port::String> pieces = Port::String::Split(item, ":", true, "'", "'");
        if (pieces.empty()) continue;
        if (pieces.size() == 1) {
            map.emplace(Port::String(item), Port::String(item));
            continue;
        }
        for (size_t i = 1; i < pieces.size(); ++i) {
            if (trace)
                Port_MsgManData::debugStub("Adding (%s:%s) to the recursive inclusion map.\n",
                                           pieces[0].c_str(), pieces[i].c_str());
            map.emplace(pieces[0], pieces[i]);
        }
    }
}

void Nlw_VerilogWriter::BuildTypeIndexes() {
    // Walking each map in its order keeps, per type name, the order in which
    // a walk over the whole map would meet the entries.
    bigEndingByType_.clear();
    for (const auto& entry : bigEndingTimcellMap_) {
        const bool all = Nlw_ICaseEqual()(entry.first, entry.second);
        bigEndingByType_[entry.first.str()].push_back(BusOrderRule{all, entry.second});
    }
    inclusionByType_.clear();
    for (const auto& entry : recursiveInclusionMap_)
        inclusionByType_[entry.first.str()].push_back(entry.second);
}

void Nlw_VerilogWriter::WriteChipwideModule() {
    const bool blackBox = IsBlackBoxMode();
    if (blackBox) WriteIL("// synthesis translate_off");

    if (Port::VornixPath::GetInstance().size() == 0) NLW_MSG().issueError("%s", kNoVornixError);
    Port::Stream stream(Port::Stream::Read, 4096);
    if (Port::VornixPath::OpenFile("verilog/src/chipwide.v", stream)) {
        WriteL("");
        WriteIL("`ifndef CHIPWIDE");
        WriteIL("`define CHIPWIDE");
        // The source's revision-control header is not copied.
        std::string line;
        while (stream.readline(line)) {
            if (line.find("$Header:") == std::string::npos) WriteL(line.c_str());
        }
        WriteL("");
        WriteIL("`endif");
        WriteL("");
    } else {
        NLW_MSG().issueWarning(
            "chipwide.v module can't be found in directory $VORNIX/verilog/src\n");
    }

    if (blackBox) WriteIL("// synthesis translate_on");
}

bool Nlw_VerilogWriter::HasCellModels(Nlw_NlView* view) const {
    // Without the cell library no cell is known as a library cell.
    if (Port_Env::GetDataFileName("cells.dat", 0) == nullptr) {
        bool libraryCell = false;
        for (Nlw_NlBlock* macro : view->GetMacros())
            for (Nlw_NlBlock* child : macro->GetChildren())
                libraryCell = libraryCell || child->IsTimcell() || child->IsFuncell();
        if (!libraryCell) return false;
    }
    // Without any root each model's message says so.
    if (Port::VornixPath::GetInstance().size() == 0) return true;
    const std::string models =
        std::string("verilog/src/") + (GetParams()->GetFuncellMode() ? "funcells" : "timcells");
    const Port::PathList& roots = Port::VornixPath::GetInstance();
    for (size_t i = 0; i < roots.size(); ++i)
        if (Port::File::isdir((std::string(roots[i]) + "/" + models).c_str())) return true;
    return false;
}

bool Nlw_VerilogWriter::CopyModelFile(const char* libraryName, const char* model) {
    std::string relative = "verilog/src/";
    relative += libraryName;
    relative += '/';
    relative += model;
    relative += ".v";
    Port::Stream stream(Port::Stream::Read, 4096);
    if (!Port::VornixPath::OpenFile(relative.c_str(), stream)) return false;
    std::string line;
    while (stream.readline(line)) WriteL(line.c_str());
    WriteL("");
    return true;
}

void Nlw_VerilogWriter::WriteIsmList(Nlw_NlBlock* block, UT_NCH_CACHE& cache) {
    Nlw_NetlistWriter* nlw = GetNlw();
    const char* libraryName = GetParams()->GetFuncellMode() ? "funcells" : "timcells";
    // Once a type's model list has gone through the cache, every later
    // instance of the type finds all of it there: skip those at once.
    std::unordered_set<const Nlw_NlType*> doneTypes;

    auto handle = [&](const char* model) {
        UT_NCH_NAME* entry = cache.add(model, 1);
        if (!entry || entry->GetCount() != 1) return;
        if (Port::VornixPath::GetInstance().size() == 0) {
            NLW_MSG().issueError("%s", kNoVornixError);
            NLW_MSG().issueError("No module file found for model %s.\n", model);
            return;
        }
        if (!CopyModelFile(libraryName, model))
            NLW_MSG().issueError("No module file found for model %s.\n", model);
    };

    for (Nlw_NlBlock* child : block->GetChildren()) {
        if (!child || !nlw->IsInstantiatable(child)) continue;
        if (!child->IsTimcell() && !child->IsFuncell()) continue;
        if (child->GetType() && !doneTypes.insert(child->GetType()).second) continue;

        const char* typeName = child->GetTypeName();
        auto found = inclusionByType_.find(typeName);
        if (found != inclusionByType_.end()) {
            for (const Port::String& model : found->second) handle(model.c_str());
        }
        handle(typeName);
    }
}
