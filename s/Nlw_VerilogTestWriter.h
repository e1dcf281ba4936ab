// Writes a Verilog test fixture template for the design's root module: a
// module "test" that declares a register or wire per root port, instantiates
// the root module, optionally dumps waveforms, prints a column header above
// the monitored port values and drives the global set/reset and tristate
// signals.
#pragma once

#include <string>
#include <vector>

#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Writer.h"

class Nlw_VerilogTestWriter : public Nlw_Writer {
public:
    Nlw_VerilogTestWriter(Nlw_NetlistWriter* nlw, const char* fileName,
                          Port::Stream::Access access);
    ~Nlw_VerilogTestWriter() override;

    // Writes the file head, then the fixture module for the view's root.
    void WriteView(Nlw_NlView* view, unsigned char flag) override;
    // The fixture module "test" for the root block.
    void WriteBlock(Nlw_NlBlock* root) override;

    // The header grid has this many rows: a port name prints one character
    // per row, so longer names keep only their first characters.
    static constexpr size_t kMaxHeaderRows = 256;

    // Columns of a bus port in the header: the hexadecimal digits of its
    // first dimension.
    static int GetBusColumns(const Nlw_NlBus* bus);

private:
    void WriteTestHeader();
    void WriteChipwideInclude();
    void WriteRegistersAndWires(Nlw_NlBlock* root);
    void WriteGlobalRegister(Nlw_NlSignal* signal, const char* connProperty);
    void WriteUUT(Nlw_NlBlock* root);
    void WriteTimeShm(Nlw_NlBlock* root);
    void WriteVcd(Nlw_NlBlock* root);
    void WriteDumpBlock(const char* suffix, const char* openTask, const char* probeLine);
    void WriteDisplay(Nlw_NlBlock* root);
    void WriteStimulus(Nlw_NlBlock* root);

    // Adds a port's label to the header grid, one character per row, in a
    // column of the given width that starts after `column` earlier columns.
    void AddHeaderLabel(const char* label, size_t column, int width);
    // The name WriteStimulus drives for a global signal, or null.
    const char* GetDriveName(Nlw_NlSignal* signal, const char* connProperty);

    // Calls scalar(pin) for every visible unbused pin of the root in pin
    // order, then bus(bus) for every valid pin bus in list order.
    template <typename ScalarFn, typename BusFn>
    static void ForEachPort(Nlw_NlBlock* root, ScalarFn scalar, BusFn bus) {
        for (Nlw_NlPin& pin : root->GetPins()) {
            if (pin.IsVisible() && !pin.IsBused()) scalar(pin);
        }
        if (const UT_DARRAY<Nlw_NlPinBus*>* buses = root->GetPinBuses()) {
            for (Nlw_NlPinBus* b : *buses) {
                if (b && b->IsValid()) bus(*b);
            }
        }
    }

    // Rows of the header grid. Every label fills its rows from the first
    // one on, so the rows that exist are always rows 0 to size() - 1.
    std::vector<std::string> rows_;
    std::string line_;  // scratch text of one output line
};
