// Prepares a loaded view for writing: loads the installation's simulatable
// property table and type library into the netlist writer, and gathers each
// library cell's external property list.
#pragma once

#include <memory>
#include <string>

class Nlw_NetlistWriter;
class Ldm_TypeLib;
class Vdm_Property;

class Nlw_Prep {
public:
    // Fills nlw.simPropTable from the installation's data file "simprops.dat"
    // (when found) and builds a type library from it: per table cell type a
    // block type whose "Config_General_Data" group holds, for each "HV" and
    // "BV" definition, a type definition with the default as its value text.
    // Returns the type library (owned by the caller, who hands it to
    // nlw.SetTypeLib) or null when there is no table.
    static Ldm_TypeLib* LoadInstallationData(Nlw_NetlistWriter& nlw);
    // For every leaf block of the writer's view: offers each parameter,
    // converted to the kind its definition expects, to
    // nlw.AddIfSimulatableProperty; a cell type that the table does not know
    // keeps its parameters, written as Verilog literals of the values the
    // file holds. A non-empty list becomes the block's external property
    // list. Parameters are the block's first properties
    // (Nlw_JsonReader::GetParameterCount).
    static void PrepareProperties(Nlw_NetlistWriter& nlw);

    // The property a definition of type text typeText ("BL", "F", "I", "S",
    // "HV", "BV", any case) expects for a file value; null when the value
    // is offered as it is.
    static std::unique_ptr<Vdm_Property> Convert(const Vdm_Property& value, const char* typeText);
    // The Verilog literal of a file value: sized binary (or hexadecimal when
    // the width is a multiple of 4 and every bit is 0 or 1), decimal, real,
    // or a quoted string. False for a value that has no literal (lists).
    static bool VerilogLiteral(const Vdm_Property& value, std::string& out);
};
