// The host legalizer: walks every name of a view, asks a format whether it is
// legal and replaces it with the format's legal form where it is not. The
// keyword cache holds the names a format reserves.
#pragma once

#include <cstddef>
#include <string>
#include <unordered_set>

#include "model/Nlw_Nl.h"
#include "port/Port.h"

class Nlw_Nl_SpkCache {
public:
    // Builds the process-wide keyword cache from a null-terminated table.
    // The cache holds the table plus the keywords of the later Verilog and
    // SystemVerilog standards (and "bool"), compared exactly (Verilog is case
    // sensitive). With flag true the cache is built afresh; with false the
    // table is added to the words the cache already holds.
    static void MakeSpkCache(const char** words, bool flag);
    static bool IsKeyword(const char* name);
    static bool IsKeyword(const char* name, size_t len);
    static bool IsBuilt();
    static void Clear();
};

class Nlw_Nl_LU {
public:
    // The flags: legalize module types, legalize instance names and ports
    // (with the signals and buses of every macro), legalize library cell
    // pins (never done when false; when true, once per cell type for all its
    // instances), bridge (keep the original name as the also-known-as name
    // of a renamed object).
    Nlw_Nl_LU(Nlw_NlView* view, bool types, bool names, bool cellPins, bool bridge);
    virtual ~Nlw_Nl_LU() = default;
    Nlw_Nl_LU(const Nlw_Nl_LU&) = default;
    Nlw_Nl_LU& operator=(const Nlw_Nl_LU&) = default;

    virtual bool IsLegal(Port::String name, bool isBused) = 0;
    virtual Port::String Legalize(Port::String name, bool isBused) = 0;

    // Visits module type names, then for each macro block its instances,
    // ports, port buses, signals and signal buses. Besides the format's
    // legal form, a name equal to a keyword of the cache is escaped (when
    // UsesEscapedNames) or renamed, names longer than kMaxNameLength are
    // shortened, and names are made unique where Verilog declares them:
    // module types (library cell types keep theirs), and within a macro its
    // ports, nets and instances, which share one namespace. A port and its
    // own inside signal may keep one name. The later object gets "name_N"
    // with the smallest free N. Bus members follow their bus's name.
    void Process();
    // A module type name the walk keeps free for a module written beside
    // the design's (the device's chipwide module): a design module of that
    // name is renamed.
    void ReserveTypeName(const char* name) { reservedTypes_.insert(name); }

    // The longest name the walk leaves; a bus name leaves room for the
    // index of its members.
    static constexpr size_t kMaxNameLength = 2047;

protected:
    // Whether names will be escaped when written; a format that escapes
    // tells the walk so.
    virtual bool UsesEscapedNames() const { return true; }
    // Whether IsLegal and Legalize may be asked from two threads at once:
    // the macros of a large view are then walked on two.
    virtual bool AnswersOnTwoThreads() const { return false; }

    Nlw_NlView* view_ = nullptr;
    bool types_ = true;
    bool names_ = true;
    bool cellPins_ = false;
    bool bridge_ = true;

private:
    std::unordered_set<std::string> reservedTypes_;
    // The format's legal form of a name, escaped when it is a keyword (and
    // keywords is set) and names are escaped, and shortened to limit. True
    // with the new name in out when the name changes. Without formatRule the
    // format's own rule is not asked: library cell type names are written
    // escaped whatever the setting, and only what no escaped name can hold
    // (breaking characters, emptiness, length) is changed.
    bool Prepare(const char* name, bool isBused, bool keywords, size_t limit, std::string& out,
                 bool formatRule = true);
    void ProcessTypes();
    void ProcessMacros();
    void ProcessMacro(Nlw_NlBlock* macro);
    void ProcessCellPins();
};
