// The library cells an installation knows ("cells.dat"): per cell type its
// class (timing or functional model), whether it is a pad, and its pins in
// order with their directions and bus ranges.
#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

struct Nlw_CellPinDef {
    std::string name;
    int dir = 0;  // Nlw_Direction
    bool bus = false;
    int32_t msb = 0;
    int32_t lsb = 0;
    bool pad = false;  // the pad pin of a pad cell

    int32_t Width() const { return bus ? (msb > lsb ? msb - lsb : lsb - msb) + 1 : 1; }
};

struct Nlw_CellDef {
    std::string name;
    bool timcell = false;
    bool funcell = false;
    bool pad = false;
    std::vector<Nlw_CellPinDef> pins;
};

class Nlw_CellLibrary {
public:
    // Reads the file. On a fault returns false with error describing it
    // (the line number and what is wrong), and keeps what came before.
    bool Load(const char* path, std::string& error);
    // Parses text in memory; origin names it in error texts.
    bool Parse(const std::string& text, const char* origin, std::string& error);

    // The cell of that name (exact, Verilog names are case sensitive), or null.
    const Nlw_CellDef* Find(const std::string& name) const;
    size_t size() const { return cells_.size(); }
    const std::vector<Nlw_CellDef>& GetCells() const { return cells_; }

    // The widest bus pin a cell may have (2^24 bits).
    static constexpr int64_t kMaxBusWidth = int64_t(1) << 24;

private:
    std::vector<Nlw_CellDef> cells_;
    std::unordered_map<std::string, size_t> index_;
};
