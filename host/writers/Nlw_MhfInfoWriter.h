// Writes the hierarchy information file of a multiple-hierarchy netlist: for
// every module block its instance path, written module name, the files that
// hold its module and its timing data, and its parent; plus the top and the
// shared files. The format is described in docs/hierarchy-info.md.
#pragma once

#include <string>
#include <unordered_map>

#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Writer.h"

// The files of one multiple-hierarchy run, as its drivers name them. A block
// without an entry, or an empty name, stands for a file that is not written.
struct Nlw_MhfFiles {
    std::unordered_map<const Nlw_NlBlock*, std::string> netlist;  // holds the block's module
    std::unordered_map<const Nlw_NlBlock*, std::string> timing;   // the block's own timing file
    std::string chipwide;
    std::string models;
};

class Nlw_MhfInfoWriter : public Nlw_Writer {
public:
    Nlw_MhfInfoWriter(Nlw_NetlistWriter* nlw, const char* fileName, Port::Stream::Access access);
    ~Nlw_MhfInfoWriter() override;

    // The file names to list; set before WriteView.
    void SetFiles(Nlw_MhfFiles files) { files_ = std::move(files); }

    // The head, the top, the shared files, then one line per module block in
    // the view's stored order (parents before their children); the flag is
    // not used.
    void WriteView(Nlw_NlView* view, unsigned char flag) override;
    // One block line; blocks that are not modules write nothing.
    void WriteBlock(Nlw_NlBlock* block) override;

    // The instance path of a block: the written instance names from the root
    // down, joined by "/".
    static std::string GetInstancePath(const Nlw_NlBlock* block);

private:
    // A field's text: "-" for an empty one; tabs and line ends, which would
    // break the line, become blanks.
    static std::string Field(const std::string& text);
    std::string FileOf(const std::unordered_map<const Nlw_NlBlock*, std::string>& files,
                       const Nlw_NlBlock* block) const;

    Nlw_MhfFiles files_;
};
