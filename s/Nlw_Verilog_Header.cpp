// The stock netlist head, the run-parameter block and the closing notices.
#include "Nlw_Verilog.h"
#include "Nlw_VerilogWriter.h"
#include "framework/Nlw_Util.h"
#include "framework/Nlw_Writer.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"

namespace {

// A global signal makes the chipwide module necessary when nothing in the
// design drives it and it stands for no pin: the chipwide module then
// provides it.
bool IsUndrivenGlobal(const Nlw_NlSignal* signal) {
    return signal != nullptr && signal->FindDriver(false, false) == nullptr &&
           signal->GetRefPin() == nullptr;
}

}  // namespace

void Nlw_Verilog::WriteHeader(Nlw_Writer* writer) {
    Nlw_Params* params = GetParams();
    if (writer == nullptr || params == nullptr) return;
    if (params->GetEcnMode())
        WriteEcnHeader(writer);
    else if (params->GetStaMode())
        WriteStaHeader(writer);
    else
        WriteSimHeader(writer);

    writer->WriteL(params->GetWritePsTimePrecision() ? "`timescale 1 ns/1 ps"
                                                     : "`timescale 1 ns/10 ps");
    if (params->GetWriteUseLib()) Nlw_VerilogWriter::WriteLibrarySearch(writer, "timcells");
    if (IsChipwideNeeded() && !params->GetWriteTestFile()) IssueChipwideNotice();
    writer->WriteL("");
}

void Nlw_Verilog::WriteSimHeader(Nlw_Writer* writer) {
    writer->WriteL("// This verilog netlist is a simulation model and uses simulation ");
    writer->WriteL("// primitives which may not represent the true implementation of the ");
    writer->WriteL("// device, however the netlist is functionally correct and should not ");
    writer->WriteL("// be modified. This file cannot be synthesized and should only be used ");
    writer->WriteL("// with supported simulation tools.");
    writer->WriteL("");
}

namespace {

void WriteLibraryDisclaimerStart(Nlw_Writer* writer) {
    writer->WriteL("// This verilog netlist is a simulation model and uses library ");
    writer->WriteL("// primitives which may not represent the true implementation of ");
    writer->WriteL("// the device, however the netlist is functionally correct and ");
    writer->WriteL("// should not be modified. This file cannot be synthesized and ");
}

}  // namespace

void Nlw_Verilog::WriteEcnHeader(Nlw_Writer* writer) {
    WriteLibraryDisclaimerStart(writer);
    writer->WriteL("// should only be used with supported equivalence checking tools. ");
    writer->WriteL("");
}

void Nlw_Verilog::WriteStaHeader(Nlw_Writer* writer) {
    WriteLibraryDisclaimerStart(writer);
    writer->WriteL("// should only be used with supported static timing analysis tools. ");
    writer->WriteL("");
}

void Nlw_Verilog::WriteParams(Nlw_Writer* writer) {
    Nlw_Params* params = GetParams();
    if (writer == nullptr || params == nullptr) return;
    Nlw_NlView* view = GetView();
    const int numModules = view ? static_cast<int>(view->GetNumMacros()) : 0;
    const char* device = view ? view->GetDeviceInfo() : nullptr;
    writer->WriteL(
        vorform("// Command      : %s", Nlw_Util::CommentText(params->GetCommandLine()).c_str()));
    writer->WriteL(
        vorform("// Input file   : %s", Nlw_Util::CommentText(params->GetInputFileName()).c_str()));
    writer->WriteL(vorform("// Output file  : %s",
                           Nlw_Util::CommentText(params->GetOutputFileName()).c_str()));
    writer->WriteL(vorform("// Design name  : %s", Nlw_Util::CommentText(GetDesignName()).c_str()));
    writer->WriteL(vorform("// # of Modules : %d", numModules));
    writer->WriteL(
        vorform("// Vornix       : %s", Nlw_Util::CommentText(params->GetVornix()).c_str()));
    writer->WriteL(
        vorform("// Device       : %s", device ? Nlw_Util::CommentText(device).c_str() : "NULL"));
    writer->WriteL("");
}

bool Nlw_Verilog::IsChipwideNeeded() {
    Nlw_NlView* view = GetView();
    if (view == nullptr) return false;
    if (IsUndrivenGlobal(view->GetSetReset())) return true;
    if (IsUndrivenGlobal(view->GetTristate())) return true;
    Nlw_NlBlock* top = view->GetRootMacro();
    return top != nullptr && top->GetPropertyByName("NLW_CHIPWIDE_MODULE") != nullptr;
}

void Nlw_Verilog::IssueChipwideNotice() {
    NLW_MSG().issueInfo(
        "If Verilog simulation is performed outside the Atelier environment, please add the "
        "chipwide module to the simulation invocation command. The simulation chapter of the "
        "design guide, at https://docs.example.org/atelier/simulation, describes the chipwide "
        "module and how to compile it. \n");
}

void Nlw_Verilog::PrintInfoMessage() {
    Nlw_Params* params = GetParams();
    if (params->GetSimMode()) {
        const char* lib = params->GetFuncellMode() ? "FUNCELL" : "TIMCELL";
        NLW_MSG().issueInfo(
            "The generated Verilog netlist contains Vornix %s simulation primitives and has to "
            "be used with %s simulation library for correct compilation and simulation. \n",
            lib, lib);
        if (params->GetWriteSetupHoldNotes()) {
            NLW_MSG().issueInfo(
                "Setup Simulation - To perform a setup simulation, specify values in the Maximum "
                "(MAX) field with the following command line modifier:  -SDFMAX\n");
            NLW_MSG().issueInfo(
                "Hold Simulation - To perform the most accurate hold simulation, specify values "
                "in the Minimum (MIN) field with the following command line modifier:  "
                "-SDFMIN\n");
        }
        NLW_MSG().issueInfo(
            "For more information on how to pass the SDF switches to the simulator, see your "
            "Simulator tool documentation.\n");
    }
    if (IsChipwideNeeded() && !params->GetWriteTestFile()) IssueChipwideNotice();
}
