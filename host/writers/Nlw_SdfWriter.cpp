#include "writers/Nlw_SdfWriter.h"

#include <sys/stat.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstring>

#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_Nl.h"

namespace {

bool IsPlain(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '_';
}

const char* EdgeWord(uint8_t edge) {
    return edge == NLW_EDGE_POS ? "posedge" : edge == NLW_EDGE_NEG ? "negedge" : nullptr;
}

// A value as a whole number of written units; SDF readers round to their
// own precision, so writing the netlist's precision keeps both in step.
void AppendNumber(std::string& text, double ps, double unit) {
    char buf[32];
    std::snprintf(buf, sizeof buf, "%lld", static_cast<long long>(std::llround(ps / unit)));
    text += buf;
}

}  // namespace

Nlw_SdfWriter::Nlw_SdfWriter(Nlw_NetlistWriter* nlw, const char* fileName,
                             Port::Stream::Access access)
    : Nlw_Writer(nlw, fileName, access) {
    timing_ = nlw ? nlw->GetTiming() : nullptr;
    Nlw_Params* params = GetParams();
    unit_ = params && !params->GetWritePsTimePrecision() ? 10.0 : 1.0;
    if (timing_ && timing_->netMode == Nlw_Timing::NetMode::IoPath) MakeNetDelayIndex();
}

bool Nlw_SdfWriter::IsTimingSource(Nlw_NetlistWriter* nlw, const char* fileName) {
    const Nlw_Timing* timing = nlw ? nlw->GetTiming() : nullptr;
    if (timing == nullptr || timing->nominal || timing->source.empty()) return false;
    struct stat in, out;
    if (stat(timing->source.c_str(), &in) != 0 || stat(fileName, &out) != 0) return false;
    if (in.st_dev != out.st_dev || in.st_ino != out.st_ino) return false;
    NLW_MSG().issueError(
        "The timing file '%s' would be written over the input timing file '%s'; give the "
        "netlist another name or the timing files another directory (-sdf_path).\n",
        fileName, timing->source.c_str());
    return true;
}

std::string Nlw_SdfWriter::EscapeName(const char* name) {
    std::string out;
    for (const char* p = name; *p; ++p) {
        if (!IsPlain(*p)) out += '\\';
        out += *p;
    }
    return out;
}

void Nlw_SdfWriter::MakeNetDelayIndex() {
    for (uint32_t i = 0; i < timing_->entries.size(); ++i) {
        const Nlw_TimingEntry& e = timing_->entries[i];
        if (e.kind == Nlw_TimingKind::Interconnect && e.pin2) netDelayOf_.emplace(e.pin2, i);
    }
}

void Nlw_SdfWriter::WriteView(Nlw_NlView* view, unsigned char) {
    if (view == nullptr || view->GetRootMacro() == nullptr) return;
    WriteHead(view->GetRootMacro());
    if (timing_) {
        std::vector<uint32_t> all(timing_->entries.size());
        for (uint32_t i = 0; i < all.size(); ++i) all[i] = i;
        WriteEntries(view->GetRootMacro(), all);
    }
    WriteL(")");
}

void Nlw_SdfWriter::WriteMHBlock(Nlw_NlBlock* block) {
    if (block == nullptr) return;
    WriteHead(block);
    if (timing_) WriteEntries(block, timing_->GetEntriesOf(block));
    WriteL(")");
}

void Nlw_SdfWriter::WriteHead(Nlw_NlBlock* scope) {
    Nlw_NetlistWriter* nlw = GetNlw();
    const Nlw_Design* design = nlw ? nlw->GetDesign() : nullptr;
    const std::string designName = design ? design->GetName() : scope->GetTypeName();
    WriteL("(DELAYFILE");
    UpIndent();
    WriteIL("(SDFVERSION \"3.0\")");
    WriteIL(vorform("(DESIGN \"%s\")", designName.c_str()));
    WriteIL(vorform("(DATE \"%s\")", Nlw_Util::GetTimeStampString(1)));
    WriteIL("(VENDOR \"nlw-verilog\")");
    WriteIL(vorform("(PROGRAM \"%s\")", nlw ? nlw->GetApplicationName() : ""));
    WriteIL(vorform("(VERSION \"%s\")", nlw ? nlw->GetApplicationVersion() : ""));
    WriteIL("(DIVIDER /)");
    // Nominal delays say so, so that nobody mistakes them for routed ones.
    if (timing_ && timing_->nominal) WriteIL("(PROCESS \"nominal\")");
    WriteIL(unit_ == 10.0 ? "(TIMESCALE 10ps)" : "(TIMESCALE 1ps)");
    DownIndent();
}

void Nlw_SdfWriter::WriteEntries(Nlw_NlBlock* scope, const std::vector<uint32_t>& list) {
    UpIndent();
    std::vector<uint32_t> nets;
    for (uint32_t i : list)
        if (timing_->entries[i].kind == Nlw_TimingKind::Interconnect) nets.push_back(i);
    if (!nets.empty() && timing_->netMode != Nlw_Timing::NetMode::IoPath) WriteNets(scope, nets);
    // Cell entries come cell by cell; one CELL per run of entries of one
    // instance.
    std::vector<uint32_t> cells;
    cells.reserve(list.size() - nets.size());
    for (uint32_t i : list)
        if (timing_->entries[i].kind != Nlw_TimingKind::Interconnect) cells.push_back(i);
    for (size_t b = 0; b < cells.size();) {
        Nlw_NlBlock* cell = timing_->entries[cells[b]].pin1->GetBlock();
        size_t e = b + 1;
        while (e < cells.size() && timing_->entries[cells[e]].pin1->GetBlock() == cell) ++e;
        WriteCell(scope, cell, cells.data() + b, cells.data() + e);
        b = e;
    }
    DownIndent();
}

// The nets of a scope: one CELL of the scope's own type with an empty
// INSTANCE, holding INTERCONNECT or PORT entries.
void Nlw_SdfWriter::WriteNets(Nlw_NlBlock* scope, const std::vector<uint32_t>& nets) {
    WriteIL("(CELL");
    UpIndent();
    WriteIL(vorform("(CELLTYPE \"%s\")", scope->GetTypeName()));
    WriteIL("(INSTANCE)");
    WriteIL("(DELAY");
    UpIndent();
    WriteIL("(ABSOLUTE");
    UpIndent();
    const bool asPorts = timing_->netMode == Nlw_Timing::NetMode::Port;
    std::string line;
    for (uint32_t i : nets) {
        const Nlw_TimingEntry& e = timing_->entries[i];
        if (asPorts) {
            line = "(PORT " + PinPath(e.pin2, scope);
        } else {
            line = "(INTERCONNECT " + PinPath(e.pin1, scope) + ' ' + PinPath(e.pin2, scope);
        }
        AppendValues(line, e);
        line += ')';
        WriteIL(line.c_str());
    }
    DownIndent();
    WriteIL(")");
    DownIndent();
    WriteIL(")");
    DownIndent();
    WriteIL(")");
}

void Nlw_SdfWriter::WriteCell(Nlw_NlBlock* scope, Nlw_NlBlock* cell, const uint32_t* first,
                              const uint32_t* last) {
    WriteIL("(CELL");
    UpIndent();
    WriteIL(vorform("(CELLTYPE \"%s\")", cell->GetTypeName()));
    WriteIL(("(INSTANCE " + InstancePath(cell, scope) + ")").c_str());
    // Delays first, then checks, each in their own section.
    for (int pass = 0; pass < 2; ++pass) {
        const bool checks = pass == 1;
        bool open = false;
        for (const uint32_t* p = first; p != last; ++p) {
            const Nlw_TimingEntry& e = timing_->entries[*p];
            if (Nlw_Timing::IsCheck(e.kind) != checks) continue;
            if (!open) {
                open = true;
                WriteIL(checks ? "(TIMINGCHECK" : "(DELAY");
                UpIndent();
                if (!checks) {
                    WriteIL("(ABSOLUTE");
                    UpIndent();
                }
            }
            WriteIL(EntryText(e, cell).c_str());
        }
        if (open) {
            if (!checks) {
                DownIndent();
                WriteIL(")");
            }
            DownIndent();
            WriteIL(")");
        }
    }
    DownIndent();
    WriteIL(")");
}

std::string Nlw_SdfWriter::EntryText(const Nlw_TimingEntry& e, Nlw_NlBlock* cell) {
    std::string text = "(";
    text += Nlw_Timing::Keyword(e.kind);
    text += ' ';
    switch (e.kind) {
        case Nlw_TimingKind::IoPath:
            text += PortTchk(e.pin1, e.edge1, cell);
            text += ' ';
            text += PinPath(e.pin2, cell);
            break;
        case Nlw_TimingKind::Port:
            text += PinPath(e.pin1, cell);
            break;
        default:
            text += PortTchk(e.pin1, e.edge1, cell);
            if (e.pin2) {
                text += ' ';
                text += PortTchk(e.pin2, e.edge2, cell);
            }
            break;
    }
    AppendValues(text, e);
    text += ')';
    return text;
}

void Nlw_SdfWriter::AppendValues(std::string& text, const Nlw_TimingEntry& e) {
    const Nlw_Rvalue* net = nullptr;
    uint8_t netCount = 0;
    if (e.kind == Nlw_TimingKind::IoPath && !netDelayOf_.empty()) {
        auto it = netDelayOf_.find(e.pin1);
        if (it != netDelayOf_.end()) {
            const Nlw_TimingEntry& n = timing_->entries[it->second];
            net = &timing_->values[n.firstValue];
            netCount = n.numValues;
        }
    }
    for (uint8_t k = 0; k < e.numValues; ++k) {
        const Nlw_Rvalue& r = timing_->values[e.firstValue + k];
        text += " (";
        if (r.present) {
            for (int f = 0; f < 3; ++f) {
                if (f) text += ':';
                if (!(r.present & (1 << f))) continue;
                double v = r.v[f];
                if (net) {
                    // The net's value of the same position, or its largest
                    // when the two lists differ in length (a pessimistic
                    // fold: the path's unateness is not known here).
                    double add = 0;
                    if (netCount == e.numValues) {
                        add = net[k].v[f];
                    } else {
                        for (uint8_t j = 0; j < netCount; ++j) add = std::max(add, net[j].v[f]);
                    }
                    v += add;
                }
                AppendNumber(text, v, unit_);
            }
        }
        text += ')';
    }
}

std::string Nlw_SdfWriter::InstancePath(const Nlw_NlBlock* block, const Nlw_NlBlock* scope) {
    std::vector<const Nlw_NlBlock*> chain;
    for (const Nlw_NlBlock* b = block; b && b != scope; b = b->GetParent()) chain.push_back(b);
    std::string path;
    for (size_t i = chain.size(); i-- > 0;) {
        if (!path.empty()) path += '/';
        path += EscapeName(chain[i]->GetWritableName());
    }
    return path;
}

std::string Nlw_SdfWriter::PinName(const Nlw_NlPin* pin) {
    const char* name = pin->GetWritableName();
    if (pin->IsBused()) {
        // A bus member "D[3]": the base is an identifier, the index stays.
        const char* bracket = std::strrchr(name, '[');
        if (bracket && bracket != name) {
            std::string base(name, bracket);
            return EscapeName(base.c_str()) + bracket;
        }
    }
    return EscapeName(name);
}

std::string Nlw_SdfWriter::PinPath(const Nlw_NlPin* pin, const Nlw_NlBlock* scope) {
    const Nlw_NlBlock* block = pin->GetBlock();
    if (block == scope) return PinName(pin);
    return InstancePath(block, scope) + '/' + PinName(pin);
}

std::string Nlw_SdfWriter::PortTchk(const Nlw_NlPin* pin, uint8_t edge, const Nlw_NlBlock* scope) {
    const char* word = EdgeWord(edge);
    std::string port = PinPath(pin, scope);
    return word ? std::string("(") + word + ' ' + port + ')' : port;
}
