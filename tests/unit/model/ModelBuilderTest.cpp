// Building a view and querying it: stored order, ports, pin buses, pin
// lookup by alias, signal pin lists, drivers and networks; bus settings,
// bus-bit name splitting and index tuple walks.

#include "TestFiles.h"
#include "model/Nlw_NlBuilder.h"

namespace {

using Names = std::vector<std::string>;

Names PinNames(const Nlw_NlBlock* block) {
    Names names;
    for (const Nlw_NlPin& pin : block->GetPins()) names.push_back(pin.GetWritableName());
    return names;
}

Names SignalPins(const Nlw_NlSignal* s) {
    Names names;
    for (Nlw_NlPin* pin : s->GetPins()) names.push_back(pin->ToString());
    return names;
}

// A top with one submodule instance and leaves of a small library.
class Model : public ::testing::Test {
protected:
    void SetUp() override {
        Nlw_NlBus::SetOutputDelimiterType(4);
        for (const char* pin : {"I0", "I1"}) b.AddTypePin(lut, pin, NLW_DIR_INPUT);
        b.AddTypePin(lut, "O", NLW_DIR_OUTPUT);
    }

    Nlw_NlView view;
    Nlw_NlBuilder b{&view};
    Nlw_NlType* lut = b.AddLibraryType("LUT2", true, false);
    Nlw_NlType* topType = b.AddModuleType("top");
    Nlw_NlType* subType = b.AddModuleType("sub");
    Nlw_NlBlock* top = b.CreateRoot(topType, "top");
};

TEST_F(Model, KeepsStoredOrderOfMacrosChildrenSignalsAndTypes) {
    Nlw_NlBlock* u2 = b.CreateLeaf(top, lut, "u2");
    Nlw_NlBlock* s1 = b.CreateMacro(top, subType, "s1");
    Nlw_NlBlock* u1 = b.CreateLeaf(top, lut, "u1");
    Nlw_NlBlock* inner = b.CreateLeaf(s1, lut, "inner");
    b.AddSignal(top, "z");
    b.AddSignal(top, "a");

    ASSERT_EQ(view.GetNumMacros(), 2u);
    EXPECT_EQ(view.GetMacros()[0], top);
    EXPECT_EQ(view.GetRootMacro(), top);
    EXPECT_EQ(view.GetMacros()[1], s1);
    EXPECT_EQ(top->GetChildren(), (std::vector<Nlw_NlBlock*>{u2, s1, u1}));
    EXPECT_EQ(s1->GetChildren(), (std::vector<Nlw_NlBlock*>{inner}));
    ASSERT_EQ(top->GetSignals().size(), 2u);
    EXPECT_STREQ(top->GetSignals()[1]->GetWritableName(), "a");
    EXPECT_EQ(view.GetNumLeafBlocks(), 3u);
    EXPECT_EQ(view.GetTypes(), (std::vector<Nlw_NlType*>{lut, topType, subType}));
    EXPECT_EQ(u1->GetParent(), top);
    // A type rename reaches every instance and the lookup.
    subType->SetName("sub_1");
    EXPECT_STREQ(s1->GetTypeName(), "sub_1");
    EXPECT_STREQ(s1->GetFileBaseName(), "sub_1");
    EXPECT_EQ(view.FindType("sub_1"), subType);
    EXPECT_EQ(view.FindType("sub"), nullptr);
}

TEST_F(Model, GivesTheMessageTextsOfBlocksPinsAndBuses) {
    Nlw_NlBlock* u = b.CreateLeaf(top, lut, "u7");
    Nlw_NlPinBus* bus = b.AddPortBus(top, "d", NLW_DIR_INPUT, 7, 0);
    Nlw_NlPinBus* up = b.AddPortBus(top, "e", NLW_DIR_INPUT, -1, 2);
    EXPECT_EQ(u->ToString(), "LUT2 u7");
    EXPECT_EQ(u->GetPin(2)->ToString(), "u7/O");
    EXPECT_EQ(bus->ToString(), "d[7:0]");
    EXPECT_EQ(up->ToString(), "e[-1:2]");
    EXPECT_EQ(up->GetWidth(), 4);
}

// Members of every range shape are found by alias, on library cells (type
// buses) and on macros (port buses) alike.
TEST_F(Model, FindsBusMembersByAliasForEveryRangeShape) {
    Nlw_NlType* ram = b.AddLibraryType("RAM", false, true);
    b.AddTypePin(ram, "CLK", NLW_DIR_INPUT);
    b.AddTypePinBus(ram, "A", NLW_DIR_INPUT, 3, 0);
    b.AddTypePinBus(ram, "B", NLW_DIR_INPUT, 0, 3);
    b.AddTypePinBus(ram, "N", NLW_DIR_OUTPUT, 1, -2);
    b.AddTypePin(ram, "D[9]", NLW_DIR_INPUT);  // a scalar pin whose name has brackets
    Nlw_NlBlock* r = b.CreateLeaf(top, ram, "r");

    Nlw_NlBlock* m = b.CreateMacro(top, subType, "m");
    b.AddPort(m, "CLK", NLW_DIR_INPUT);
    b.AddPortBus(m, "A", NLW_DIR_INPUT, 3, 0);
    b.AddPortBus(m, "B", NLW_DIR_INPUT, 0, 3);
    b.AddPortBus(m, "N", NLW_DIR_OUTPUT, 1, -2);
    b.AddPort(m, "D[9]", NLW_DIR_INPUT);

    // Members are created from msb to lsb in pin order.
    const Names order = {"CLK",  "A[3]", "A[2]", "A[1]", "A[0]",  "B[0]",  "B[1]",
                         "B[2]", "B[3]", "N[1]", "N[0]", "N[-1]", "N[-2]", "D[9]"};
    EXPECT_EQ(PinNames(r), order);
    EXPECT_EQ(PinNames(m), order);

    // Each found pin is the one of that name; the rest are not found.
    const char* const found[] = {"CLK", "A[3]", "A[0]", "B[0]", "B[3]", "N[-2]", "N[-1]", "D[9]"};
    const char* const missing[] = {"A[4]", "N[-3]", "X[0]", "A", "", "A[1", "A[x]"};
    for (const Nlw_NlBlock* block : {r, m}) {
        const std::string inst = block->GetInstanceName();
        for (const char* alias : found) {
            const Nlw_NlPin* pin = block->GetPinByAlias(alias);
            ASSERT_NE(pin, nullptr) << inst << " " << alias;
            EXPECT_EQ(pin->ToString(), inst + "/" + alias);
            EXPECT_EQ(pin->GetBlock(), block);
        }
        for (const char* alias : missing)
            EXPECT_EQ(block->GetPinByAlias(alias), nullptr) << inst << " " << alias;
    }
    EXPECT_EQ(r->GetPinByAlias("B[2]")->GetBus(), (*r->GetPinBuses())[1]);
    // A macro's bus gives its members directly; a type's bus has them per
    // instance.
    EXPECT_EQ((*m->GetPinBuses())[2]->GetPinMember(-1), m->GetPinByAlias("N[-1]"));
    EXPECT_EQ((*r->GetPinBuses())[2]->GetPinMember(-1), nullptr);
}

// Past a handful of pins and buses lookups go through an index, which must
// follow renames.
TEST_F(Model, FindsPinsOfWideBlocksAndFollowsRenames) {
    Nlw_NlType* wide = b.AddLibraryType("WIDE", false, false);
    Nlw_NlBlock* m = b.CreateMacro(top, subType, "m");
    b.ReservePorts(m, 20 * 3 + 20);
    for (int i = 0; i < 20; ++i) {
        const std::string bus = "b" + std::to_string(i);
        const std::string pin = "p" + std::to_string(i);
        b.AddTypePinBus(wide, bus.c_str(), NLW_DIR_INPUT, 2, 0);
        b.AddTypePin(wide, pin.c_str(), NLW_DIR_OUTPUT);
        b.AddPortBus(m, bus.c_str(), NLW_DIR_INPUT, 2, 0);
        b.AddPort(m, pin.c_str(), NLW_DIR_OUTPUT);
    }
    Nlw_NlBlock* w = b.CreateLeaf(top, wide, "w");
    for (const Nlw_NlBlock* block : {w, m}) {
        EXPECT_EQ(block->GetPinByAlias("b17[1]"), block->GetPin(17 * 4 + 1));
        EXPECT_EQ(block->FindPin("p19"), block->GetPin(19 * 4 + 3));
        EXPECT_EQ(block->FindPin("nope"), nullptr);
    }
    EXPECT_EQ(wide->FindPinDef("b5[0]"), 5 * 4 + 2);

    (*m->GetPinBuses())[17]->SetWritableName("renamed");
    m->GetPin(19 * 4 + 3)->SetWritableName("p19_new");
    EXPECT_EQ(m->GetPinByAlias("renamed[1]"), m->GetPin(17 * 4 + 1));
    // The member keeps its own name, by which it is still found.
    EXPECT_EQ(m->GetPinByAlias("b17[1]"), m->GetPin(17 * 4 + 1));
    EXPECT_EQ(m->GetPinByAlias("b17[3]"), nullptr);
    EXPECT_EQ(m->FindPin("p19"), nullptr);
    EXPECT_EQ(m->FindPin("p19_new"), m->GetPin(19 * 4 + 3));
    // A pin of one instance renamed on its own is still found.
    w->GetPin(3)->SetWritableName("solo");
    EXPECT_EQ(w->FindPin("solo"), w->GetPin(3));
    EXPECT_EQ(w->FindPin("p0"), nullptr);
}

TEST_F(Model, ListsASignalsPinsInConnectionOrder) {
    Nlw_NlBlock* s1 = b.CreateMacro(top, subType, "s1");
    Nlw_NlPin* in = b.AddPort(s1, "in", NLW_DIR_INPUT);
    Nlw_NlPin* topIn = b.AddPort(top, "x", NLW_DIR_INPUT);
    Nlw_NlBlock* u1 = b.CreateLeaf(top, lut, "u1");
    Nlw_NlBlock* u2 = b.CreateLeaf(s1, lut, "u2");
    Nlw_NlSignal* n = b.AddSignal(top, "n");
    Nlw_NlSignal* inside = b.AddSignal(s1, "in");

    b.Connect(u1->GetPin(1), n);
    b.ConnectChild(topIn, n);
    b.Connect(in, n);
    b.Connect(u1->GetPin(0), n);
    b.ConnectChild(in, inside);
    b.Connect(u2->GetPin(0), inside);

    EXPECT_EQ(SignalPins(n), (Names{"u1/I1", "top/x", "s1/in", "u1/I0"}));
    EXPECT_EQ(SignalPins(inside), (Names{"s1/in", "u2/I0"}));
    EXPECT_EQ(in->GetChildSignal(), inside);
    EXPECT_TRUE(in->IsParentPin(inside));
    EXPECT_TRUE(topIn->IsParentPin(n));
    EXPECT_FALSE(in->IsParentPin(n));

    // Connecting again moves the pin; the other pins keep their order.
    Nlw_NlSignal* m = b.AddSignal(top, "m");
    b.Connect(u1->GetPin(1), m);
    b.Connect(u1->GetPin(1), m);
    EXPECT_EQ(SignalPins(n), (Names{"top/x", "s1/in", "u1/I0"}));
    b.Connect(u1->GetPin(0), m);
    EXPECT_EQ(SignalPins(m), (Names{"u1/I1", "u1/I0"}));
    b.Connect(u1->GetPin(2), n);
    EXPECT_EQ(SignalPins(n), (Names{"top/x", "s1/in", "u1/O"}));
}

TEST_F(Model, FindsTheDriverOfASignal) {
    Nlw_NlType* types[4];
    for (int dir = 0; dir < 4; ++dir) {
        types[dir] = b.AddLibraryType(("C" + std::to_string(dir)).c_str(), false, false);
        b.AddTypePin(types[dir], "P", dir);
    }
    int n = 0;
    for (const nlwtest::Row& c : nlwtest::Table("drivers")) {
        Nlw_NlBlock* m = b.CreateMacro(top, subType, ("m" + std::to_string(n++)).c_str());
        Nlw_NlSignal* s = b.AddSignal(m, "s");
        std::vector<Nlw_NlPin*> pins;
        Nlw_NlPin* port = c[2] != "0" ? b.AddPort(m, "p", std::stoi(c[2])) : nullptr;
        if (port && c[3] == "1") {
            b.ConnectChild(port, s);
            pins.push_back(port);
        }
        for (char dir : c[1]) {
            Nlw_NlBlock* leaf = b.CreateLeaf(m, types[dir - '0'], "u");
            b.Connect(leaf->GetPin(0), s);
            pins.push_back(leaf->GetPin(0));
        }
        if (port && c[3] != "1") {
            b.ConnectChild(port, s);
            pins.push_back(port);
        }
        const int driver = std::stoi(c[4]);
        EXPECT_EQ(s->FindDriverPin(), driver < 0 ? nullptr : pins[driver]) << c[0];
        EXPECT_EQ(s->FindDriver(false, false), s->FindDriverPin()) << c[0];
    }
}

TEST_F(Model, CreatesSignalBusMembersOnDemand) {
    Nlw_NlBus* bus = b.AddSignalBus(top, "n", 0, 3);
    Nlw_NlSignal* plain = b.AddSignal(top, "p");
    EXPECT_EQ(bus->GetSignalMember(2), nullptr);
    Nlw_NlSignal* two = b.GetSignalBusMember(bus, 2);
    ASSERT_NE(two, nullptr);
    EXPECT_STREQ(two->GetWritableName(), "n[2]");
    EXPECT_EQ(b.GetSignalBusMember(bus, 2), two);
    EXPECT_EQ(bus->GetSignalMember(2), two);
    EXPECT_EQ(b.GetSignalBusMember(bus, 4), nullptr);
    EXPECT_EQ(b.GetSignalBusMember(bus, -1), nullptr);
    Nlw_NlSignal* zero = b.GetSignalBusMember(bus, 0);
    // Members join the block's signals in creation order.
    EXPECT_EQ(top->GetSignals(), (std::vector<Nlw_NlSignal*>{plain, two, zero}));
    // Renaming a signal keeps its model name.
    two->SetWritableName("n_x[2]");
    EXPECT_STREQ(two->GetModelName(), "n[2]");
}

// Ports added without a reservation move the pin array as it grows;
// connections made before stay intact.
TEST_F(Model, KeepsConnectionsWhenUnreservedPortsGrow) {
    Nlw_NlBlock* s1 = b.CreateMacro(top, subType, "s1");
    Nlw_NlSignal* n = b.AddSignal(top, "n");
    Nlw_NlSignal* inside = b.AddSignal(s1, "i");
    Nlw_NlBlock* u = b.CreateLeaf(top, lut, "u");
    b.Connect(u->GetPin(0), n);
    b.Connect(b.AddPort(s1, "p0", NLW_DIR_INPUT), n);
    b.ConnectChild(s1->GetPin(0), inside);
    b.Connect(u->GetPin(1), n);
    b.SetRefPin(inside, s1->GetPin(0));
    for (int i = 1; i < 40; ++i) b.AddPort(s1, ("p" + std::to_string(i)).c_str(), NLW_DIR_INPUT);
    b.AddPortBus(s1, "wide", NLW_DIR_INPUT, 99, 0);
    b.Connect(s1->GetPin(7), n);

    EXPECT_EQ(s1->GetPinCount(), 140u);
    EXPECT_EQ(SignalPins(n), (Names{"u/I0", "s1/p0", "u/I1", "s1/p7"}));
    EXPECT_EQ(SignalPins(inside), (Names{"s1/p0"}));
    EXPECT_EQ(inside->GetRefPin(), s1->GetPin(0));
    EXPECT_EQ(s1->GetPin(0)->GetChildSignal(), inside);
}

TEST_F(Model, SharesOneNetworkAcrossTheHierarchicalNet) {
    Nlw_NlBlock* s1 = b.CreateMacro(top, subType, "s1");
    Nlw_NlBlock* s2 = b.CreateMacro(s1, subType, "s2");
    Nlw_NlPin* p1 = b.AddPort(s1, "a", NLW_DIR_INPUT);
    Nlw_NlPin* p2 = b.AddPort(s2, "a", NLW_DIR_INPUT);
    Nlw_NlSignal* outer = b.AddSignal(top, "n");
    Nlw_NlSignal* mid = b.AddSignal(s1, "a");
    Nlw_NlSignal* deep = b.AddSignal(s2, "a");
    Nlw_NlSignal* other = b.AddSignal(s1, "o");
    b.Connect(p1, outer);
    b.ConnectChild(p1, mid);
    b.Connect(p2, mid);
    b.ConnectChild(p2, deep);

    Nlw_NlNetwork* net = b.GetOrCreateNetwork(mid);
    ASSERT_NE(net, nullptr);
    EXPECT_EQ(outer->GetNetwork(), net);
    EXPECT_EQ(b.GetOrCreateNetwork(deep), net);
    EXPECT_EQ(other->GetNetwork(), nullptr);
    EXPECT_NE(b.GetOrCreateNetwork(other), net);
}

TEST_F(Model, OwnsThePropertiesOfItsObjects) {
    Nlw_NlBlock* u = b.CreateLeaf(top, lut, "u");
    b.SetTieOff(u->GetPin(1), 1);
    const Vdm_Property* tie = u->GetPin(1)->GetPropertyByName("TIEOFF");
    ASSERT_NE(tie, nullptr);
    EXPECT_EQ(tie->GetType(), VDM_PROP_INT);
    EXPECT_EQ(tie->GetInt32(), 1);
    // The block owns its external list; replacing it frees the old one.
    u->SetExternalProperties(Vdm_Property::NewList("a"));
    u->SetExternalProperties(Vdm_Property::NewList("b"));
    EXPECT_STREQ(u->GetExternalProperties()->GetName(), "b");
    // Properties of signals and networks go with the view (the leak
    // sanitizer checks).
    Nlw_NlSignal* s = b.AddSignal(top, "s");
    s->AddProperty(Vdm_Property::NewBool("NLW_GLOBAL_SIGNAL", true));
    b.GetOrCreateNetwork(s)->AddProperty(Vdm_Property::NewInt("VL_FLOATVAL", 3));
}

TEST_F(Model, RefusesMisuseWithAnInternalMessage) {
    Port_MsgCapture capture;
    Nlw_NlBlock* u = b.CreateLeaf(top, lut, "u");
    b.AddTypePin(lut, "late", NLW_DIR_INPUT);  // after the first instance
    EXPECT_EQ(lut->GetPinDefs().size(), 3u);
    EXPECT_EQ(b.CreateLeaf(u, lut, "x"), nullptr);        // a leaf is no parent
    EXPECT_EQ(b.CreateLeaf(top, subType, "x"), nullptr);  // a module is no cell
    EXPECT_EQ(b.AddPort(u, "p", NLW_DIR_INPUT), nullptr);
    EXPECT_EQ(b.AddSignalBus(top, "huge", INT32_MAX, INT32_MIN), nullptr);
    EXPECT_EQ(b.CreateRoot(topType, "again"), top);
    EXPECT_EQ(view.GetNumLeafBlocks(), 1u);
    // Connections only to signals of the block's own side.
    Nlw_NlBlock* s1 = b.CreateMacro(top, subType, "s1");
    Nlw_NlPin* port = b.AddPort(s1, "p", NLW_DIR_INPUT);
    Nlw_NlSignal* inside = b.AddSignal(s1, "i");
    b.Connect(port, inside);
    b.ConnectChild(port, b.AddSignal(top, "o"));
    EXPECT_EQ(port->GetSignal(), nullptr);
    EXPECT_EQ(port->GetChildSignal(), nullptr);
    EXPECT_EQ(inside->GetPinCount(), 0u);
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Internal).size(), 8u);
}

// ---------------------------------------------------------------------------
// Bus settings, bus-bit name splitting and index tuple walks.

// Indexes as <3><2>...
std::string IndexText(const DARRAY_Util_INT32& indexes) {
    std::string text;
    for (int32_t i : indexes) text += "<" + std::to_string(i) + ">";
    return text;
}

// Restores the process-wide bus settings after each test.
class Bus : public ::testing::Test {
protected:
    void TearDown() override {
        Nlw_NlBus::SetInputDelimiterType(7);
        Nlw_NlBus::SetOutputDelimiterType(4);
        Nlw_NlBus::SetMultiDimensions(false);
    }
    Nlw_NlView view;
    Nlw_NlBuilder b{&view};
    Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
};

TEST_F(Bus, SplitsBusBitNamesInTheInputStyle) {
    for (const nlwtest::Row& c : nlwtest::Table("bus_names")) {
        SCOPED_TRACE(::testing::Message() << c[0] << " style " << c[1]);
        Nlw_NlBus::SetInputDelimiterType(std::stoi(c[1]));
        Nlw_NlBus::SetMultiDimensions(c[2] == "1");
        std::string base = "stale";
        DARRAY_Util_INT32 indexes;
        indexes.Add(42);
        EXPECT_EQ(Nlw_NlBus::IsBusName(c[0].c_str(), base, &indexes), c[3] != "-");
        if (c[3] != "-") {
            EXPECT_EQ(base, c[3]);
        }
        EXPECT_EQ(IndexText(indexes), c[4]);
    }
}

TEST_F(Bus, SplitsNamesOfAnyLength) {
    const std::string longBase(1 << 20, 'n');
    std::string base;
    DARRAY_Util_INT32 indexes;
    EXPECT_TRUE(Nlw_NlBus::IsBusName((longBase + "[5]").c_str(), base, &indexes));
    EXPECT_EQ(base, longBase);
    EXPECT_FALSE(Nlw_NlBus::IsBusName(longBase.c_str(), base, &indexes));
    const std::string digits = "d[" + std::string(5000, '1') + "]";
    EXPECT_FALSE(Nlw_NlBus::IsBusName(digits.c_str(), base, &indexes));
    EXPECT_FALSE(Nlw_NlBus::IsBusName(nullptr, base, &indexes));
}

// The walk a port map makes: start at the msb for order 0 and at the lsb
// for order 1, step with Next while HasMore.
TEST_F(Bus, WalksIndexTuplesInEveryRangeAndOrder) {
    int n = 0;
    for (const nlwtest::Row& c : nlwtest::Table("bus_walks")) {
        SCOPED_TRACE(::testing::Message() << c[0] << ":" << c[1] << " order " << c[2]);
        Nlw_NlBus* bus = b.AddSignalBus(top, ("n" + std::to_string(n++)).c_str(), std::stoi(c[0]),
                                        std::stoi(c[1]));
        const int order = std::stoi(c[2]);
        bus->SetOrder(0, order);
        EXPECT_EQ(bus->GetOrder(0), order);
        DARRAY_Util_INT32 tuple, walked;
        tuple.Add(order == BUS_ORDER_MSB_FIRST ? bus->GetMSB(0) : bus->GetLSB(0));
        std::string first;  // 1 where IsFirst
        while (bus->HasMore(tuple) && walked.GetCount() < 10) {
            walked.Add(tuple[0]);
            first += bus->IsFirst(tuple) ? "1" : "0";
            bus->Next(tuple, bus->GetDimension() - 1);
        }
        EXPECT_EQ(IndexText(walked), c[3]);
        EXPECT_EQ(first, "1" + std::string(walked.GetCount() - 1, '0'));
    }
}

TEST_F(Bus, HasNoMoreForAnEmptyTuple) {
    Nlw_NlBus* bus = b.AddSignalBus(top, "n", 3, 0);
    DARRAY_Util_INT32 tuple;
    EXPECT_FALSE(bus->HasMore(tuple));
    EXPECT_FALSE(bus->IsFirst(tuple));
    bus->Next(tuple, 0);
    EXPECT_EQ(tuple.GetCount(), 0u);
    EXPECT_EQ(bus->GetMSB(1), 0);  // no such dimension
}

}  // namespace
