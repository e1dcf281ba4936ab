// The host's timing options: delays read from a place-and-route tool's SDF
// file, or nominal delays of the shipped cell library, attached to the
// design so that the writer writes the timing file(s).
#pragma once

#include <memory>
#include <string>

class Nlw_NetlistWriter;
class Nlw_NlView;
class Nlw_Params;
class Nlw_Timing;

struct Nlw_TimingOptions {
    std::string source;                 // -timing: an SDF file, "nominal", or empty
    std::string nets = "interconnect";  // -timing_nets
};

// Checks a -timing_nets value; "" when acceptable, else the problem.
std::string Nlw_CheckTimingNets(const std::string& value);

// Reads the delays the options ask for and attaches them: the design then
// counts as timing-annotated (input type "qda"), the timing file is
// requested, and the module blocks that annotate carry NLW_SDFANNOTATED.
// False after one error (unreadable or malformed timing input, or an
// output timing file that is the input file); nothing has been written.
bool Nlw_AttachTiming(const Nlw_TimingOptions& options, Nlw_Params& params, Nlw_NlView& view,
                      Nlw_NetlistWriter& writer, std::unique_ptr<Nlw_Timing>& timing);

// The help lines of the timing options, after the library's own lines.
void Nlw_PrintTimingHelp();
