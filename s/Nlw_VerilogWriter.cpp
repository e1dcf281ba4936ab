// Construction of the netlist writer, its name tables, and the traversal that
// writes each module type once.
#include "Nlw_VerilogWriter.h"

#include <cstring>

#include "framework/Nlw_Params.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_Nl.h"
#include "port/PM.h"
#include "port/Port.h"
#include "port/UT.h"

namespace {

// ASCII only, as UT_STR::ICompare folds case: names are identifiers, and the
// hash and the equality must agree whatever the locale.
inline unsigned char UpperAscii(unsigned char c) {
    return (c >= 'a' && c <= 'z') ? static_cast<unsigned char>(c - 'a' + 'A') : c;
}

// First bucket count of the prime series at or above 100.
constexpr size_t kNameSetBuckets = 193;

}  // namespace

size_t Nlw_ICaseHash::operator()(const Port::String& s) const {
    size_t h = 0;
    for (const char* p = s.c_str(); *p; ++p) h = 5 * h + UpperAscii(static_cast<unsigned char>(*p));
    return h;
}

bool Nlw_ICaseEqual::operator()(const Port::String& a, const Port::String& b) const {
    return a.length() == b.length() && UT_STR::ICompare(a.c_str(), b.c_str()) == 0;
}

bool Nlw_ICaseOrder::operator()(const std::string& a, const std::string& b) const {
    return UT_STR::ICompare(a.c_str(), b.c_str()) < 0;
}
bool Nlw_ICaseOrder::operator()(const std::string& a, const char* b) const {
    return UT_STR::ICompare(a.c_str(), b) < 0;
}
bool Nlw_ICaseOrder::operator()(const char* a, const std::string& b) const {
    return UT_STR::ICompare(a, b.c_str()) < 0;
}

Nlw_VerilogWriter::Nlw_VerilogWriter(Nlw_NetlistWriter* nlw, const char* fileName,
                                     Port::Stream::Access access)
    : Nlw_Writer(nlw, fileName, access),
      hexStringPropertyTable_(kNameSetBuckets),
      bitStringPropertyTable_(kNameSetBuckets) {
    hexStringPropertyTable_.max_load_factor(1.0f);
    bitStringPropertyTable_.max_load_factor(1.0f);

    // Static timing netlists keep every property; the others drop what the
    // filter file lists.
    const char* pfd = Port_Env::GetDataFileName("vdm2ver.pfd", 1);
    Nlw_Params* params = GetParams();
    if (pfd && !(params && params->GetStaMode())) {
        propFilter_ = std::make_shared<Vdh_PropOutFilter>(pfd, nullptr);
        SetExtPropFilter(propFilter_.get());
    }
    Nlw_NlBus::SetOutputDelimiterType(4);

    InitHexStringPropertyTable();
    InitBitStringPropertyTable();
    InitBigEndingTimcellMap();
    InitRecursiveInclusionMap();
    BuildTypeIndexes();
}

Nlw_VerilogWriter::Nlw_VerilogWriter(const Nlw_VerilogWriter& other) = default;

Nlw_VerilogWriter& Nlw_VerilogWriter::operator=(const Nlw_VerilogWriter& other) = default;

Nlw_VerilogWriter::~Nlw_VerilogWriter() {
    // The filter goes with this object; the base must not keep a pointer to it.
    if (GetExtPropFilter() == propFilter_.get()) SetExtPropFilter(nullptr);
}

void Nlw_VerilogWriter::InitHexStringPropertyTable() {
    InitNameSet(hexStringPropertyTable_, "HexStringProperty");
}

void Nlw_VerilogWriter::InitBitStringPropertyTable() {
    InitNameSet(bitStringPropertyTable_, "BitStringProperty");
}

void Nlw_VerilogWriter::InitNameSet(NameSet& table, const char* key) {
    table.clear();
    PM_DEVKEY* devkey = GetNlw() ? GetNlw()->GetDevkey() : nullptr;
    if (!devkey) return;
    for (int index = 0;; ++index) {
        const char* item = devkey->getstringbykey(key, ",", index, nullptr, 0);
        if (!item) break;
        table.insert(Port::String(item));
    }
}

bool Nlw_VerilogWriter::IsBlackBoxMode() const {
    return GetNlw()->GetIsVornixCore() && GetParams()->GetFuncellMode();
}

void Nlw_VerilogWriter::AppendAkaComment(std::string& out, const char* aka) const {
    if (!aka || !GetParams()->GetWriteAka()) return;
    out += " // AKA:";
    out += Nlw_Util::CommentText(aka);
}

void Nlw_VerilogWriter::WriteView(Nlw_NlView* view, unsigned char /*flag*/) {
    WriteNewHeader(view->GetRootMacro());

    const UT_DARRAY<Nlw_NlBlock*>& macros = view->GetMacros();
    const size_t numMacros = view->GetNumMacros();
    Nlw_Params* params = GetParams();

    if (params->GetWriteInstantiatedTimcells()) {
        Port_MsgManData::debugStub("GetParams()->GetWriteInstantiatedTimcells() \n");
        // Without the installation's cell library no cell is known as a
        // library cell, and the file would silently hold no model at all.
        if (!HasCellModels(view)) {
            const char* vornix = params->GetVornix();
            NLW_MSG().issueError(
                "The cell models could not be found: '%s' is no usable installation (it needs "
                "data/cells.dat and verilog/src/%s).\n",
                vornix && *vornix ? vornix : "(none)",
                params->GetFuncellMode() ? "funcells" : "timcells");
        }
        UT_NCH_CACHE modelCache;
        for (size_t i = numMacros; i-- > 0;) {
            Nlw_NlBlock* block = macros[i];
            if (block && block->IsMacro()) WriteIsmList(block, modelCache);
        }
    }

    // Each module file is written on its own by WriteMHBlock.
    if (params->GetMHFMode()) return;

    // Reverse macro order, each type name once: the definition lands where
    // the last macro of that type stands in the host's list.
    UT_NCH_CACHE typeCache;
    std::vector<Nlw_NlBlock*> blocks;
    for (size_t i = numMacros; i-- > 0;) {
        Nlw_NlBlock* block = macros[i];
        if (!block || !block->IsMacro()) continue;
        UT_NCH_NAME* entry = typeCache.add(block->GetTypeName(), 1);
        if (entry && entry->GetCount() == 1) blocks.push_back(block);
    }
    WriteBlocks(view, blocks);

    if (params->GetSimMode() && params->GetInsert_chipwide()) WriteChipwideModule();
    if (params->GetWriteUseLib()) WriteL("`uselib");
}

void Nlw_VerilogWriter::WriteMHBlock(Nlw_NlBlock* block) {
    WriteNewHeader(block);
    WriteBlock(block);
    if (GetParams()->GetWriteUseLib()) WriteL("`uselib");
}

void Nlw_VerilogWriter::WriteBlock(Nlw_NlBlock* block) {
    const bool cellDefine = GetParams()->GetWriteCellDefine();
    if (cellDefine) {
        WriteIL("`celldefine");
        UpIndent();
    }
    WriteModuleHeader(block);
    UpIndent();
    WriteModuleBody(block);
    DownIndent();
    WriteModuleEnd(block);
    if (cellDefine) {
        DownIndent();
        WriteIL("`endcelldefine");
    }
    WriteL("");
}

void Nlw_VerilogWriter::WriteModuleHeader(Nlw_NlBlock* block) {
    line_ = "module ";
    line_ += GetNlw()->Escape(block->GetTypeName(), 0);
    line_ += " (";
    AppendAkaComment(line_, block->GetAka());
    WriteIL(line_.c_str());

    UpIndent();
    WriteModulePortList(block);
    DownIndent();

    if (IsBlackBoxMode()) {
        WriteI(")");
        WriteI("/* synthesis syn_black_box syn_noprune=1 */");
        WriteIL(";");
    } else {
        WriteIL(");");
    }
}

void Nlw_VerilogWriter::WriteModuleBody(Nlw_NlBlock* block) {
    WriteIOPortDeclarations(block);
    WriteWireDeclarations(block);
    WriteWireAssignments(block);
    WriteSdfAnnotate(block);
    WriteComponentInstantiationStatements(block);
}

void Nlw_VerilogWriter::WriteModuleEnd(Nlw_NlBlock* /*block*/) {
    if (IsBlackBoxMode()) {
        WriteIL("");
        WriteIL("// synthesis translate_on");
        WriteIL("");
    }
    WriteIL("endmodule");
}
