// Writes the translation file of a static timing netlist: how the top
// module's ports, its visible nets, the library cell instances and the clock
// components of the top level are named in the netlist.
#pragma once

#include <unordered_set>

#include "Nlw_PcsComp.h"
#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Writer.h"

class Nlw_PcsWriter : public Nlw_Writer {
public:
    Nlw_PcsWriter(Nlw_NetlistWriter* nlw, const char* fileName, Port::Stream::Access access);
    ~Nlw_PcsWriter() override;

    // The flag is not used.
    void WriteView(Nlw_NlView* view, unsigned char flag) override;
    // The records of one child block, as WriteInstanceInfo.
    void WriteBlock(Nlw_NlBlock* block) override;

    // The clock tracer.
    // The first input pin of the block, in pin order, whose writable name
    // equals name (compared with comparison kind 1); null when none.
    Nlw_NlPin* GetInputPin(Nlw_NlBlock* block, const Port::String& name);
    // The top-level input port that feeds pin through buffers, inverters and
    // clock devices, or null. Updates comp on the way.
    Nlw_NlPin* GetPrimaryClock(Nlw_NlPin* pin, Nlw_PcsComp& comp);
    // Records block and pin as comp's clock device unless one is recorded
    // already: the device nearest the component stays.
    void UpdateCompClockDevice(Nlw_PcsComp& comp, Nlw_NlBlock* block, Nlw_NlPin* pin);

    // The pin most recently found by the tracer; null after a failed trace.
    Nlw_NlPin* GetLastPrimaryClock() const { return lastPrimaryClock_; }

private:
    // Lets the unit tests reach the record writers.
    friend struct Nlw_PcsWriterTestPeer;

    void WritePcsHeader();
    void WriteTopModuleInfo(Nlw_NlBlock* block);
    void WriteNetInfo(Nlw_NlBlock* macro);
    void WriteInstanceInfo(Nlw_NlBlock* block);
    void WriteRenameInfo(Nlw_NlBlock* block);
    void WriteBlockramInfo(Nlw_NlBlock* block);
    void WriteDualrateflopInfo(Nlw_NlBlock* block);

    // Clock component records.
    void WriteBufgmuxInfo(Nlw_NlBlock* block);
    void WriteCkbufInfo(Nlw_NlBlock* block);
    void WriteDcmInfo(Nlw_NlBlock* block);
    // "INST#<type>=<cell>", the start of every clock component record.
    Port::String GetComponentHead(Nlw_NlBlock* block);
    // True when the block sits directly in the top module.
    static bool IsTopLevel(const Nlw_NlBlock* block);

    // Names as the records pair them: "aka?writable", or the writable name
    // alone when there is no also-known-as name; "" for null.
    Port::String GetCellName(Nlw_NlBlock* block);
    Port::String GetPortName(Nlw_NlPin* pin);
    Port::String GetNetName(Nlw_NlSignal* signal);
    Port::String GetTypeName(Nlw_NlBlock* block);
    bool IsVisible(Nlw_NlSignal* signal);

    Nlw_NlPin* lastPrimaryClock_ = nullptr;
    // The input pins the current trace has started from, so that a loop of
    // buffers or inverters ends the trace instead of running forever.
    std::unordered_set<const Nlw_NlPin*> visited_;
};
