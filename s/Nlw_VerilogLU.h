// Makes the names of a view legal Verilog before it is written.
#pragma once

#include "framework/Nlw_Nl_LU.h"

class Nlw_Verilog;

class Nlw_VerilogLU : public Nlw_Nl_LU {
public:
    // The host part gets (view, third, fourth, fifth, first); second is
    // writeEscapedNames.
    Nlw_VerilogLU(Nlw_Verilog* nlw, Nlw_NlView* view, bool first, bool second, bool third,
                  bool fourth, bool fifth);
    Nlw_VerilogLU(const Nlw_VerilogLU& other);
    Nlw_VerilogLU& operator=(const Nlw_VerilogLU& other);

    // With escaping on, only a space is illegal (an escaped identifier cannot
    // hold one); with escaping off, every character outside the simple
    // identifier rule is. Names already escaped are legal as they stand.
    bool IsLegal(Port::String name, bool isBused) override;
    // Replaces each illegal character with "_": the result has the length of
    // the name given, and a bus-bit name keeps its index.
    Port::String Legalize(Port::String name, bool isBused) override;

    bool writeEscapedNames = true;
    Nlw_Verilog* nlw = nullptr;

protected:
    bool UsesEscapedNames() const override { return writeEscapedNames; }
    // When neither this class nor the writer asked is one derived from it:
    // a derived class may answer its own way.
    bool AnswersOnTwoThreads() const override;
};
