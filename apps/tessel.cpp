// tessel: writes simulation, equivalence or static timing netlists of a design.
#include "Nlw_App.h"

int main(int argc, char** argv) {
    return Nlw_RunProgram(Nlw_Program::Tessel, argc, argv);
}
