// Reads a design from netlist JSON (the format yosys write_json produces)
// into a view.
#pragma once

#include <memory>
#include <string>

#include "model/Nlw_Nl.h"

struct Nlw_ReadOptions {
    // The top module's name; when null, the module with the "top" attribute,
    // else the single module no other instantiates.
    const char* top = nullptr;
    // Flatten the hierarchy into the top module, joining path names with "/".
    bool flatten = false;
};

class Nlw_JsonReader {
public:
    // Loads the file into the (empty) view and sets the design (named after
    // the top module). On failure issues one error naming the file and the
    // fault, and returns false; every fault of the input is found before the
    // view is touched.
    static bool Load(const char* fileName, const Nlw_ReadOptions& options, Nlw_NlView& view,
                     std::unique_ptr<Nlw_Design>& design);
    // The same from text in memory; fileName names it in messages.
    static bool LoadText(const std::string& text, const char* fileName,
                         const Nlw_ReadOptions& options, Nlw_NlView& view,
                         std::unique_ptr<Nlw_Design>& design);

    // A block made for a cell carries the cell's parameters as its first
    // properties, in file order. When attributes the writers read follow
    // them ("PINNAME", "TYPE"), the block also carries the integer property
    // "NLW_PARAM_COUNT" with the number of parameters. Gives how many of the
    // block's first properties are parameters: that count, or else those
    // before the first property whose name begins with "NLW_" (later passes
    // add only such names).
    static size_t GetParameterCount(const Vdm_PropertyHolder& block);
};
