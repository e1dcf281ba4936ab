#include "writers/Nlw_SdfWriter.h"

#include <sys/stat.h>

#include <algorithm>
#include <charconv>
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

// Appends [name, end) as an SDF identifier: a backslash before every
// character other than a letter, a digit or "_".
void AppendEscapedTo(Nlw_TextBuffer& out, const char* name, const char* end) {
    const char* run = name;
    for (const char* p = name; p != end; ++p) {
        if (IsPlain(*p)) continue;
        out.Append(run, static_cast<size_t>(p - run));
        out += '\\';
        run = p;
    }
    out.Append(run, static_cast<size_t>(end - run));
}

void AppendEscapedTo(Nlw_TextBuffer& out, const char* name) {
    AppendEscapedTo(out, name, name + std::strlen(name));
}

const char* EdgeWord(uint8_t edge) {
    return edge == NLW_EDGE_POS ? "posedge" : edge == NLW_EDGE_NEG ? "negedge" : nullptr;
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
    Nlw_TextBuffer out;
    AppendEscapedTo(out, name);
    return out.str();
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

// The body is formatted into a block of text handed to the file writer in
// large pieces: a timing file has several lines per cell, and a line at a
// time costs more than the formatting.
void Nlw_SdfWriter::Begin(int depth) {
    text_.Append(static_cast<size_t>(depth) * kIndentWidth, ' ');
}

void Nlw_SdfWriter::Line(int depth, const char* text) {
    Begin(depth);
    text_ += text;
    text_ += '\n';
}

void Nlw_SdfWriter::FlushText(bool always) {
    if (text_.empty() || (!always && text_.size() < kFlushSize)) return;
    WriteText(text_.data(), text_.size());
    text_.clear();
}

void Nlw_SdfWriter::WriteEntries(Nlw_NlBlock* scope, const std::vector<uint32_t>& list) {
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
    FlushText(true);
}

// The nets of a scope: one CELL of the scope's own type with an empty
// INSTANCE, holding INTERCONNECT or PORT entries.
void Nlw_SdfWriter::WriteNets(Nlw_NlBlock* scope, const std::vector<uint32_t>& nets) {
    Line(1, "(CELL");
    Begin(2);
    text_ += "(CELLTYPE \"";
    text_ += scope->GetTypeName();
    text_ += "\")\n";
    Line(2, "(INSTANCE)");
    Line(2, "(DELAY");
    Line(3, "(ABSOLUTE");
    const bool asPorts = timing_->netMode == Nlw_Timing::NetMode::Port;
    for (uint32_t i : nets) {
        const Nlw_TimingEntry& e = timing_->entries[i];
        Begin(4);
        if (asPorts) {
            text_ += "(PORT ";
            AppendPinPath(e.pin2, scope);
        } else {
            text_ += "(INTERCONNECT ";
            AppendPinPath(e.pin1, scope);
            text_ += ' ';
            AppendPinPath(e.pin2, scope);
        }
        AppendValues(e);
        text_ += ")\n";
        FlushText(false);
    }
    Line(3, ")");
    Line(2, ")");
    Line(1, ")");
}

void Nlw_SdfWriter::WriteCell(Nlw_NlBlock* scope, Nlw_NlBlock* cell, const uint32_t* first,
                              const uint32_t* last) {
    Line(1, "(CELL");
    Begin(2);
    text_ += "(CELLTYPE \"";
    text_ += cell->GetTypeName();
    text_ += "\")\n";
    Begin(2);
    text_ += "(INSTANCE ";
    AppendInstancePath(cell, scope);
    text_ += ")\n";
    // Delays first, then checks, each in their own section.
    for (int pass = 0; pass < 2; ++pass) {
        const bool checks = pass == 1;
        bool open = false;
        for (const uint32_t* p = first; p != last; ++p) {
            const Nlw_TimingEntry& e = timing_->entries[*p];
            if (Nlw_Timing::IsCheck(e.kind) != checks) continue;
            if (!open) {
                open = true;
                Line(2, checks ? "(TIMINGCHECK" : "(DELAY");
                if (!checks) Line(3, "(ABSOLUTE");
            }
            Begin(checks ? 3 : 4);
            AppendEntry(e, cell);
            text_ += '\n';
        }
        if (open) {
            if (!checks) Line(3, ")");
            Line(2, ")");
        }
    }
    Line(1, ")");
    FlushText(false);
}

void Nlw_SdfWriter::AppendEntry(const Nlw_TimingEntry& e, Nlw_NlBlock* cell) {
    text_ += '(';
    text_ += Nlw_Timing::Keyword(e.kind);
    text_ += ' ';
    switch (e.kind) {
        case Nlw_TimingKind::IoPath:
            AppendPortTchk(e.pin1, e.edge1, cell);
            text_ += ' ';
            AppendPinPath(e.pin2, cell);
            break;
        case Nlw_TimingKind::Port:
            AppendPinPath(e.pin1, cell);
            break;
        default:
            AppendPortTchk(e.pin1, e.edge1, cell);
            if (e.pin2) {
                text_ += ' ';
                AppendPortTchk(e.pin2, e.edge2, cell);
            }
            break;
    }
    AppendValues(e);
    text_ += ')';
}

void Nlw_SdfWriter::AppendValues(const Nlw_TimingEntry& e) {
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
        text_ += " (";
        if (r.present) {
            for (int f = 0; f < 3; ++f) {
                if (f) text_ += ':';
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
                AppendNumber(v);
            }
        }
        text_ += ')';
    }
}

// A value as a whole number of written units; SDF readers round to their
// own precision, so writing the netlist's precision keeps both in step.
void Nlw_SdfWriter::AppendNumber(double ps) {
    const long long units = std::llround(ps / unit_);
    char* at = text_.Reserve(24);
    text_.Commit(static_cast<size_t>(std::to_chars(at, at + 24, units).ptr - at));
}

void Nlw_SdfWriter::AppendInstancePath(const Nlw_NlBlock* block, const Nlw_NlBlock* scope) {
    // Cells come block by block, so the path of the parent is the one of
    // the entry before, most of the time.
    const Nlw_NlBlock* parent = block->GetParent();
    if (block == scope) return;
    if (parent != scope && parent != nullptr) {
        if (parent != pathOwner_ || scope != pathScope_) {
            pathOwner_ = parent;
            pathScope_ = scope;
            chain_.clear();
            for (const Nlw_NlBlock* b = parent; b && b != scope; b = b->GetParent())
                chain_.push_back(b);
            pathText_.clear();
            for (size_t i = chain_.size(); i-- > 0;) {
                AppendEscapedTo(pathText_, chain_[i]->GetWritableName());
                pathText_ += '/';
            }
        }
        text_ += pathText_;
    }
    AppendEscapedTo(text_, block->GetWritableName());
}

void Nlw_SdfWriter::AppendPinName(const Nlw_NlPin* pin) {
    const char* name = pin->GetWritableName();
    if (pin->IsBused()) {
        // A bus member "D[3]": the base is an identifier, the index stays.
        const char* bracket = std::strrchr(name, '[');
        if (bracket && bracket != name) {
            AppendEscapedTo(text_, name, bracket);
            text_ += bracket;
            return;
        }
    }
    AppendEscapedTo(text_, name);
}

void Nlw_SdfWriter::AppendPinPath(const Nlw_NlPin* pin, const Nlw_NlBlock* scope) {
    const Nlw_NlBlock* block = pin->GetBlock();
    if (block != scope) {
        AppendInstancePath(block, scope);
        text_ += '/';
    }
    AppendPinName(pin);
}

void Nlw_SdfWriter::AppendPortTchk(const Nlw_NlPin* pin, uint8_t edge, const Nlw_NlBlock* scope) {
    const char* word = EdgeWord(edge);
    if (word == nullptr) {
        AppendPinPath(pin, scope);
        return;
    }
    text_ += '(';
    text_ += word;
    text_ += ' ';
    AppendPinPath(pin, scope);
    text_ += ')';
}
