// The netlist model: a view of blocks (module instances and library cell
// instances), their pins, the signals inside modules, and buses.
//
// Hierarchy is unfolded: every instance of a module is a macro block with its
// own ports, signals and children. A macro block's pin has a signal outside
// (in the parent) and a child signal inside (the net the port stands for).
// Library cells are leaf blocks; their pins have only an outside signal.
// Everything is iterated in stored order. Objects are created only through
// Nlw_NlBuilder and live as long as their view.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "model/Vdm_Property.h"
#include "port/UT.h"

class Nlw_NlView;
class Nlw_NlBlock;
class Nlw_NlPin;
class Nlw_NlSignal;
class Nlw_NlBus;
class Nlw_NlPinBus;
class Nlw_NlType;
class Nlw_NlNetwork;
class Nlw_NlBuilder;
struct Nlw_NlArena;
struct Nlw_NlNameIndex;

// Direction codes.
enum Nlw_Direction {
    NLW_DIR_UNTYPED = 0,
    NLW_DIR_INPUT = 1,
    NLW_DIR_OUTPUT = 2,
    NLW_DIR_INOUT = 3
};

// Pin types: the pad pin of a pad cell is type 7.
enum { NLW_PINTYPE_PLAIN = 0, NLW_PINTYPE_PAD = 7 };
// Primitive types: a pad cell is type 8.
enum { NLW_PRIM_OTHER = 0, NLW_PRIM_PAD = 8 };

// Bus index order (BUS_ORDER): 0 walks from the most to the least
// significant index, 1 from the least to the most significant.
enum BUS_ORDER { BUS_ORDER_MSB_FIRST = 0, BUS_ORDER_LSB_FIRST = 1 };

// A named bus of pins or signals with one dimension [msb : lsb].
class Nlw_NlBus {
public:
    // Process-wide settings.
    static void SetMultiDimensions(bool on);
    static bool GetMultiDimensions();
    // Delimiter styles: 4 is "[" "]"; 7 (the input style of the programs
    // before writing) accepts "[" "]", "<" ">" and "(" ")" when splitting.
    // Defaults: input 7, output 4, multi-dimensions off.
    static void SetInputDelimiterType(int type);
    static int GetInputDelimiterType();
    static void SetOutputDelimiterType(int type);
    static int GetOutputDelimiterType();
    // The characters written for a style: "[" and "]" for every style (7
    // only differs when names are split).
    static char GetLeftDelimiter(int type);
    static char GetRightDelimiter(int type);
    // True when name ends in one bus index in the input delimiter style, such
    // as "d[3]", "d[-1]" or "\a b [3]"; base then holds the name without the
    // index ("\a b ") and indexes holds the index (cleared first). A name
    // that is nothing but an index, or whose index does not fit 32 bits, is
    // not a bus name. With multi-dimensions on, every trailing index is
    // taken ("m[1][2]" gives m, 1, 2).
    static bool IsBusName(const char* name, std::string& base, DARRAY_Util_INT32* indexes);

    const char* GetWritableName() const { return name_; }
    const char* GetAka() const { return aka_; }
    bool IsValid() const { return valid_; }
    int GetDimension() const { return 1; }
    int32_t GetMSB(int d) const { return d == 0 ? msb_ : 0; }
    int32_t GetLSB(int d) const { return d == 0 ? lsb_ : 0; }
    int GetOrder(int d) const { return d == 0 ? order_ : 0; }
    void SetOrder(int d, int order) {
        if (d == 0) order_ = static_cast<uint8_t>(order);
    }
    // Number of bits.
    int32_t GetWidth() const { return (msb_ > lsb_ ? msb_ - lsb_ : lsb_ - msb_) + 1; }

    // Index tuples: one entry per dimension. The walk goes from the most to
    // the least significant index when the order is 0, the other way when 1.
    bool HasMore(const DARRAY_Util_INT32& tuple) const;
    bool IsFirst(const DARRAY_Util_INT32& tuple) const;
    void Next(DARRAY_Util_INT32& tuple, int dimension) const;

    bool IsPinBus() const { return isPinBus_; }
    Nlw_NlBlock* GetBlock() const { return owner_; }
    // Member by bus index (a pin for a pin bus, a signal for a signal bus);
    // null when out of range or not present. A library cell type's bus has
    // its members on each instance: use the block's GetPinByAlias.
    Nlw_NlPin* GetPinMember(int32_t index) const;
    Nlw_NlSignal* GetSignalMember(int32_t index) const;
    std::string ToString() const;

    // Only the legalizer and the builder rename.
    void SetWritableName(const char* name);
    void SetAka(const char* aka);

protected:
    friend class Nlw_NlBuilder;
    friend class Nlw_NlBlock;
    friend class Nlw_Nl_LU;
    Nlw_NlBus() = default;
    const char* name_ = "";
    const char* aka_ = nullptr;
    Nlw_NlBlock* owner_ = nullptr;
    Nlw_NlArena* arena_ = nullptr;
    int32_t msb_ = 0;
    int32_t lsb_ = 0;
    uint8_t order_ = 0;
    bool valid_ = true;
    bool isPinBus_ = false;
    // A signal bus's members by offset from min(msb, lsb), created on
    // demand (null until then).
    void** members_ = nullptr;
    // A pin bus's members are found by position in the pin array of the
    // block (the instance, for a bus of a library cell type): the position of
    // the member of index min(msb, lsb), and the step of the position per
    // index. Positions survive the growth of a macro's pin array.
    int32_t firstPinPos_ = -1;
    int32_t posStep_ = 1;
    // The library cell type a type-level pin bus belongs to (owner_ is then
    // null).
    Nlw_NlType* type_ = nullptr;
};

class Nlw_NlPinBus : public Nlw_NlBus {
public:
    int GetDirection() const { return dir_; }

private:
    friend class Nlw_NlBuilder;
    friend class Nlw_NlBlock;
    uint8_t dir_ = 0;
};

// A property holder of a group of signals connected across the hierarchy.
class Nlw_NlNetwork : public Vdm_PropertyHolder {};

class Nlw_NlPin : public Vdm_PropertyHolder {
public:
    const char* GetWritableName() const { return name_; }
    const char* GetAka() const { return aka_; }
    int GetDirection() const { return dir_; }
    int GetPinType() const { return pinType_; }
    bool IsVisible() const { return visible_; }
    bool IsBused() const { return bus_ != nullptr; }
    Nlw_NlPinBus* GetBus() const { return bus_; }
    // The signal outside the block, or null.
    Nlw_NlSignal* GetSignal() const { return signal_; }
    // For a port of a macro block, the net inside the block, or null.
    Nlw_NlSignal* GetChildSignal() const { return child_; }
    Nlw_NlBlock* GetParent() const { return owner_; }
    Nlw_NlBlock* GetBlock() const { return owner_; }
    Nlw_NlView* GetView() const;
    // True when this pin, met on signal s, is a port of the block that
    // encloses s (s is the pin's child signal).
    bool IsParentPin(const Nlw_NlSignal* s) const { return s && child_ == s; }
    bool IsInput() const { return dir_ == NLW_DIR_INPUT; }
    bool IsOutput() const { return dir_ == NLW_DIR_OUTPUT; }
    // "block/pin" with the writable names.
    std::string ToString() const;

    void SetWritableName(const char* name);
    void SetAka(const char* aka);

private:
    friend class Nlw_NlBuilder;
    friend class Nlw_NlSignal;
    friend class Nlw_Nl_LU;
    Nlw_NlPin() = default;
    const char* name_ = "";
    const char* aka_ = nullptr;
    Nlw_NlBlock* owner_ = nullptr;
    Nlw_NlSignal* signal_ = nullptr;
    Nlw_NlSignal* child_ = nullptr;
    Nlw_NlPinBus* bus_ = nullptr;
    Nlw_NlPin* nextOnSignal_ = nullptr;
    Nlw_NlPin* nextOnChild_ = nullptr;
    uint8_t dir_ = 0;
    uint8_t pinType_ = 0;
    bool visible_ = true;
};

class Nlw_NlSignal : public Vdm_PropertyHolder {
public:
    const char* GetWritableName() const { return name_; }
    const char* GetAka() const { return aka_; }
    // The name the design file gave the net.
    const char* GetModelName() const { return model_; }
    bool IsVisible() const { return visible_; }
    bool IsBused() const { return bus_ != nullptr; }
    Nlw_NlBus* GetBus() const { return bus_; }
    Nlw_NlBlock* GetParent() const { return owner_; }
    Nlw_NlNetwork* GetNetwork() const { return network_; }

    // The pins on this signal in stored order: pins of child blocks (outside
    // connections) and ports of the enclosing block (inside connections).
    class PinIter {
    public:
        PinIter(const Nlw_NlSignal* s, Nlw_NlPin* p) : s_(s), p_(p) {}
        Nlw_NlPin* operator*() const { return p_; }
        PinIter& operator++();
        bool operator!=(const PinIter& o) const { return p_ != o.p_; }

    private:
        const Nlw_NlSignal* s_;
        Nlw_NlPin* p_;
    };
    struct PinRange {
        PinIter b, e;
        PinIter begin() const { return b; }
        PinIter end() const { return e; }
    };
    PinRange GetPins() const { return {PinIter(this, firstPin_), PinIter(this, nullptr)}; }
    size_t GetPinCount() const;

    // The driving pin: the first output of a child block or input port of
    // the enclosing block seen from inside; failing both, the first
    // bidirectional pin of either kind; null when nothing drives the signal.
    Nlw_NlPin* FindDriverPin() const;
    Nlw_NlPin* FindDriver(bool, bool) const { return FindDriverPin(); }
    // The pin the host's global signal object refers to, or null.
    Nlw_NlPin* GetRefPin() const { return refPin_; }

    void SetWritableName(const char* name);
    void SetAka(const char* aka);

private:
    friend class Nlw_NlBuilder;
    friend class Nlw_NlPin;
    Nlw_NlSignal() = default;
    // The next pin after p on this signal's list.
    Nlw_NlPin* NextPin(const Nlw_NlPin* p) const {
        return p->signal_ == this ? p->nextOnSignal_ : p->nextOnChild_;
    }
    const char* name_ = "";
    const char* aka_ = nullptr;
    const char* model_ = "";
    Nlw_NlBlock* owner_ = nullptr;
    Nlw_NlBus* bus_ = nullptr;
    Nlw_NlPin* firstPin_ = nullptr;
    Nlw_NlPin* lastPin_ = nullptr;
    Nlw_NlNetwork* network_ = nullptr;
    Nlw_NlPin* refPin_ = nullptr;
    bool visible_ = true;
};

// A cell or module type, shared by its instances.
class Nlw_NlType {
public:
    ~Nlw_NlType();
    Nlw_NlType(const Nlw_NlType&) = delete;
    Nlw_NlType& operator=(const Nlw_NlType&) = delete;

    const char* GetName() const { return name_; }
    const char* GetAka() const { return aka_; }
    bool IsModule() const { return isModule_; }
    bool IsTimcell() const { return timcell_; }
    bool IsFuncell() const { return funcell_; }
    int GetPrimType() const { return primType_; }
    void SetName(const char* name);
    void SetAka(const char* aka);
    // The base name of a module type's own files: its name until the writer
    // gives it a file-safe one.
    const char* GetFileBaseName() const { return fileBase_ ? fileBase_ : name_; }
    void SetFileBaseName(const char* base);

    // Pin definitions of a library cell type, in pin order.
    struct PinDef {
        const char* name;  // "A" or "D[3]"
        uint8_t dir;
        uint8_t pinType;
        Nlw_NlPinBus* bus;  // the type's bus, or null
    };
    const std::vector<PinDef>& GetPinDefs() const { return pinDefs_; }
    const std::vector<Nlw_NlPinBus*>& GetPinBuses() const { return pinBuses_; }
    // Position of the scalar pin or bus member of that name, or -1.
    int FindPinDef(const char* name) const;

private:
    friend class Nlw_NlBuilder;
    friend class Nlw_Nl_LU;
    friend class Nlw_NlBlock;
    friend class Nlw_NlBus;
    friend class Nlw_NlPin;
    friend class Nlw_NlView;
    Nlw_NlType() = default;
    const char* name_ = "";
    const char* aka_ = nullptr;
    const char* fileBase_ = nullptr;
    Nlw_NlView* view_ = nullptr;
    bool isModule_ = false;
    bool timcell_ = false;
    bool funcell_ = false;
    // Set once an instance exists: the pin definitions are then fixed.
    bool instantiated_ = false;
    // Set when a pin of one instance was renamed on its own; lookups by name
    // then check the instance's pins instead of trusting the definitions.
    bool pinsDiverge_ = false;
    int primType_ = 0;
    std::vector<PinDef> pinDefs_;
    std::vector<Nlw_NlPinBus*> pinBuses_;
    UT_DARRAY<Nlw_NlPinBus*> pinBusArray_;  // the same buses, as blocks give them
    std::unique_ptr<Nlw_NlNameIndex> index_;
};

class Nlw_NlBlock : public Vdm_PropertyHolder {
public:
    const char* GetTypeName() const;
    Nlw_NlType* GetType() const { return type_; }
    const char* GetInstanceName() const { return name_; }
    const char* GetWritableName() const { return name_; }
    const char* GetAka() const { return aka_; }
    Nlw_NlBlock* GetParent() const { return parent_; }
    Nlw_NlView* GetView() const { return view_; }
    bool IsMacro() const { return macro_ != nullptr; }
    bool IsTimcell() const;
    bool IsFuncell() const;
    int GetPrimType() const;
    // The base name of the block's own files (its type's file base name).
    const char* GetFileBaseName() const;
    // The block's data-model object, which carries its properties.
    Vdm_PropertyHolder* GetDataBlock() { return this; }

    size_t GetPinCount() const { return numPins_; }
    Nlw_NlPin* GetPin(size_t i) const { return pins_ + i; }
    struct PinRange {
        Nlw_NlPin* b;
        Nlw_NlPin* e;
        Nlw_NlPin* begin() const { return b; }
        Nlw_NlPin* end() const { return e; }
    };
    // Pins are stored contiguously: iterate with for (Nlw_NlPin& p : GetPins()).
    PinRange GetPins() const { return {pins_, pins_ + numPins_}; }
    // The pin whose name is the alias: a bus name followed by an index in
    // the output style, such as "D[3]" (the bus's member of that index), or
    // else a pin's own name. Null when there is none.
    Nlw_NlPin* GetPinByAlias(const char* alias) const;
    // The first pin of that writable name, or null.
    Nlw_NlPin* FindPin(const char* name) const;

    // Pin buses (null when none). For a library cell they are its type's.
    const UT_DARRAY<Nlw_NlPinBus*>* GetPinBuses() const;
    // Macro blocks only; empty for leaves.
    const std::vector<Nlw_NlBlock*>& GetChildren() const;
    const std::vector<Nlw_NlSignal*>& GetSignals() const;
    const UT_DARRAY<Nlw_NlBus*>* GetSignalBuses() const;

    // The external property list gathered by the preparation pass (a list
    // property of Verilog-ready parameter texts), or null.
    Vdm_Property* GetExternalProperties() const { return extProps_; }
    // The block takes ownership of the list and deletes a list it had.
    void SetExternalProperties(Vdm_Property* list);

    // "type instance" for messages.
    std::string ToString() const;

    void SetWritableName(const char* name);
    void SetAka(const char* aka);

    struct MacroData;

private:
    friend class Nlw_NlBuilder;
    friend class Nlw_NlView;
    friend class Nlw_NlPin;
    friend class Nlw_NlBus;
    Nlw_NlBlock() = default;
    // The pin bus of that writable name (first of that name), or null.
    Nlw_NlPinBus* FindPinBus(const char* name, size_t len) const;
    // The pin of a bus member by bus index, or null.
    Nlw_NlPin* GetBusMember(const Nlw_NlPinBus* bus, int32_t index) const;
    Nlw_NlType* type_ = nullptr;
    const char* name_ = "";
    const char* aka_ = nullptr;
    Nlw_NlBlock* parent_ = nullptr;
    Nlw_NlView* view_ = nullptr;
    Nlw_NlPin* pins_ = nullptr;
    uint32_t numPins_ = 0;
    MacroData* macro_ = nullptr;
    Vdm_Property* extProps_ = nullptr;  // owned
};

// The design: its name.
class Nlw_Design {
public:
    explicit Nlw_Design(const char* name) : name_(name ? name : "") {}
    const char* GetName() const { return name_.c_str(); }

private:
    std::string name_;
};

class Nlw_NlView {
public:
    Nlw_NlView();
    ~Nlw_NlView();
    Nlw_NlView(const Nlw_NlView&) = delete;
    Nlw_NlView& operator=(const Nlw_NlView&) = delete;

    Nlw_NlBlock* GetRootMacro() const { return root_; }
    // Macro blocks: the root first, then every module instance in the order
    // the builder created them (depth-first, as the reader creates them).
    size_t GetNumMacros() const { return macros_.GetCount(); }
    const UT_DARRAY<Nlw_NlBlock*>& GetMacros() const { return macros_; }
    // The global set/reset and tristate signals, or null.
    Nlw_NlSignal* GetSetReset() const { return setReset_; }
    Nlw_NlSignal* GetTristate() const { return tristate_; }
    const char* GetDeviceInfo() const { return device_.empty() ? nullptr : device_.c_str(); }
    const char* GetPartName() const { return part_.empty() ? nullptr : part_.c_str(); }
    // Library and module types, in creation order.
    const std::vector<Nlw_NlType*>& GetTypes() const { return types_; }
    Nlw_NlType* FindType(const char* name) const;
    size_t GetNumLeafBlocks() const { return numLeaves_; }
    // Builds now every name index that lookups build on first use (types'
    // and macros' pins and buses, the type names), so that a view nobody
    // changes any more can be read from several threads at once.
    void BuildNameIndexes() const;
    // Copies a text into the view's storage; the copy lives as long as the
    // view. Null gives "".
    const char* Intern(const char* text);
    const char* Intern(const char* text, size_t len);

    // While one lives, the texts the thread that made it gives any view
    // (new names and also-known-as names of renamed objects) are kept in an
    // arena of their own that lives as long as this view. Another thread
    // may then rename objects of other macro blocks at the same time.
    class ThreadTexts {
    public:
        explicit ThreadTexts(Nlw_NlView& view);
        ~ThreadTexts();
        ThreadTexts(const ThreadTexts&) = delete;
        ThreadTexts& operator=(const ThreadTexts&) = delete;

    private:
        Nlw_NlArena* previous_;
    };

private:
    friend class Nlw_NlBuilder;
    friend class Nlw_NlType;
    struct TypeIndex;
    void DestroyBlock(Nlw_NlBlock* block);
    std::unique_ptr<Nlw_NlArena> arena_;
    std::vector<std::unique_ptr<Nlw_NlArena>> threadArenas_;
    std::unique_ptr<TypeIndex> typeIndex_;
    Nlw_NlBlock* root_ = nullptr;
    UT_DARRAY<Nlw_NlBlock*> macros_;
    std::vector<Nlw_NlType*> types_;  // owned
    std::vector<Nlw_NlNetwork*> networks_;
    Nlw_NlSignal* setReset_ = nullptr;
    Nlw_NlSignal* tristate_ = nullptr;
    std::string device_;
    std::string part_;
    size_t numLeaves_ = 0;
};
