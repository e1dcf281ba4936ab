// The host legalizer: walks every name of a view, asks a format whether it is
// legal and replaces it with the format's legal form where it is not. The
// keyword cache holds the names a format reserves.
#pragma once

#include <string>
#include <unordered_set>

#include "Nlw_Nl.h"
#include "Port.h"

class Nlw_Nl_SpkCache {
public:
    // Builds the process-wide keyword cache from a null-terminated table.
    // The cache holds the table plus the keywords of the later Verilog and
    // SystemVerilog standards (and "bool"), compared exactly (Verilog is case
    // sensitive).
    static void MakeSpkCache(const char** words, bool flag);
    static bool IsKeyword(const char* name);
    static bool IsBuilt();
    static void Clear();
};

class Nlw_Nl_LU {
public:
    // The flags: legalize module types, legalize instance names and ports,
    // legalize library cell pins (never done when false), bridge (keep the
    // original name as the also-known-as name of a renamed object).
    Nlw_Nl_LU(Nlw_NlView* view, bool types, bool names, bool cellPins, bool bridge);
    virtual ~Nlw_Nl_LU() = default;
    Nlw_Nl_LU(const Nlw_Nl_LU&) = default;
    Nlw_Nl_LU& operator=(const Nlw_Nl_LU&) = default;

    virtual bool IsLegal(Port::String name, bool isBused) = 0;
    virtual Port::String Legalize(Port::String name, bool isBused) = 0;

    // Visits module type names, then for each macro block its instances,
    // ports, port buses, signals and signal buses.
    void Process();

protected:
    Nlw_NlView* view_ = nullptr;
    bool types_ = true;
    bool names_ = true;
    bool cellPins_ = false;
    bool bridge_ = true;
};
