// The timing file writer: the delays of a timing-annotated design as SDF
// 3.0, named as the netlist names them.
#pragma once

#include <string>
#include <unordered_map>
#include <vector>

#include "framework/Nlw_TextBuffer.h"
#include "framework/Nlw_Timing.h"
#include "framework/Nlw_Writer.h"

class Nlw_SdfWriter : public Nlw_Writer {
public:
    Nlw_SdfWriter(Nlw_NetlistWriter* nlw, const char* fileName, Port::Stream::Access access);

    // The whole design in one file: instance paths from the top module.
    void WriteView(Nlw_NlView* view, unsigned char flag) override;
    // The entries of one module block (its own cells and the nets it
    // encloses), with instance paths relative to the block: the file that
    // block's $sdf_annotate reads in a netlist of one file per module.
    void WriteMHBlock(Nlw_NlBlock* block);
    void WriteBlock(Nlw_NlBlock* block) override { WriteMHBlock(block); }

    // True, after an error, when fileName is the timing file the design's
    // delays were read from: writing it would destroy the input.
    static bool IsTimingSource(Nlw_NetlistWriter* nlw, const char* fileName);

    // A name as an SDF identifier: every character other than a letter, a
    // digit or "_" is escaped with a backslash.
    static std::string EscapeName(const char* name);

private:
    void WriteHead(Nlw_NlBlock* scope);
    // Writes the entries listed (indexes into the timing data), paths
    // relative to scope.
    void WriteEntries(Nlw_NlBlock* scope, const std::vector<uint32_t>& list);
    // Lines are formatted straight into the text block: Begin indents a
    // line of the given depth, Line writes a whole one; FlushText hands the
    // block to the file when it is large (or always).
    void Begin(int depth);
    void Line(int depth, const char* text);
    void FlushText(bool always);
    void WriteNets(Nlw_NlBlock* scope, const std::vector<uint32_t>& nets);
    void WriteCell(Nlw_NlBlock* scope, Nlw_NlBlock* cell, const uint32_t* first,
                   const uint32_t* last);
    // The pieces of a line, appended to the text block; paths relative to
    // scope.
    void AppendEntry(const Nlw_TimingEntry& e, Nlw_NlBlock* cell);
    // " (v:v:v)" for each rvalue, with the net delay added when the design
    // asks for net delays folded into paths.
    void AppendValues(const Nlw_TimingEntry& e);
    void AppendNumber(double ps);
    // "a/b/c" of the written instance names from below scope down to block.
    void AppendInstancePath(const Nlw_NlBlock* block, const Nlw_NlBlock* scope);
    void AppendPinName(const Nlw_NlPin* pin);
    void AppendPinPath(const Nlw_NlPin* pin, const Nlw_NlBlock* scope);
    void AppendPortTchk(const Nlw_NlPin* pin, uint8_t edge, const Nlw_NlBlock* scope);
    void MakeNetDelayIndex();

    Nlw_Timing* timing_ = nullptr;
    Nlw_TextBuffer text_;
    // The escaped path, with its final "/", of the last parent block met.
    const Nlw_NlBlock* pathOwner_ = nullptr;
    const Nlw_NlBlock* pathScope_ = nullptr;
    Nlw_TextBuffer pathText_;
    std::vector<const Nlw_NlBlock*> chain_;  // work space of the path
    double unit_ = 1.0;                      // picoseconds per written unit
    // For folding net delays into paths: the interconnect entry that drives
    // each input pin.
    std::unordered_map<const Nlw_NlPin*, uint32_t> netDelayOf_;
};
