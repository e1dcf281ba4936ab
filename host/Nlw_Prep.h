// Prepares a loaded view for writing: loads the installation's simulatable
// property table and type library into the netlist writer, and gathers each
// library cell's external property list.
#pragma once

class Nlw_NetlistWriter;
class Ldm_TypeLib;

class Nlw_Prep {
public:
    // Fills nlw.simPropTable from the installation's data file "simprops.dat"
    // (when found) and builds a type library from it. Returns the type
    // library (owned by the caller) or null when there is no table.
    static Ldm_TypeLib* LoadInstallationData(Nlw_NetlistWriter& nlw);
    // For every leaf block of the writer's view: offers each property to
    // nlw.AddIfSimulatableProperty; a cell type that the table does not know
    // keeps its parameters, written as Verilog literals of the values the file
    // holds. The resulting list becomes the block's external property list.
    static void PrepareProperties(Nlw_NetlistWriter& nlw);
};
