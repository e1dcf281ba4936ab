// Writes an equivalence checker's guidance file (assertions) from the
// design map records: registers removed as constant, registers merged into
// another, names changed between the RTL and the netlist. What each part of
// the file says comes from the tool's device data set (its "FLOW" list and
// one text per key); see docs/assertions.md.
#pragma once

#include <string>
#include <vector>

#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Writer.h"

class PM_DEVKEY;

class Nlw_AssertionWriter : public Nlw_Writer {
public:
    Nlw_AssertionWriter(Nlw_NetlistWriter* nlw, PM_DEVKEY* devkey, const char* fileName,
                        Port::Stream::Access access);
    ~Nlw_AssertionWriter() override;

    // Writes every part of the FLOW list in order, so that the file is whole
    // whichever pass of the driver writes it last.
    void WriteAFW(std::vector<AnnoVacuum> records);

    // The records are the writer's input: a view alone writes nothing.
    void WriteView(Nlw_NlView* view, unsigned char flag) override;
    void WriteBlock(Nlw_NlBlock* block) override;

    // A part's text with its fields filled in for one record (null: the
    // fields of the design only).
    std::string Fill(const char* text, const AnnoVacuum* record) const;
    // The record kind a FLOW key names, or -1 for a key written once.
    static int KindOfKey(const char* key);

private:
    PM_DEVKEY* devkey_;
};
