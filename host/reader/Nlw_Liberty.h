// The timing arcs of a cell library from its Liberty file: enough of the
// format to take pins, arcs and scalar delays and limits, as the shipped
// library's file (share/data/nlw_cells.lib) writes them.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "framework/Nlw_Timing.h"

struct Nlw_LibertyArc {
    std::string pin;      // the output of a path, the checked input of a check
    std::string related;  // the path's input, the check's reference
    // IoPath for a delay; Setup, Hold, Recovery or Removal for a check.
    Nlw_TimingKind kind = Nlw_TimingKind::IoPath;
    uint8_t edge = NLW_EDGE_NONE;  // of the related pin
    double rise = 0, fall = 0;     // picoseconds
    bool hasRise = false, hasFall = false;
};

class Nlw_Liberty {
public:
    // Reads the file; false after one error naming the file and line.
    bool Load(const char* fileName);
    bool LoadText(const char* fileName, const std::string& text);
    // The arcs of a cell in file order, or null for a cell it does not have.
    const std::vector<Nlw_LibertyArc>* FindCell(const std::string& name) const;
    size_t GetNumCells() const { return cells_.size(); }

private:
    std::map<std::string, std::vector<Nlw_LibertyArc>> cells_;
};
