// Shared set-up of the netlist writer tests: an installation root in a
// temporary directory, a view with its builder, parameters, and writers that
// collect their text in memory.
#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <memory>
#include <string>

#include "Nlw_Verilog.h"
#include "Nlw_VerilogWriter.h"
#include "framework/Nlw_Params.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_NlBuilder.h"
#include "port/Port.h"

namespace vwtest {

// Sets (or, with null, unsets) an environment variable while it lives.
class ScopedEnv {
public:
    ScopedEnv(const char* name, const char* value) : name_(name) {
        if (const char* old = getenv(name)) {
            had_ = true;
            old_ = old;
        }
        Set(value);
    }
    ~ScopedEnv() { Set(had_ ? old_.c_str() : nullptr); }
    ScopedEnv(const ScopedEnv&) = delete;
    ScopedEnv& operator=(const ScopedEnv&) = delete;

    void Set(const char* value) {
        if (value)
            setenv(name_.c_str(), value, 1);
        else
            unsetenv(name_.c_str());
        if (name_ == "VORNIX") Port::VornixPath::Reset();
    }

private:
    std::string name_;
    std::string old_;
    bool had_ = false;
};

// A directory below the system's temporary directory, removed with its
// contents at the end.
class TempDir {
public:
    TempDir() {
        std::string pattern =
            (std::filesystem::temp_directory_path() / "nlw_vwtest_XXXXXX").string();
        path_ = mkdtemp(pattern.data()) ? pattern : std::string();
    }
    ~TempDir() {
        std::error_code ec;
        std::filesystem::remove_all(path_, ec);
    }
    TempDir(const TempDir&) = delete;
    TempDir& operator=(const TempDir&) = delete;

    const std::string& Path() const { return path_; }
    // Writes a file below the directory, creating its parents.
    std::string File(const std::string& rel, const std::string& content) const {
        std::filesystem::path p = std::filesystem::path(path_) / rel;
        std::filesystem::create_directories(p.parent_path());
        std::ofstream(p, std::ios::binary) << content;
        return p.string();
    }
    std::string Dir(const std::string& rel) const {
        std::filesystem::path p = std::filesystem::path(path_) / rel;
        std::filesystem::create_directories(p);
        return p.string();
    }

private:
    std::string path_;
};

// Everything a writer needs, with an empty installation root: no device
// data, no property filter, no library sources.
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
