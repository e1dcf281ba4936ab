// The base of a netlist format's writer object: holds the run's view,
// parameters, design and device data, and declares the operations a format
// supplies.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "Nlw_Nl.h"
#include "Nlw_Params.h"
#include "PM.h"
#include "Port.h"
#include "UT.h"

class Nlw_Writer;
class Nlw_NlNetwork;
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

private:
    Port::String name_, type_, default_;
};

// Orders block type names ignoring ASCII case.
struct Nlw_ICaseLess {
    bool operator()(const Port::String& a, const Port::String& b) const;
};
using Nlw_SimPropTable = std::map<Port::String, std::vector<Nlw_Property>*, Nlw_ICaseLess>;

// A record the host's assertion writer receives.
struct AnnoVacuum {
    std::string text;
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
    // The device data of the run's part ("device.key" of the installation).
    PM_DEVKEY* GetDevkey();
    PM_PIC* GetPmPic();
    const char* GetApplicationName() const { return appName_; }
    const char* GetApplicationVersion() const;
    const char* GetUsage() const { return usage_; }
    const char* GetFileExtension() const { return ext_; }
    bool GetIsVornixCore() const { return isVornixCore_; }
    void SetIsVornixCore(bool v) { isVornixCore_ = v; }
    std::vector<AnnoVacuum>& GetAnnoVacuums() { return annoVacuums_; }

    // Writes the host's own dump of the netlist to "<output root>.nlw".
    void WriteNlwFile();
    // Brings text to exactly count characters: pads with fill on the left
    // (a value's leading digits) or cuts from the left, keeping the least
    // significant digits.
    void PadOrTrim(size_t count, Port::String& text, const char* fill);

    // The simulatable property table, filled by the host (LoadSimPropTable).
    Nlw_SimPropTable simPropTable;
    // Fills the table from the installation's data file; returns false and
    // reports an error when the file is present but malformed.
    bool LoadSimPropTable(const char* path);

protected:
    const char* appName_ = "";
    const char* usage_ = "";
    const char* ext_ = "v";

private:
    Nlw_Params* params_ = nullptr;
    Nlw_NlView* view_ = nullptr;
    Nlw_Design* design_ = nullptr;
    Ldm_TypeLib* typeLib_ = nullptr;
    std::shared_ptr<PM_PIC> pic_;
    std::shared_ptr<PM_DEVKEY> devkey_;
    bool isVornixCore_ = false;
    std::vector<AnnoVacuum> annoVacuums_;
    std::vector<std::unique_ptr<std::vector<Nlw_Property>>> simPropStorage_;
};
