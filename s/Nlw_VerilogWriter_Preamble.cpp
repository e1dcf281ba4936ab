// What a netlist file holds besides its modules: the commented file head,
// the time scale and library directives, and the timing annotation statement
// of a module.
#include <string>

#include "Nlw_VerilogWriter.h"
#include "framework/Nlw_Params.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "port/UT.h"

namespace {

const char* const kRule =
    "////////////////////////////////////////////////////////////////////////////////";
const char* const kSeparator = "//             ";

}  // namespace

const char* const Nlw_VerilogWriter::kNoVornixError =
    " The VORNIX environment variable must be set for this program towork. Please check your "
    "environment to ensure that it is setup properly to use the Vornix tools\n";

namespace {

const char* DesignName(Nlw_NetlistWriter* nlw) {
    return nlw->GetDesign() ? nlw->GetDesign()->GetName() : "";
}

// Disclaimer blocks of the short module-file head.
const char* const kSimDisclaimer[] = {
    "// This verilog netlist is a simulation model and uses simulation ",
    "// primitives which may not represent the true implementation of the ",
    "// device, however the netlist is functionally correct and should not ",
    "// be modified. This file cannot be synthesized and should only be used ",
    "// with supported simulation tools.",
};
const char* const kEcnDisclaimer[] = {
    "// This verilog netlist is a simulation model and uses library ",
    "// primitives which may not represent the true implementation of ",
    "// the device, however the netlist is functionally correct and ",
    "// should not be modified. This file cannot be synthesized and ",
    "// should only be used with supported equivalence checking tools. ",
};
const char* const kStaDisclaimerLast =
    "// should only be used with supported static timing analysis tools. ";

}  // namespace

void Nlw_VerilogWriter::WriteNoticeAndEmblem(Nlw_Writer* writer, const char* fileName) {
    Nlw_NetlistWriter* nlw = writer->GetNlw();
    writer->WriteL(kRule);
    writer->WriteL("// Copyright (c) Vornix. All rights reserved.");
    writer->WriteL(kRule);

    // The emblem: a chip with its pins; the labels start in column 19. A
    // drawing line without a label carries no trailing blanks.
    static const char* const kDrawing[] = {"//    +------+    ", "//  --|      |--  ",
                                           "//  --|  VX  |--  ", "//  --|      |--  ",
                                           "//    +------+    "};
    std::string labels[5];
    size_t count = 0;
    labels[count++] = "Vendor: Vornix";
    labels[count++] = "Version: " + Nlw_Util::CommentText(nlw->GetApplicationVersion());
    labels[count++] = "Application: " + Nlw_Util::CommentText(nlw->GetApplicationName());
    if (fileName) labels[count++] = "Filename: " + Nlw_Util::CommentText(fileName);
    labels[count++] = "Timestamp: " + Nlw_Util::CommentText(Nlw_Util::GetTimeStampString(1));

    writer->WriteL("//");
    writer->WriteL("//       | |");
    for (size_t i = 0; i < 5; ++i) {
        std::string line = kDrawing[i];
        if (labels[i].empty())
            line.erase(line.find_last_not_of(' ') + 1);
        else
            line += labels[i];
        writer->WriteL(line.c_str());
    }
    writer->WriteL("//       | |");
    writer->WriteL("//");
}

void Nlw_VerilogWriter::WriteNewHeader(Nlw_NlBlock* block) {
    Nlw_NetlistWriter* nlw = GetNlw();
    Nlw_Params* params = GetParams();
    Nlw_NlView* view = block ? block->GetView() : nlw->GetView();

    const std::string fileName =
        std::string(UT_STR::OrEmpty(block ? block->GetFileBaseName() : nullptr)) + ".v";
    WriteNoticeAndEmblem(this, fileName.c_str());

    WriteL(kSeparator);
    WriteL(vorform("// Command\t: %s", Nlw_Util::CommentText(params->GetCommandLine()).c_str()));
    WriteL(vorform("// Device\t: %s",
                   Nlw_Util::CommentText(view ? view->GetDeviceInfo() : nullptr).c_str()));
    WriteL(
        vorform("// Input file\t: %s", Nlw_Util::CommentText(params->GetInputFileName()).c_str()));
    WriteL(vorform("// Output file\t: %s",
                   Nlw_Util::CommentText(params->GetOutputFileName()).c_str()));
    WriteL(vorform("// # of Modules\t: %d", view ? static_cast<int>(view->GetNumMacros()) : 0));
    WriteL(vorform("// Design Name\t: %s", Nlw_Util::CommentText(DesignName(nlw)).c_str()));
    if (block && block->GetParent())
        WriteL(vorform("// Module Name: %s", Nlw_Util::CommentText(block->GetTypeName()).c_str()));
    WriteL(vorform("// Vornix        : %s", Nlw_Util::CommentText(params->GetVornix()).c_str()));
    WriteL(kSeparator);
    WriteL("// Purpose:    ");

    if (params->GetEcnMode()) {
        WriteL("//     This verilog netlist is a verification model and uses library ");
        WriteL("//     primitives which may not represent the true implementation of ");
        WriteL("//     the device, however the netlist is functionally correct and ");
        WriteL("//     should not be modified. This file cannot be synthesized and ");
        WriteL("//     should only be used with supported equivalence checking tools.");
    }
    if (params->GetSimMode()) {
        WriteL("//     This verilog netlist is a verification model and uses simulation ");
        WriteL("//     primitives which may not represent the true implementation of the ");
        WriteL("//     device, however the netlist is functionally correct and should not ");
        WriteL("//     be modified. This file cannot be synthesized and should only be used ");
        WriteL("//     with supported simulation tools.");
    }
    if (params->GetStaMode()) {
        WriteL("//     This verilog netlist is a verification model and uses library ");
        WriteL("//     primitives which may not represent the true implementation of ");
        WriteL("//     the device, however the netlist is functionally correct and ");
        WriteL("//     should not be modified. This file cannot be synthesized and ");
        WriteL("//     should only be used with supported static timing analysis tools.");
    }

    WriteL(kSeparator);
    WriteL("// Reference:  ");
    // Static timing users need only the netlist guide.
    Write("//     Vornix Netlist Writer User Guide", 0, 0);
    if (params->GetStaMode())
        WriteL("");
    else
        WriteL(" and Vornix Simulation Library Guide");

    WriteL(kSeparator);
    WriteL(kRule);
    WriteL("");

    WriteL(params->GetWritePsTimePrecision() ? "`timescale 1 ns/1 ps" : "`timescale 1 ns/10 ps");
    if (params->GetWriteUseLib())
        WriteLibrarySearch(this, params->GetFuncellMode() ? "funcells" : "timcells");
    WriteL("");
}

void Nlw_VerilogWriter::WriteLibrarySearch(Nlw_Writer* writer, const char* libraryName) {
    // The directive names the first installation root that holds the
    // library's sources; without one it is left out and the user is told why.
    if (Port::VornixPath::GetInstance().size() == 0) {
        NLW_MSG().issueError("%s", kNoVornixError);
    } else {
        const std::string dir =
            Port::VornixPath::FindDirectory(vorform("verilog/src/%s", libraryName));
        if (!dir.empty()) {
            writer->WriteL(vorform("`uselib dir=%s libext=.v", dir.c_str()));
            return;
        }
    }
    NLW_MSG().issueError(
        "Timcell library directory not found, the `uselib constructis omitted for the -ul "
        "option.\n");
}

void Nlw_VerilogWriter::WriteSdfAnnotate(Nlw_NlBlock* block) {
    Nlw_Params* params = GetParams();
    if (!block->GetPropertyByName("NLW_SDFANNOTATED") || !params->GetSdfAnnotate() ||
        Port_Env::GetEnv("VOR_SIMMODEL_DISABLE_SDF_ANNOTATE"))
        return;

    std::string name = UT_STR::OrEmpty(params->GetSdfPath());
    if (!name.empty()) name += '/';
    if (params->GetMHFMode()) {
        name += UT_STR::OrEmpty(block->GetFileBaseName());
    } else {
        // A netlist of one file has one timing file, which its driver names
        // after the netlist file, not after the module.
        const std::string output =
            UT_PATH::InternalPath(UT_STR::OrEmpty(params->GetOutputFileName()));
        name += UT_PATH::GetBase(output.c_str());
    }
    name += ".sdf";
    name = UT_PATH::InternalPath(name.c_str());

    // The name goes into a string literal: a quote, a backslash or a line
    // break in it must not end or break the literal.
    line_ = "initial $sdf_annotate(\"";
    for (char c : name) {
        switch (c) {
            case '"':
            case '\\':
                line_ += '\\';
                line_ += c;
                break;
            case '\n':
                line_ += "\\n";
                break;
            case '\r':
                line_ += "\\r";
                break;
            default:
                line_ += c;
        }
    }
    line_ += "\");";
    WriteIL(line_.c_str());
}

void Nlw_VerilogWriter::WriteMHHeader(Nlw_NlBlock* block) {
    Nlw_NetlistWriter* nlw = GetNlw();
    Nlw_Params* params = GetParams();

    WriteL(vorform("// Vornix Verilog netlist produced by %s application (version %s)",
                   UT_STR::OrEmpty(nlw->GetApplicationName()),
                   UT_STR::OrEmpty(nlw->GetApplicationVersion())));
    WriteL("// This netlist is one of multiple netlists created for the");
    WriteL("// design using tessel's write multiple hierarchy files option.");
    WriteL("");
    WriteL(vorform("// Design name : %s", Nlw_Util::CommentText(DesignName(nlw)).c_str()));
    WriteL(vorform("// Module name : %s",
                   Nlw_Util::CommentText(block ? block->GetTypeName() : nullptr).c_str()));
    WriteL("");

    if (params->GetEcnMode()) {
        for (const char* text : kEcnDisclaimer) WriteL(text);
    } else if (params->GetStaMode()) {
        for (int i = 0; i < 4; ++i) WriteL(kEcnDisclaimer[i]);
        WriteL(kStaDisclaimerLast);
    } else {
        for (const char* text : kSimDisclaimer) WriteL(text);
    }
    WriteL("");

    WriteL(params->GetWritePsTimePrecision() ? "`timescale 1 ns/1 ps" : "`timescale 1 ns/10 ps");
    if (params->GetWriteUseLib()) WriteLibrarySearch(this, "timcells");
    WriteL("");
}
