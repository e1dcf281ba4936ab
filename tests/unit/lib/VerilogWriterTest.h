// Shared set-up of the netlist writer tests: an installation root in a
// temporary directory, a view with its builder, parameters, and writers that
// collect their text in memory.
#pragma once

#include <memory>

#include "Nlw_Verilog.h"
#include "Nlw_VerilogWriter.h"
#include "TestFiles.h"
#include "framework/Nlw_Params.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_NlBuilder.h"

namespace vwtest {

using namespace nlwtest;

// The error of a run without an installation root.
const char* const kNoVornix =
    " The VORNIX environment variable must be set for this program towork. Please check your "
    "environment to ensure that it is setup properly to use the Vornix tools\n";

// Everything a writer needs, with an empty installation root (no device
// data, no property filter, no library sources) and a root instance top.
class WriterTest : public ::testing::Test {
protected:
    WriterTest()
        : vornix_("VORNIX", root_.Path().c_str()),
          stamp_("NLW_TIMESTAMP", "Thu Jan  1 00:00:00 2026"),
          defparm_("NLW_VERILOG_DEFPARM", nullptr),
          oldPfd_("NLW_OLD_PFD", nullptr),
          noSdf_("VOR_SIMMODEL_DISABLE_SDF_ANNOTATE", nullptr) {
        nlw_.SetParams(&params_);
        nlw_.SetView(&view_);
        nlw_.SetDesign(&design_);
        params_.SetOutputFileName("top.v");
    }

    std::unique_ptr<Nlw_VerilogWriter> MakeWriter() {
        return std::make_unique<Nlw_VerilogWriter>(&nlw_, "memory.v", Port::Stream::Memory);
    }
    // One module definition as written by WriteBlock.
    std::string Module(Nlw_NlBlock* block) {
        auto writer = MakeWriter();
        writer->WriteBlock(block);
        return writer->GetMemoryText();
    }
    // The whole single-file netlist.
    std::string View() {
        auto writer = MakeWriter();
        writer->WriteView(&view_, 0);
        return writer->GetMemoryText();
    }

    TempDir root_;
    ScopedEnv vornix_, stamp_, defparm_, oldPfd_, noSdf_;
    Nlw_NlView view_;
    Nlw_NlBuilder b_{&view_};
    Nlw_NlBlock* top_ = b_.CreateRoot(b_.AddModuleType("top"), "top");
    Nlw_Params params_;
    Nlw_Design design_{"demo"};
    Nlw_Verilog nlw_;
};

// The text after the file head (everything up to the empty line after the
// time scale and library lines).
inline std::string AfterHead(const std::string& text) {
    size_t pos = text.find("`timescale");
    if (pos == std::string::npos) return text;
    pos = text.find("\n\n", pos);
    return pos == std::string::npos ? text : text.substr(pos + 2);
}

}  // namespace vwtest
