// The base of a netlist format's writer object: holds the run's view,
// parameters, design and device data, and declares the operations a format
// supplies.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "framework/Nlw_Params.h"
#include "model/Nlw_Nl.h"
#include "port/PM.h"
#include "port/Port.h"
#include "port/UT.h"

class Nlw_Writer;
class Nlw_NlNetwork;
class Nlw_Timing;
class Ldm_TypeLib;

// One parameter definition of the simulation library: name, expected type
// text ("BL", "F", "I", "S", "HV", "BV") and default value text.
class Nlw_Property {
public:
    Nlw_Property(const char* name, const char* type, const char* dflt)
        : name_(name), type_(type), default_(dflt) {}
    const Port::String& GetName() const { return name_; }
    const Port::String& GetType() const { return type_; }
    const Port::String& GetDefault() const { return default_; }

    // The parameter a property stands for: the initial-state properties of
    // the flip-flops ("INITSTATE", "INIT_BIT") all set "INIT"; any other
    // name stands for itself.
    static const char* ParameterName(const char* propertyName);
    // The definition of a parameter among defs, its name compared ignoring
    // case; null when there is none.
    static const Nlw_Property* Find(const std::vector<Nlw_Property>& defs,
                                    const char* parameterName);

private:
    Port::String name_, type_, default_;
};

// Orders block type names ignoring ASCII case.
struct Nlw_ICaseLess {
    // Lookups by plain text build no key: cell properties look their type
    // up once per instance.
    using is_transparent = void;
    bool operator()(const Port::String& a, const Port::String& b) const;
    bool operator()(const char* a, const Port::String& b) const;
    bool operator()(const Port::String& a, const char* b) const;
};
using Nlw_SimPropTable = std::map<Port::String, std::vector<Nlw_Property>*, Nlw_ICaseLess>;

// A record of what the implementation flow did to a register or net of a
// module between the RTL and the netlist, read from the design map file; the
// host's assertion writer turns each into equivalence-checker guidance. The
// model objects are those of the netlist, so that their written names are
// taken when the file is written, after the legalizer.
struct AnnoVacuum {
    enum Kind { Constant, Merged, Renamed };
    Kind kind = Constant;
    const Nlw_NlType* module = nullptr;  // the module type holding the register or net
    std::string original;                // the RTL name, such as "count[3]"
    char value = '0';                    // Constant: '0' or '1'
    const Nlw_NlBlock* cell = nullptr;   // Merged, Renamed register: the netlist register
    const Nlw_NlSignal* net = nullptr;   // Renamed net: the netlist net
};

class Nlw_NetlistWriter {
public:
    Nlw_NetlistWriter();
    Nlw_NetlistWriter(const Nlw_NetlistWriter& other);
    Nlw_NetlistWriter& operator=(const Nlw_NetlistWriter& other);
    virtual ~Nlw_NetlistWriter();

    using HelpFunction = void (*)();
    virtual HelpFunction GetHelp() = 0;
    virtual const char** GetReservedWords() = 0;
    virtual unsigned char IsLegal(const char* name, unsigned char isBused);
    virtual const char* Legalize(const char* name, unsigned char isBused);
    virtual unsigned char IsEscaped(const char* name) = 0;
    virtual const char* Escape(const char* name, unsigned char isBused) = 0;
    virtual const char* GetRangeString(Nlw_NlBus* bus) = 0;
    virtual const char* GetIndexesString(DARRAY_Util_INT32* indexes) = 0;
    virtual void WriteDesign() = 0;
    virtual void WriteHeader(Nlw_Writer* writer) = 0;
    // Defaults: every name is legal and stays as it is; every block is
    // definable; PrepPin and PrepNetwork do nothing.
    virtual unsigned char IsDefinable(Nlw_NlBlock* block);
    // True for every block except those marked "NLW_NOT_INSTANTIATABLE".
    virtual unsigned char IsInstantiatable(Nlw_NlBlock* block);
    virtual void PrepPin(Nlw_NlPin* pin);
    virtual void PrepNetwork(Nlw_NlNetwork* network);
    virtual unsigned char AddIfSimulatableProperty(Nlw_NlBlock* block, Vdm_Property* property,
                                                   Vdm_Property* list) = 0;

    // Run data, set by the host program before WriteDesign.
    Nlw_Params* GetParams() const { return params_; }
    void SetParams(Nlw_Params* p) { params_ = p; }
    Nlw_NlView* GetView() const { return view_; }
    void SetView(Nlw_NlView* v) { view_ = v; }
    Nlw_Design* GetDesign() const { return design_; }
    void SetDesign(Nlw_Design* d) { design_ = d; }
    Ldm_TypeLib* GetTypeLib() const { return typeLib_; }
    void SetTypeLib(Ldm_TypeLib* t) { typeLib_ = t; }
    // The delays of a timing-annotated design (null when there are none);
    // owned by the host program.
    Nlw_Timing* GetTiming() const { return timing_; }
    void SetTiming(Nlw_Timing* t) { timing_ = t; }
    // The device data of the run's part ("device.key" of the installation),
    // made on first use.
    PM_DEVKEY* GetDevkey();
    // The view's part (an empty part when there is no view or part), made on
    // first use.
    PM_PIC* GetPmPic();
    const char* GetApplicationName() const { return appName_; }
    const char* GetApplicationVersion() const;
    const char* GetUsage() const { return usage_; }
    const char* GetFileExtension() const { return ext_; }
    bool GetIsVornixCore() const { return isVornixCore_; }
    void SetIsVornixCore(bool v) { isVornixCore_ = v; }
    std::vector<AnnoVacuum>& GetAnnoVacuums() { return annoVacuums_; }

    // Writes the host's own dump of the netlist to "<output root>.nlw",
    // replacing an older dump.
    void WriteNlwFile();
    // Brings text to exactly count characters: pads on the left with the
    // first character of fill ("0" when fill is empty), or cuts from the
    // left, keeping the count rightmost (least significant) characters.
    void PadOrTrim(size_t count, Port::String& text, const char* fill);

    // The simulatable property table: per block type (any case), the
    // parameter definitions in the order they were added. The writer owns
    // the lists it made itself (LoadSimPropTable, AddSimProperty).
    Nlw_SimPropTable simPropTable;
    // Adds the definitions of a table file (lines "CELLTYPE PARAM TYPE
    // DEFAULT", '#' comments). Returns false when the file does not exist
    // (silently), cannot be read or holds a malformed line (one error naming
    // the file and line; the table is then left as it was).
    bool LoadSimPropTable(const char* path);
    // Appends one definition for a block type.
    void AddSimProperty(const char* cellType, const char* name, const char* type, const char* dflt);

protected:
    const char* appName_ = "";
    const char* usage_ = "";
    const char* ext_ = "v";

private:
    Nlw_Params* params_ = nullptr;
    Nlw_NlView* view_ = nullptr;
    Nlw_Design* design_ = nullptr;
    Ldm_TypeLib* typeLib_ = nullptr;
    Nlw_Timing* timing_ = nullptr;
    std::shared_ptr<PM_PIC> pic_;
    std::shared_ptr<PM_DEVKEY> devkey_;
    bool isVornixCore_ = false;
    std::vector<AnnoVacuum> annoVacuums_;
    std::vector<std::unique_ptr<std::vector<Nlw_Property>>> simPropStorage_;

    // The definition list of a block type, made (and owned) when new.
    std::vector<Nlw_Property>* SimPropList(const char* cellType);
    void CopySimPropTable(const Nlw_NetlistWriter& other);
};
