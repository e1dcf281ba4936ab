// The guidance file: each FLOW key of the tool's device data is one part,
// written from that key's text with the names the netlist writes.
#include "writers/Nlw_AssertionWriter.h"

#include <cstring>

#include "model/Nlw_Nl.h"
#include "port/PM.h"
#include "port/Port.h"
#include "port/UT.h"

Nlw_AssertionWriter::Nlw_AssertionWriter(Nlw_NetlistWriter* nlw, PM_DEVKEY* devkey,
                                         const char* fileName, Port::Stream::Access access)
    : Nlw_Writer(nlw, fileName, access), devkey_(devkey) {}

Nlw_AssertionWriter::~Nlw_AssertionWriter() = default;

void Nlw_AssertionWriter::WriteView(Nlw_NlView*, unsigned char) {}
void Nlw_AssertionWriter::WriteBlock(Nlw_NlBlock*) {}

int Nlw_AssertionWriter::KindOfKey(const char* key) {
    static const char* const kKinds[] = {"constant", "merged", "renamed"};
    for (int kind = AnnoVacuum::Constant; kind <= AnnoVacuum::Renamed; ++kind)
        if (UT_STR::ICompare(key, kKinds[kind]) == 0) return kind;
    return -1;
}

std::string Nlw_AssertionWriter::Fill(const char* text, const AnnoVacuum* record) const {
    Nlw_NetlistWriter* nlw = GetNlw();
    // Names as the netlist writes them; Escape's result is a shared buffer,
    // copied at once.
    auto escape = [nlw](const char* name, bool bused) {
        return std::string(nlw ? nlw->Escape(name, bused) : name);
    };
    const Nlw_Design* design = nlw ? nlw->GetDesign() : nullptr;
    std::string out;
    for (const char* p = text; *p; ++p) {
        if (*p != '%' || p[1] == '\0') {
            out += *p;
            continue;
        }
        const char field = *++p;
        if (field == '%') {
            out += '%';
        } else if (field == 'd') {
            out += design ? design->GetName() : "";
        } else if (record == nullptr) {
            // A part written once has no record to take the field from.
        } else if (field == 'm') {
            out += record->module ? escape(record->module->GetName(), false) : "";
        } else if (field == 'r') {
            out += escape(record->original.c_str(), true);
        } else if (field == 'v') {
            out += record->value;
        } else if (field == 't') {
            if (record->cell) out += escape(record->cell->GetWritableName(), false);
            if (record->net) out += escape(record->net->GetWritableName(), record->net->IsBused());
        } else if (field == 'k') {
            out += record->net ? "net" : "cell";
        } else {
            out += '%';
            out += field;
        }
    }
    return out;
}

void Nlw_AssertionWriter::WriteAFW(std::vector<AnnoVacuum> records) {
    if (devkey_ == nullptr) return;
    for (int index = 0;; ++index) {
        const char* key = devkey_->getstringbykey("FLOW", ",", index, nullptr, 0);
        if (key == nullptr) break;
        const char* text = devkey_->getstringbykey(key, ",", 0, nullptr, 0);
        if (text == nullptr) {
            NLW_MSG().issueError("Device data file '%s' has no text for FLOW key '%s'.\n",
                                 devkey_->GetFileName(), key);
            continue;
        }
        const int kind = KindOfKey(key);
        if (kind < 0) {
            WriteL(Fill(text, nullptr).c_str());
            continue;
        }
        for (const AnnoVacuum& record : records)
            if (record.kind == kind) WriteL(Fill(text, &record).c_str());
    }
}
