// The one way to create model objects; used by the design reader and tests.
#pragma once

#include "Nlw_Nl.h"

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
    // first connection.
    void ReservePorts(Nlw_NlBlock* macro, size_t count);

    // Signals inside a macro block. A signal bus's members "name[i]" are
    // created on demand by GetSignalBusMember.
    Nlw_NlSignal* AddSignal(Nlw_NlBlock* macro, const char* name);
    Nlw_NlBus* AddSignalBus(Nlw_NlBlock* macro, const char* name, int32_t msb, int32_t lsb);
    Nlw_NlSignal* GetSignalBusMember(Nlw_NlBus* bus, int32_t index);

    // Connections.
    void Connect(Nlw_NlPin* pin, Nlw_NlSignal* outside);
    void ConnectChild(Nlw_NlPin* port, Nlw_NlSignal* inside);
    void SetTieOff(Nlw_NlPin* pin, int value);

    void SetVisible(Nlw_NlPin* pin, bool visible);
    void SetVisible(Nlw_NlSignal* signal, bool visible);
    void SetValid(Nlw_NlBus* bus, bool valid);
    void SetPinType(Nlw_NlPin* pin, int pinType);
    Nlw_NlNetwork* GetOrCreateNetwork(Nlw_NlSignal* signal);
    void SetRefPin(Nlw_NlSignal* signal, Nlw_NlPin* pin);
    void SetSetReset(Nlw_NlSignal* signal);
    void SetTristate(Nlw_NlSignal* signal);
    void SetDevice(const char* device, const char* part);

private:
    Nlw_NlView* view_;
};
