// Writes the signal/pin map file: which package pin each top-level signal
// sits on, one line per pad cell of the design.
#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>

#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Writer.h"

class Nlw_PinWriter : public Nlw_Writer {
public:
    Nlw_PinWriter(Nlw_NetlistWriter* nlw, const char* fileName, Port::Stream::Access access);
    ~Nlw_PinWriter() override;

    // Walks the view from its root macro; the flag is not used.
    void WriteView(Nlw_NlView* view, unsigned char flag) override;
    // A macro: walks its children depth-first, keeping the hierarchy path.
    // A pad cell: writes its line. Any other block: nothing.
    void WriteBlock(Nlw_NlBlock* block) override;

    // The device family prefix dropped from device names in the header.
    static const char* const kFamilyPrefix;
    // The device name without the family prefix: both letters when the name
    // starts with them, else the first letter when it matches, in any case.
    static const char* StripFamilyPrefix(const char* device);

    // Read access for tests: the instance path of the macro being walked.
    const std::string& GetHierarchyPath() const { return path_; }

private:
    void WritePinHeader();
    void StripFromParentChain(Nlw_NlBlock* block);
    void EnterMacro(Nlw_NlBlock* block);
    void LeaveMacro(Nlw_NlBlock* block);
    void WritePad(Nlw_NlBlock* block);
    // The first port of the enclosing block among the signal's pins, or null.
    Nlw_NlPin* FindParentPort(Nlw_NlSignal* signal);

    // Writable names of the macro instances below the root down to the one
    // being walked, joined by "/"; empty at top level.
    std::string path_;
    // Pad cells accepted so far; the first one writes the header.
    uint64_t pinCount_ = 0;
    // The port each pad signal reaches (null for none), so that pads sharing
    // a signal do not search its pins again.
    std::unordered_map<const Nlw_NlSignal*, Nlw_NlPin*> portOfSignal_;
};
