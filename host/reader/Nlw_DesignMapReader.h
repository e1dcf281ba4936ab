// Reads the design map file (".qdm"): what the implementation flow did to
// the registers and names of the design between the RTL and the netlist.
// The format is described in docs/design-map.md.
#pragma once

#include <string>
#include <vector>

#include "framework/Nlw_NetlistWriter.h"
#include "model/Nlw_Nl.h"

class Nlw_DesignMapReader {
public:
    // The format name and the one version this reader takes.
    static constexpr const char* kFormat = "nlw-design-map";
    static constexpr int kVersion = 1;
    // Larger files are refused before they are read.
    static constexpr size_t kMaxFileSize = size_t(256) << 20;

    // Reads the file and appends its records, tied to the view's modules,
    // cells and nets, to records. Any problem (unreadable file, not JSON,
    // another format or version, a record that is malformed or names a
    // module, register or net the design does not have) gives one error
    // naming the file and leaves records as they were; returns false then.
    static bool Load(const char* fileName, Nlw_NlView& view, std::vector<AnnoVacuum>& records);
    // The same for a text already in memory; fileName names it in messages.
    static bool LoadText(const std::string& text, const char* fileName, Nlw_NlView& view,
                         std::vector<AnnoVacuum>& records);
};
