// The one way to create model objects; used by the design reader and tests.
#pragma once

#include <memory>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "model/Nlw_Nl.h"

class Nlw_NlBuilder {
public:
    explicit Nlw_NlBuilder(Nlw_NlView* view) : view_(view) {}

    // Library cell types. Pins are declared before the first instance is made.
    Nlw_NlType* AddLibraryType(const char* name, bool timcell, bool funcell, int primType = 0);
    void AddTypePin(Nlw_NlType* type, const char* name, int dir, int pinType = 0);
    // A bus pin [msb : lsb]; its members "name[i]" follow in pin order from
    // msb to lsb.
    Nlw_NlPinBus* AddTypePinBus(Nlw_NlType* type, const char* name, int dir, int32_t msb,
                                int32_t lsb);
    // A module type (its instances are macro blocks).
    Nlw_NlType* AddModuleType(const char* name);

    // Blocks. The root and every macro are appended to the view's macro list.
    Nlw_NlBlock* CreateRoot(Nlw_NlType* type, const char* instanceName);
    Nlw_NlBlock* CreateMacro(Nlw_NlBlock* parent, Nlw_NlType* type, const char* instanceName);
    // A leaf instance with one pin per pin definition of its type.
    Nlw_NlBlock* CreateLeaf(Nlw_NlBlock* parent, Nlw_NlType* type, const char* instanceName);

    // Ports of a macro block, in port order. A bus port's members "name[i]"
    // are created from msb to lsb.
    Nlw_NlPin* AddPort(Nlw_NlBlock* macro, const char* name, int dir);
    Nlw_NlPinBus* AddPortBus(Nlw_NlBlock* macro, const char* name, int dir, int32_t msb,
                             int32_t lsb);
    // Fixes the number of ports a macro will get so that its pins can be
    // stored contiguously; optional, AddPort grows as needed before the
    // first connection. Growing moves the pins: pin pointers taken before
    // are only valid when the ports were reserved.
    void ReservePorts(Nlw_NlBlock* macro, size_t count);

    // Signals inside a macro block. A signal bus's members "name[i]" are
    // created on demand by GetSignalBusMember.
    Nlw_NlSignal* AddSignal(Nlw_NlBlock* macro, const char* name);
    Nlw_NlBus* AddSignalBus(Nlw_NlBlock* macro, const char* name, int32_t msb, int32_t lsb);
    Nlw_NlSignal* GetSignalBusMember(Nlw_NlBus* bus, int32_t index);

    // Connections. Connect joins a pin of a child block to a signal of the
    // block's parent; ConnectChild joins a macro's port to a signal inside
    // the macro. Both append the pin to the signal's pin list; connecting a
    // pin again moves it to the new signal. A signal of the wrong block is
    // refused with an internal message.
    void Connect(Nlw_NlPin* pin, Nlw_NlSignal* outside);
    void ConnectChild(Nlw_NlPin* port, Nlw_NlSignal* inside);
    // Adds the integer property "TIEOFF".
    void SetTieOff(Nlw_NlPin* pin, int value);

    void SetVisible(Nlw_NlPin* pin, bool visible);
    void SetVisible(Nlw_NlSignal* signal, bool visible);
    void SetValid(Nlw_NlBus* bus, bool valid);
    void SetPinType(Nlw_NlPin* pin, int pinType);
    // The network of the signal's hierarchical net: every signal joined to
    // it through ports, up and down the hierarchy, shares it.
    Nlw_NlNetwork* GetOrCreateNetwork(Nlw_NlSignal* signal);
    void SetRefPin(Nlw_NlSignal* signal, Nlw_NlPin* pin);
    void SetSetReset(Nlw_NlSignal* signal);
    void SetTristate(Nlw_NlSignal* signal);
    void SetDevice(const char* device, const char* part);

private:
    Nlw_NlBus* NewBus(const char* name, int32_t msb, int32_t lsb, bool pinBus);
    // A pin bus whose members will be the pins from position firstPin on.
    Nlw_NlPinBus* NewPinBus(const char* name, int dir, int32_t msb, int32_t lsb, size_t firstPin);
    Nlw_NlBlock* NewBlock(Nlw_NlBlock* parent, Nlw_NlType* type, const char* instanceName,
                          bool macro);
    Nlw_NlPin* AppendPort(Nlw_NlBlock* macro, const char* name, int dir);
    void GrowPins(Nlw_NlBlock* macro, size_t capacity);
    Nlw_NlSignal* NewSignal(Nlw_NlBlock* macro, const char* name, size_t len);
    // Signal pin lists: the link from p to the next pin on s.
    static Nlw_NlPin*& LinkOf(Nlw_NlPin* p, const Nlw_NlSignal* s);
    static void Append(Nlw_NlSignal* s, Nlw_NlPin* p);
    static void Unlink(Nlw_NlSignal* s, Nlw_NlPin* p);
    Nlw_NlView* view_;
    std::string memberName_;  // reused for every bus member named
};

// Storage and indexes behind the model. Only the model's own sources use
// these.

// A chunked bump allocator: objects, pin arrays and name texts of one view.
// Memory is released with the view; destructors are run by the view.
struct Nlw_NlArena {
    void* Allocate(size_t size, size_t align);
    const char* Copy(const char* text, size_t len);
    size_t GetBytes() const { return bytes_; }

    // Chunks are huge-page sized and aligned, and the kernel is asked to back
    // them with huge pages: a large design touches hundreds of megabytes of
    // fresh memory, and the page faults would otherwise cost about as much
    // as building the model.
    static constexpr size_t kChunk = size_t(2) << 20;

    // Memory that a large user is done with (the design reader's copy of the
    // file, read just before the model is built) can be handed to the
    // arenas: new chunks are cut from it first. Its pages are touched
    // already, so the model costs no page faults for them, and the process
    // does not hold both. The region lives while any chunk cut from it
    // does. DropDonations forgets what is left uncut.
    static void Donate(std::shared_ptr<char> region, size_t size);
    static void DropDonations();

private:
    static std::shared_ptr<char> NewChunk(size_t size);
    std::vector<std::shared_ptr<char>> chunks_;
    char* cur_ = nullptr;
    size_t left_ = 0;
    size_t bytes_ = 0;
};

// Name lookups of a block or a library cell type: pin position and pin bus
// by writable name, built on first use and rebuilt after a rename. Small
// blocks are searched directly and never build it.
struct Nlw_NlNameIndex {
    // Up to this many pins or buses a direct search is cheaper.
    static constexpr size_t kDirect = 8;
    std::unordered_map<std::string_view, uint32_t> pins;
    std::unordered_map<std::string_view, Nlw_NlPinBus*> buses;
    bool pinsBuilt = false;
    bool busesBuilt = false;
};

// Parses the index that ends name[0, end): a left delimiter, an optionally
// negative decimal number that fits 32 bits, a right delimiter ending at
// end ("[" "]"; style 7 also "<" ">" and "(" ")"). On success gives the
// position of the left delimiter and the value.
bool Nlw_NlSplitIndex(const char* name, size_t end, int style, size_t& left, int32_t& value);

// A bus member's name: "base[index]" in the output delimiter style.
std::string Nlw_NlMemberName(const char* base, int64_t index);
// The same into out, whose storage is reused: members are named one after
// another, a bus at a time.
void Nlw_NlMemberName(std::string& out, const char* base, int64_t index);

// What only a macro block carries.
struct Nlw_NlBlock::MacroData {
    std::vector<Nlw_NlBlock*> children;
    std::vector<Nlw_NlSignal*> signals;
    UT_DARRAY<Nlw_NlPinBus*> pinBuses;
    UT_DARRAY<Nlw_NlBus*> signalBuses;
    size_t pinCapacity = 0;
    Nlw_NlNameIndex index;
};
