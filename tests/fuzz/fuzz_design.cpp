// libFuzzer target: reads a design from netlist JSON and writes every file a
// run can write (netlist, pin map, test fixture, translation file) into
// memory. The first byte of an input chooses the run's options, the rest is
// the design; seeds without that byte still parse as designs.
//
// Built by `make fuzz` with clang and AddressSanitizer/UBSan.
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <string>

#include "Nlw_Verilog.h"
#include "framework/Nlw_Params.h"
#include "framework/Nlw_Util.h"
#include "port/Port.h"
#include "reader/Nlw_JsonReader.h"
#include "reader/Nlw_Prep.h"

namespace {

void SetEnv(const char* name, bool on) {
    if (on)
        setenv(name, "", 1);
    else
        unsetenv(name);
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    Port_MsgManager::Instance().SetConsole(false);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    // A leading byte below the first character of a JSON text picks options.
    unsigned flags = 0;
    if (size > 0 && data[0] < 0x20 && data[0] != '\n' && data[0] != '\r' && data[0] != '\t') {
        flags = data[0];
        ++data;
        --size;
    }
    const std::string text(reinterpret_cast<const char*>(data), size);

    Nlw_ReadOptions options;
    options.flatten = (flags & 1) != 0;
    Nlw_NlView view;
    std::unique_ptr<Nlw_Design> design;
    if (!Nlw_JsonReader::LoadText(text, "fuzz.json", options, view, design)) {
        Port_MsgManager::Instance().ResetCounts();
        return 0;
    }

    SetEnv("NLW_VERILOG_DEFPARM", (flags & 2) != 0);
    SetEnv("NLW_OLD_PFD", (flags & 4) != 0);
    Nlw_Params params;
    params.SetOutputFileName("fuzz.v");
    params.SetOutputFileMode(Port::Stream::Memory);
    params.SetWriteEscapedNames((flags & 8) == 0);
    params.SetStaMode((flags & 16) != 0);
    params.SetMHFMode((flags & 1) == 0 && (flags & 16) != 0);
    params.SetWritePinFile(true);
    params.SetWriteTestFile(true);
    params.SetWriteAka(true);
    params.SetWriteInstantiatedTimcells(true);

    Nlw_Verilog writer;
    writer.SetParams(&params);
    writer.SetView(&view);
    writer.SetDesign(design.get());
    std::unique_ptr<Ldm_TypeLib> typeLib(Nlw_Prep::LoadInstallationData(writer));
    writer.SetTypeLib(typeLib.get());
    Nlw_Prep::PrepareProperties(writer);
    writer.WriteDesign();
    Port_MsgManager::Instance().ResetCounts();
    return 0;
}
