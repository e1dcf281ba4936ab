// Loads a netlist JSON design and writes its Verilog netlist through
// Nlw_Verilog, using only the installed headers and archives.
#include <cstdio>
#include <memory>

#include "Nlw_Verilog.h"
#include "framework/Nlw_Params.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_Nl.h"
#include "reader/Nlw_JsonReader.h"
#include "reader/Nlw_Prep.h"

int main(int argc, char** argv) {
    if (argc != 3) {
        std::fprintf(stderr, "usage: consumer design.json netlist.v\n");
        return 2;
    }
    Nlw_Params params;
    params.SetInputFileName(argv[1]);
    params.SetOutputFileName(argv[2]);
    Nlw_NlView view;
    std::unique_ptr<Nlw_Design> design;
    if (!Nlw_JsonReader::Load(argv[1], Nlw_ReadOptions(), view, design)) return 2;
    Nlw_Verilog writer;
    writer.SetParams(&params);
    writer.SetView(&view);
    writer.SetDesign(design.get());
    std::unique_ptr<Ldm_TypeLib> typeLib(Nlw_Prep::LoadInstallationData(writer));
    writer.SetTypeLib(typeLib.get());
    Nlw_Prep::PrepareProperties(writer);
    writer.WriteDesign();
    return 0;
}
