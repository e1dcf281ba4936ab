// The writer object's life cycle, the design write flow and the output file
// drivers.
#include "Nlw_Verilog.h"

#include <cstdint>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <vector>

#include "Nlw_PcsWriter.h"
#include "Nlw_PinWriter.h"
#include "Nlw_VerilogLU.h"
#include "Nlw_VerilogTestWriter.h"
#include "Nlw_VerilogWriter.h"
#include "framework/Nlw_FileRun.h"
#include "framework/Nlw_FileSafety.h"
#include "framework/Nlw_Nl_LU.h"
#include "model/Nlw_Nl.h"
#include "port/PM.h"
#include "port/Port.h"
#include "port/UT.h"
#include "writers/Nlw_AssertionWriter.h"
#include "writers/Nlw_MhfInfoWriter.h"
#include "writers/Nlw_SdfWriter.h"

namespace {

// Both constructors leave the process-wide bus settings in the same state:
// one dimension per bus, names split by the host's lenient input style until
// WriteDesign switches to the output style, and "[" "]" on output.
void InitBusSettings() {
    Nlw_NlBus::SetMultiDimensions(false);
    Nlw_NlBus::SetInputDelimiterType(7);
    Nlw_NlBus::SetOutputDelimiterType(4);
}

// Module files in multiple-hierarchy mode are named after module names that
// anyone may have written ("../x", "a b/c", "Top" beside "top"): each module
// type gets a file base name that is safe, portable and unique ignoring case,
// and apart from the run's own chipwide and model files. The per-module
// timing files use the same names.
void AssignModuleFileNames(Nlw_NlView* view, const std::string& outputBase) {
    std::vector<Nlw_NlType*> types;
    std::vector<std::string> names;
    std::unordered_set<Nlw_NlType*> seen;
    const UT_DARRAY<Nlw_NlBlock*>& macros = view->GetMacros();
    for (size_t i = macros.GetCount(); i-- > 0;) {
        Nlw_NlBlock* block = macros[i];
        if (block == nullptr || !block->IsMacro() || block->GetType() == nullptr) continue;
        if (!seen.insert(block->GetType()).second) continue;
        types.push_back(block->GetType());
        names.push_back(block->GetType()->GetName());
    }
    const std::vector<std::string> bases =
        Nlw_FileSafety::SafeFileNames(names, {"chipwide", outputBase + "_ism"});
    for (size_t i = 0; i < types.size(); ++i) types[i]->SetFileBaseName(bases[i].c_str());
}

}  // namespace

Nlw_Verilog::Nlw_Verilog() {
    appName_ = "qdb2ver";
    usage_ = kQdb2verSynopsis;
    ext_ = "v";
    InitBusSettings();
}

// The caller's application name is kept by pointer and must outlive the
// object.
Nlw_Verilog::Nlw_Verilog(const char* applicationName) {
    appName_ = applicationName;
    usage_ = kTesselSynopsis;
    ext_ = "v";
    InitBusSettings();
}

Nlw_Verilog::Nlw_Verilog(const Nlw_Verilog& other) : Nlw_NetlistWriter(other) {}

Nlw_Verilog& Nlw_Verilog::operator=(const Nlw_Verilog& other) {
    Nlw_NetlistWriter::operator=(other);
    return *this;
}

Nlw_Verilog::~Nlw_Verilog() = default;

void Nlw_Verilog::WriteDesign() {
    Nlw_Params* params = GetParams();
    Nlw_NlView* view = GetView();
    if (params == nullptr || view == nullptr) {
        NLW_MSG().issueInternal(
            "No netlist view or parameters were given to the Verilog writer.\n");
        return;
    }

    // Every file of the run goes into place together at the end, or none.
    Nlw_FileRun run;
    Nlw_NlBus::SetInputDelimiterType(4);

    // The environment variables are tested for presence only: an empty value
    // counts as set.
    if (Port_Env::GetEnv("NLW_NO_NAMECACHE") == nullptr) {
        Nlw_Nl_SpkCache::MakeSpkCache(GetReservedWords(), true);
        const bool bridge = Port_Env::GetEnv("VOR_NLW_LU_NO_BRIDGEID") == nullptr;
        // Library pins are legalized too: a black box's "A b" or "endmodule"
        // has no model that could declare it. Legal names stay as they are.
        Nlw_VerilogLU lu(this, view, bridge, params->GetWriteEscapedNames() != 0, true, true, true);
        // The device's chipwide module goes beside the design's modules.
        lu.ReserveTypeName("chipwide");
        lu.Process();
    }

    if (params->GetMHFMode())
        AssignModuleFileNames(view,
                              UT_PATH::GetBase(UT_PATH::InternalPath(GetOutputName()).c_str()));

    if (Port_Env::GetEnv("NLW_WRITE_NLWFILE") != nullptr) WriteNlwFile();

    if (params->GetWriteSdfFile() && UT_STR::_ICompare(params->GetInputFileType(), "qdb") != 0) {
        if (params->GetMHFMode())
            WriteSdfMHFile();
        else
            WriteSdfFile();
    }
    if (params->GetWritePinFile()) WritePinFile();
    if (params->GetWriteTestFile()) WriteVerilogTestFile();
    if (params->GetEcnMode()) WriteAssertionFile();

    if (params->GetMHFMode()) {
        WriteVerilogMHFile();
        WriteChipwideFile();
        if (params->GetWriteInstantiatedTimcells()) WriteISMFile();
        WriteMHFInfoFile();
    } else {
        WriteVerilogFile();
    }

    if (params->GetStaMode()) WritePcsFile();
    run.Commit();
    PrintInfoMessage();
}

// ---------------------------------------------------------------------------
// File names

const char* Nlw_Verilog::GetOutputName() const {
    const char* name = GetParams()->GetOutputFileName();
    return name ? name : "";
}

std::string Nlw_Verilog::GetOutputRoot() const {
    return UT_PATH::GetRoot(GetOutputName());
}

std::string Nlw_Verilog::GetOutputDirectory() const {
    Port::FileName fileName(GetOutputName());
    const char* dir = fileName.GetPath();
    return dir ? dir : "";
}

// "<root><suffix>" in the platform's form, such as "out/top.pin".
std::string Nlw_Verilog::GetRootFileName(const char* suffix) const {
    return UT_PATH::ExternalPath(vorform("%s%s", GetOutputRoot().c_str(), suffix));
}

const char* Nlw_Verilog::GetDesignName() const {
    const Nlw_Design* design = GetDesign();
    return design ? design->GetName() : "";
}

// ---------------------------------------------------------------------------
// Drivers of the netlist files

void Nlw_Verilog::WriteVerilogFile() {
    const char* name = GetOutputName();
    NLW_MSG().issueStatus("Writing Verilog netlist file '%s' ...\n", name);
    Nlw_VerilogWriter writer(this, name, GetParams()->GetOutputFileMode());
    writer.WriteView(GetView(), 0);
}

// One file per module type: the first block of a type met in the descending
// walk writes it, later blocks of the same type write nothing. Types whose
// names differ only in case are different modules and get files of their
// own (AssignModuleFileNames keeps the names apart).
void Nlw_Verilog::WriteVerilogMHFile() {
    NLW_MSG().issueStatus("Writing multiple Verilog netlists for design '%s' ...\n",
                          GetDesignName());
    const Port::Stream::Access mode = GetParams()->GetOutputFileMode();
    UT_NCH_CACHE written(false);
    const UT_DARRAY<Nlw_NlBlock*>& macros = GetView()->GetMacros();
    for (size_t i = macros.GetCount(); i-- > 0;) {
        Nlw_NlBlock* block = macros[i];
        if (block == nullptr || !block->IsMacro()) continue;
        const std::string fileName = GetMHNetlistFileName(block);
        UT_NCH_NAME* entry = written.add(block->GetTypeName(), 1);
        if (entry == nullptr || entry->GetCount() != 1) continue;
        Port_MsgManData::debugStub("Writing Verilog netlist '%s' ...\n", fileName.c_str());
        Nlw_VerilogWriter writer(this, fileName.c_str(), mode);
        writer.WriteMHBlock(block);
    }
}

void Nlw_Verilog::WriteChipwideFile() {
    const std::string fileName = GetOutputDirectory() + "chipwide.v";
    Port_MsgManData::debugStub("Writing chipwide.v...\n");
    Nlw_VerilogWriter writer(this, fileName.c_str(), GetParams()->GetOutputFileMode());
    writer.WriteChipwideModule();
}

void Nlw_Verilog::WriteISMFile() {
    const std::string fileName = GetRootFileName("_ism.v");
    NLW_MSG().issueStatus("Writing Verilog simulation model file '%s' ...\n", fileName.c_str());
    Nlw_VerilogWriter writer(this, fileName.c_str(), GetParams()->GetOutputFileMode());
    writer.WriteView(GetView(), 0);
}

// ---------------------------------------------------------------------------
// Drivers of the other files. The assertion and hierarchy information
// files are written by host writers this host does not have yet: their
// drivers form the file names only, and announce and write nothing.

std::string Nlw_Verilog::GetSdfFileName() const {
    const char* sdfPath = GetParams()->GetSdfPath();
    if (sdfPath == nullptr) return GetRootFileName(".sdf");
    const std::string base = UT_PATH::GetBase(UT_PATH::InternalPath(GetOutputName()).c_str());
    // An empty timing directory is the working directory, as for the
    // per-module timing files, not the file system root.
    if (*sdfPath == '\0') return UT_PATH::ExternalPath(vorform("%s.sdf", base.c_str()));
    return UT_PATH::ExternalPath(vorform("%s/%s.sdf", sdfPath, base.c_str()));
}

// The directory of the per-module timing files, with its final separator;
// an empty timing directory means the working directory.
std::string Nlw_Verilog::GetSdfMHPrefix() const {
    const char* sdfPath = GetParams()->GetSdfPath();
    if (sdfPath == nullptr) return GetOutputDirectory();
    std::string prefix = sdfPath;
    if (!prefix.empty()) prefix += Port::FileName::GetPathSeparator();
    return prefix;
}

// The file of a module block in multiple-hierarchy mode, whether or not
// this block is the one that writes it.
std::string Nlw_Verilog::GetMHNetlistFileName(const Nlw_NlBlock* block) const {
    return GetOutputDirectory() + block->GetFileBaseName() + ".v";
}

std::string Nlw_Verilog::GetSdfMHFileName(const Nlw_NlBlock* block) const {
    return GetSdfMHPrefix() + block->GetFileBaseName() + ".sdf";
}

bool Nlw_Verilog::GetWritesSdf() const {
    const Nlw_Params* params = GetParams();
    return params->GetWriteSdfFile() && UT_STR::_ICompare(params->GetInputFileType(), "qdb") != 0;
}

// The files of a multiple-hierarchy run by the rules of its drivers: a
// block's module is in the file of the first block of its type in the
// descending walk; every block has its own timing file.
Nlw_MhfFiles Nlw_Verilog::GetMHFiles() const {
    Nlw_MhfFiles files;
    std::unordered_map<std::string, std::string> fileOfType;
    const bool sdf = GetWritesSdf();
    const UT_DARRAY<Nlw_NlBlock*>& macros = GetView()->GetMacros();
    for (size_t i = macros.GetCount(); i-- > 0;) {
        const Nlw_NlBlock* block = macros[i];
        if (block == nullptr || !block->IsMacro()) continue;
        auto first = fileOfType.emplace(block->GetTypeName(), GetMHNetlistFileName(block)).first;
        files.netlist[block] = first->second;
        if (sdf) files.timing[block] = GetSdfMHFileName(block);
    }
    files.chipwide = GetOutputDirectory() + "chipwide.v";
    if (GetParams()->GetWriteInstantiatedTimcells()) files.models = GetRootFileName("_ism.v");
    return files;
}

std::string Nlw_Verilog::GetAssertionFileName() const {
    const bool formality = UT_STR::ICompare(GetParams()->GetEcnTool(), "formality") == 0;
    return GetRootFileName(formality ? ".svf" : ".vxc");
}

void Nlw_Verilog::WriteSdfFile() {
    const std::string fileName = GetSdfFileName();
    if (Nlw_SdfWriter::IsTimingSource(this, fileName.c_str())) return;
    NLW_MSG().issueStatus("Writing Verilog SDF file '%s' ...\n", fileName.c_str());
    Nlw_SdfWriter writer(this, fileName.c_str(), GetParams()->GetOutputFileMode());
    writer.WriteView(GetView(), 0);
}

// One timing file per module block. The file is named after the block's
// type, as the $sdf_annotate statement of the type's module names it: the
// first block of a type met in the descending walk writes it, as for the
// netlist files (a second block of the type would write the same file).
void Nlw_Verilog::WriteSdfMHFile() {
    NLW_MSG().issueStatus("Writing multiple Verilog SDF files for design '%s' ...\n",
                          GetDesignName());
    const Port::Stream::Access mode = GetParams()->GetOutputFileMode();
    UT_NCH_CACHE written(false);
    const UT_DARRAY<Nlw_NlBlock*>& macros = GetView()->GetMacros();
    for (size_t i = macros.GetCount(); i-- > 0;) {
        Nlw_NlBlock* block = macros[i];
        if (block == nullptr || !block->IsMacro()) continue;
        const std::string fileName = GetSdfMHFileName(block);
        UT_NCH_NAME* entry = written.add(fileName.c_str(), 1);
        if (entry == nullptr || entry->GetCount() != 1) continue;
        if (Nlw_SdfWriter::IsTimingSource(this, fileName.c_str())) continue;
        Port_MsgManData::debugStub("Writing Verilog SDF file '%s' ...\n", fileName.c_str());
        Nlw_SdfWriter writer(this, fileName.c_str(), mode);
        writer.WriteMHBlock(block);
    }
}

void Nlw_Verilog::WritePinFile() {
    const std::string fileName = GetRootFileName(".pin");
    NLW_MSG().issueStatus("Writing pin file '%s' ...\n", fileName.c_str());
    Nlw_PinWriter writer(this, fileName.c_str(), GetParams()->GetOutputFileMode());
    writer.WriteView(GetView(), 0);
}

void Nlw_Verilog::WriteVerilogTestFile() {
    const std::string fileName = GetRootFileName(".tv");
    NLW_MSG().issueStatus("Writing Verilog test file '%s' ...\n", fileName.c_str());
    Nlw_VerilogTestWriter writer(this, fileName.c_str(), GetParams()->GetOutputFileMode());
    writer.WriteView(GetView(), 0);
}

// One writer per key of the tool's FLOW list, all on the same file. Each
// writes the whole file, so later passes replace the run's own file: they
// are given Replace even when the run may only create new files.
void Nlw_Verilog::WriteAssertionFile() {
    // Without a design map file there is nothing to assert.
    if (GetParams()->GetQdmFileName() == nullptr) return;
    const std::string qdmName = GetParams()->GetQdmFileName();
    const bool formality = UT_STR::ICompare(GetParams()->GetEcnTool(), "formality") == 0;
    const std::string fileName = GetAssertionFileName();
    PM_PIC part("", true, PM_PARTNAME_DEFAULT);
    PM_DEVKEY devkey(formality ? "Nlw_formality" : "Nlw_conformal", &part, false, true, true);
    Port::Stream::Access mode = GetParams()->GetOutputFileMode();
    for (uint16_t index = 0;; ++index) {
        const char* key = devkey.getstringbykey("FLOW", ",", index, nullptr, 0);
        if (key == nullptr) break;
        Port_MsgManData::debugStub("Key : %s\n", key);
        Port_MsgManData::debugStub("Writing Formality assertion file %s ...%s\n", fileName.c_str(),
                                   qdmName.c_str());
        Nlw_AssertionWriter writer(this, &devkey, fileName.c_str(), mode);
        writer.WriteAFW(GetAnnoVacuums());
        if (!writer.Close()) break;
        if (mode != Port::Stream::Memory) mode = Port::Stream::Replace;
        // The count is 16 bits wide: a longer list ends with its wrap.
        if (index == UINT16_MAX) break;
    }
}

void Nlw_Verilog::WriteMHFInfoFile() {
    const std::string fileName = GetRootFileName("_mhf_info.txt");
    NLW_MSG().issueStatus("Writing hierarchy information file '%s' ...\n", fileName.c_str());
    Nlw_MhfInfoWriter writer(this, fileName.c_str(), GetParams()->GetOutputFileMode());
    writer.SetFiles(GetMHFiles());
    writer.WriteView(GetView(), 0);
}

void Nlw_Verilog::WritePcsFile() {
    const std::string fileName = GetRootFileName(".pcs");
    NLW_MSG().issueStatus("Writing PCS file '%s' ...\n", fileName.c_str());
    Nlw_PcsWriter writer(this, fileName.c_str(), GetParams()->GetOutputFileMode());
    writer.WriteView(GetView(), 0);
}
