// qdb2ver: translates a design file into a Verilog netlist.
#include "Nlw_App.h"

int main(int argc, char** argv) {
    return Nlw_RunProgram(Nlw_Program::Qdb2ver, argc, argv);
}
