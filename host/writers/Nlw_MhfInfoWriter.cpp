// The hierarchy information file: line-oriented, tab-separated, one record
// per line with its kind first, so that a script needs no parser.
#include "writers/Nlw_MhfInfoWriter.h"

#include <string>
#include <vector>

#include "model/Nlw_Nl.h"
#include "port/Port.h"

Nlw_MhfInfoWriter::Nlw_MhfInfoWriter(Nlw_NetlistWriter* nlw, const char* fileName,
                                     Port::Stream::Access access)
    : Nlw_Writer(nlw, fileName, access) {}

Nlw_MhfInfoWriter::~Nlw_MhfInfoWriter() = default;

std::string Nlw_MhfInfoWriter::Field(const std::string& text) {
    if (text.empty()) return "-";
    std::string out(text);
    for (char& c : out)
        if (c == '\t' || c == '\n' || c == '\r') c = ' ';
    return out;
}

std::string Nlw_MhfInfoWriter::GetInstancePath(const Nlw_NlBlock* block) {
    std::vector<const char*> names;
    for (const Nlw_NlBlock* b = block; b != nullptr; b = b->GetParent())
        names.push_back(b->GetWritableName());
    std::string path;
    for (size_t i = names.size(); i-- > 0;) {
        path += names[i];
        if (i > 0) path += '/';
    }
    return path;
}

std::string Nlw_MhfInfoWriter::FileOf(
    const std::unordered_map<const Nlw_NlBlock*, std::string>& files,
    const Nlw_NlBlock* block) const {
    auto it = files.find(block);
    return it == files.end() ? std::string() : it->second;
}

void Nlw_MhfInfoWriter::WriteView(Nlw_NlView* view, unsigned char) {
    if (view == nullptr) return;
    const Nlw_NlBlock* root = view->GetRootMacro();
    const Nlw_NetlistWriter* nlw = GetNlw();
    const Nlw_Design* design = nlw ? nlw->GetDesign() : nullptr;
    WriteL("# Hierarchy information of a multiple-hierarchy Verilog netlist.");
    WriteL("# One record per line, fields separated by one tab, \"-\" for none:");
    WriteL("#   top     module  netlist-file");
    WriteL("#   shared  role    file");
    WriteL("#   block   instance-path  module  netlist-file  timing-file  parent-path");
    WriteL("version\t1");
    WriteL(("design\t" + Field(design ? design->GetName() : "")).c_str());
    if (root != nullptr)
        WriteL(("top\t" + Field(root->GetTypeName()) + "\t" + Field(FileOf(files_.netlist, root)))
                   .c_str());
    if (!files_.chipwide.empty()) WriteL(("shared\tchipwide\t" + Field(files_.chipwide)).c_str());
    if (!files_.models.empty()) WriteL(("shared\tmodels\t" + Field(files_.models)).c_str());
    const UT_DARRAY<Nlw_NlBlock*>& macros = view->GetMacros();
    for (size_t i = 0; i < macros.GetCount(); ++i)
        if (macros[i] != nullptr) WriteBlock(macros[i]);
}

void Nlw_MhfInfoWriter::WriteBlock(Nlw_NlBlock* block) {
    if (block == nullptr || !block->IsMacro()) return;
    const Nlw_NlBlock* parent = block->GetParent();
    std::string line = "block\t" + Field(GetInstancePath(block));
    line += "\t" + Field(block->GetTypeName());
    line += "\t" + Field(FileOf(files_.netlist, block));
    line += "\t" + Field(FileOf(files_.timing, block));
    line += "\t" + Field(parent ? GetInstancePath(parent) : std::string());
    WriteL(line.c_str());
}
