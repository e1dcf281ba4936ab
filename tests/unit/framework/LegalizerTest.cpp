// The host legalizer's walk, with a small format that only refuses '-'.

#include <type_traits>

#include "ModelText.h"
#include "TestFiles.h"
#include "framework/Nlw_Nl_LU.h"
#include "model/Nlw_NlBuilder.h"

namespace {

using Names = std::vector<std::string>;

// Refuses names holding '-', legalizes them by replacing it with '_';
// records what it was asked.
class DashLU : public Nlw_Nl_LU {
public:
    DashLU(Nlw_NlView* view, bool escaped, bool bridge = true, bool types = true, bool names = true,
           bool cellPins = false)
        : Nlw_Nl_LU(view, types, names, cellPins, bridge), escaped_(escaped) {}

    bool IsLegal(Port::String name, bool isBused) override {
        if (!twoThreads) asked.push_back(std::string(name.c_str()) + (isBused ? " (bit)" : ""));
        return Split(name, isBused).first.find('-') == std::string::npos;
    }
    Port::String Legalize(Port::String name, bool isBused) override {
        std::pair<std::string, std::string> parts = Split(name, isBused);
        for (char& c : parts.first)
            if (c == '-') c = '_';
        return Port::String(parts.first + parts.second);
    }

    Names asked;
    bool twoThreads = false;  // then nothing is recorded

protected:
    bool UsesEscapedNames() const override { return escaped_; }
    bool AnswersOnTwoThreads() const override { return twoThreads; }

private:
    static std::pair<std::string, std::string> Split(const Port::String& name, bool isBused) {
        std::string base;
        DARRAY_Util_INT32 indexes;
        if (isBused && Nlw_NlBus::IsBusName(name.c_str(), base, &indexes))
            return {base, name.str().substr(base.size())};
        return {name.str(), ""};
    }
    bool escaped_;
};

// Writable names of a list of objects or of object pointers.
template <typename List>
Names WritableNames(const List& list) {
    Names out;
    for (const auto& x : list) {
        if constexpr (std::is_pointer_v<std::decay_t<decltype(x)>>)
            out.push_back(x->GetWritableName());
        else
            out.push_back(x.GetWritableName());
    }
    return out;
}
Names Instances(const Nlw_NlBlock* b) {
    return WritableNames(b->GetChildren());
}
Names Pins(const Nlw_NlBlock* b) {
    return WritableNames(b->GetPins());
}
Names Signals(const Nlw_NlBlock* b) {
    return WritableNames(b->GetSignals());
}
Names SignalBuses(const Nlw_NlBlock* b) {
    return b->GetSignalBuses() ? WritableNames(*b->GetSignalBuses()) : Names{};
}

// A library cell CELL (pins A, Y) and the root instance top of module top.
struct Design {
    Design() {
        b.AddTypePin(cell, "A", NLW_DIR_INPUT);
        b.AddTypePin(cell, "Y", NLW_DIR_OUTPUT);
    }
    Nlw_NlView view;
    Nlw_NlBuilder b{&view};
    Nlw_NlType* cell = b.AddLibraryType("CELL", false, false);
    Nlw_NlType* topType = b.AddModuleType("top");
    Nlw_NlBlock* top = b.CreateRoot(topType, "top");
};

// Bracketed bus bits in and out, no keywords; undone when the test ends.
class Legalizer : public ::testing::Test, protected Design {
protected:
    Legalizer() {
        Nlw_NlBus::SetInputDelimiterType(4);
        Nlw_NlBus::SetOutputDelimiterType(4);
        Nlw_Nl_SpkCache::Clear();
    }
    ~Legalizer() override {
        Nlw_Nl_SpkCache::Clear();
        Nlw_NlBus::SetInputDelimiterType(7);
    }
    void Run(bool escaped, bool bridge = true) { DashLU(&view, escaped, bridge).Process(); }
};

TEST_F(Legalizer, LegalizesEveryKindOfNameAndKeepsTheOldOnesAsAka) {
    Nlw_NlType* sub = b.AddModuleType("my-sub");
    Nlw_NlType* odd = b.AddLibraryType("lib-cell", false, false);
    b.AddTypePin(odd, "p-in", NLW_DIR_INPUT);
    b.CreateLeaf(top, odd, "u-1");
    Nlw_NlBlock* s1 = b.CreateMacro(top, sub, "s-1");
    Nlw_NlPin* port = b.AddPort(top, "in-a", NLW_DIR_INPUT);
    b.AddPortBus(top, "d-x", NLW_DIR_OUTPUT, 1, 0);
    b.AddSignal(top, "n-1");
    Nlw_NlBus* bus = b.AddSignalBus(top, "b-s", 1, 0);
    b.GetSignalBusMember(bus, 0);
    s1->SetAka("given");

    Run(true);
    // Cell pins stay; an existing aka is kept; unchanged names get none.
    nlwtest::ExpectGolden("legalizer/every_kind",
                          nlwtest::TypesText(view) + nlwtest::ModelText(view));
    EXPECT_EQ(top->GetPinByAlias("d_x[0]"), top->GetPin(2));
    EXPECT_EQ(top->FindPin("in_a"), port);
}

TEST_F(Legalizer, VisitsTypesThenEachMacrosNamesInWalkOrder) {
    Nlw_NlBlock* s = b.CreateMacro(top, b.AddModuleType("sub"), "s");
    b.CreateLeaf(top, cell, "u");
    b.AddPort(top, "p", NLW_DIR_INPUT);
    b.AddPortBus(top, "pb", NLW_DIR_INPUT, 0, 1);
    b.GetSignalBusMember(b.AddSignalBus(top, "sb", 0, 0), 0);
    b.AddSignal(top, "n");
    b.AddPort(s, "q", NLW_DIR_OUTPUT);

    DashLU lu(&view, true);
    lu.Process();
    EXPECT_EQ(lu.asked, (Names{"top", "sub",                       // module types
                               "s", "u",                           // instances
                               "p", "pb[0] (bit)", "pb[1] (bit)",  // ports
                               "pb",                               // port buses
                               "sb[0] (bit)", "n",                 // signals
                               "sb",                               // signal buses
                               "q"}));                             // the next macro
}

TEST_F(Legalizer, EscapesOrRenamesKeywords) {
    static const char* table[] = {"wire", "module", nullptr};
    for (const nlwtest::Row& c : nlwtest::Table("keywords")) {
        const bool cache = c[0] == "1";
        SCOPED_TRACE(::testing::Message() << "cache " << c[0] << " escaped " << c[1]);
        Nlw_Nl_SpkCache::Clear();
        Design d;
        Nlw_NlType* gen = d.b.AddModuleType("generate");
        for (const char* name : {"signed", "Wire", "\\module ", "bool"})
            d.b.CreateLeaf(d.top, d.cell, name);
        d.b.AddSignal(d.top, "wire");
        d.b.GetSignalBusMember(d.b.AddSignalBus(d.top, "logic", 0, 0), 0);
        d.b.AddSignal(d.top, "uwire_x");

        if (cache) Nlw_Nl_SpkCache::MakeSpkCache(table, true);
        // A second run finds nothing more to change.
        for (int run = 0; run < 2; ++run) {
            DashLU(&d.view, c[1] == "1").Process();
            Names names = Instances(d.top);
            for (const Names& more : {Signals(d.top), SignalBuses(d.top), Names{gen->GetName()}})
                names.insert(names.end(), more.begin(), more.end());
            EXPECT_EQ(nlwtest::Bracketed(names), c[2]);
        }
        if (cache) {
            EXPECT_STREQ(d.top->GetChildren()[0]->GetAka(), "signed");
        }
    }
}

TEST_F(Legalizer, KeepsTheCachesWordsUntilRebuilt) {
    static const char* first[] = {"foo", nullptr};
    static const char* second[] = {"bar", nullptr};
    EXPECT_FALSE(Nlw_Nl_SpkCache::IsBuilt());
    EXPECT_FALSE(Nlw_Nl_SpkCache::IsKeyword("wire"));
    Nlw_Nl_SpkCache::MakeSpkCache(first, true);
    EXPECT_TRUE(Nlw_Nl_SpkCache::IsKeyword("foo"));
    Nlw_Nl_SpkCache::MakeSpkCache(second, false);
    EXPECT_TRUE(Nlw_Nl_SpkCache::IsKeyword("foo"));
    EXPECT_TRUE(Nlw_Nl_SpkCache::IsKeyword("bar"));
    Nlw_Nl_SpkCache::MakeSpkCache(second, true);
    EXPECT_FALSE(Nlw_Nl_SpkCache::IsKeyword("foo"));
    // Words of every language generation, exact case only.
    for (const char* word :
         {"uwire", "genvar", "config", "liblist", "logic", "interface", "unique0", "nettype"})
        EXPECT_TRUE(Nlw_Nl_SpkCache::IsKeyword(word)) << word;
    for (const char* word : {"Wire", "wires", "", "\\wire ", static_cast<const char*>(nullptr)})
        EXPECT_FALSE(Nlw_Nl_SpkCache::IsKeyword(word)) << (word ? word : "null");
}

TEST_F(Legalizer, MakesInstanceNamesUniqueGivingTheLaterOneASuffix) {
    for (const nlwtest::Row& c : nlwtest::Table("unique_instances")) {
        Design d;
        for (const std::string& name : nlwtest::Unbracketed(c[0]))
            d.b.CreateLeaf(d.top, d.cell, name.c_str());
        DashLU(&d.view, true).Process();
        EXPECT_EQ(nlwtest::Bracketed(Instances(d.top)), c[1]) << c[0];
    }
}

// Macros walked on two threads get the names one thread gives them: each
// renames its own instances, ports and nets, the parent its child macros.
TEST_F(Legalizer, GivesTheNamesOfOneThreadOnTwo) {
    auto legalized = [](const char* threads) {
        nlwtest::ScopedEnv env("NLW_WRITE_THREADS", threads);
        Design d;
        Nlw_NlType* sub = d.b.AddModuleType("sub-m");
        for (int i = 0; i < 6; ++i) {
            Nlw_NlBlock* m = d.b.CreateMacro(d.top, sub, i % 2 ? "s-1" : "s_1");
            d.b.AddPort(m, "p-a", NLW_DIR_INPUT);
            d.b.AddPortBus(m, "p_a", NLW_DIR_OUTPUT, 1, 0);
            d.b.AddSignal(m, "n-1");
            d.b.GetSignalBusMember(d.b.AddSignalBus(m, "n_1", 2, 0), 1);
            for (const char* name : {"u-1", "u_1", "p_a", "u-1"}) d.b.CreateLeaf(m, d.cell, name);
        }
        DashLU lu(&d.view, true);
        lu.twoThreads = true;
        lu.Process();
        return nlwtest::TypesText(d.view) + nlwtest::ModelText(d.view);
    };
    const std::string one = legalized("1");
    EXPECT_EQ(legalized("2"), one);
    EXPECT_NE(one.find("u_1_2"), std::string::npos) << one;
}

TEST_F(Legalizer, LetsAPortShareItsNameOnlyWithItsOwnInsideSignal) {
    Nlw_NlPin* a = b.AddPort(top, "a", NLW_DIR_INPUT);
    Nlw_NlPin* q = b.AddPort(top, "q", NLW_DIR_OUTPUT);
    b.ConnectChild(a, b.AddSignal(top, "a"));
    b.ConnectChild(q, b.AddSignal(top, "n"));
    b.AddSignal(top, "q");  // not q's inside signal
    // Port buses share with an inside bus of the same range only.
    Nlw_NlPinBus* d = b.AddPortBus(top, "d", NLW_DIR_INPUT, 1, 0);
    Nlw_NlPinBus* e = b.AddPortBus(top, "e", NLW_DIR_INPUT, 1, 0);
    Nlw_NlBus* dIn = b.AddSignalBus(top, "d", 1, 0);
    Nlw_NlBus* eIn = b.AddSignalBus(top, "e", 3, 0);
    for (int i = 1; i >= 0; --i) {
        b.ConnectChild(d->GetPinMember(i), b.GetSignalBusMember(dIn, i));
        b.ConnectChild(e->GetPinMember(i), b.GetSignalBusMember(eIn, i));
    }
    Run(true);
    nlwtest::ExpectGolden("legalizer/port_shares_inside_name", nlwtest::ModelText(view));
}

// Buses and scalars of one base name get apart names; instances yield to
// nets and ports.
TEST_F(Legalizer, KeepsNamesOfDifferentKindsApart) {
    b.AddSignal(top, "d");
    Nlw_NlBus* bus = b.AddSignalBus(top, "d", 1, 0);
    b.GetSignalBusMember(bus, 1);
    b.GetSignalBusMember(bus, 0);
    b.AddPortBus(top, "p", NLW_DIR_INPUT, 1, 0);
    b.AddPort(top, "p", NLW_DIR_INPUT);
    b.AddPort(top, "q", NLW_DIR_OUTPUT);
    b.AddSignal(top, "u");
    b.AddSignalBus(top, "w", 1, 0);
    for (const char* name : {"u", "q", "w", "v"}) b.CreateLeaf(top, cell, name);
    Run(true);
    nlwtest::ExpectGolden("legalizer/kinds_apart", nlwtest::ModelText(view));
    EXPECT_EQ(top->GetPinByAlias("p_1[0]"), top->GetPin(1));
}

TEST_F(Legalizer, MakesModuleTypeNamesUniqueAndLeavesLibraryTypesAlone) {
    b.AddLibraryType("lib-x", false, false);
    b.AddModuleType("my-t");
    b.AddModuleType("my_t");
    Nlw_NlType* m3 = b.AddModuleType("CELL");
    b.AddModuleType("lib_x");
    Run(true);
    nlwtest::ExpectGolden("legalizer/type_names", nlwtest::TypesText(view));
    EXPECT_EQ(view.FindType("CELL"), cell);
    EXPECT_EQ(view.FindType("CELL_1"), m3);
}

TEST_F(Legalizer, FollowsItsFlags) {
    Nlw_NlType* m = b.AddModuleType("m-x");
    Nlw_NlBlock* u = b.CreateLeaf(top, cell, "u-x");
    Nlw_NlSignal* n = b.AddSignal(top, "n-1");
    {
        DashLU lu(&view, true, true, false, false);
        lu.Process();
        EXPECT_TRUE(lu.asked.empty());
    }
    EXPECT_STREQ(m->GetName(), "m-x");
    EXPECT_STREQ(u->GetWritableName(), "u-x");
    DashLU(&view, true, true, true, false).Process();
    EXPECT_STREQ(m->GetName(), "m_x");
    EXPECT_STREQ(u->GetWritableName(), "u-x");
    // Names only, and no bridge: no akas kept.
    DashLU(&view, true, false, false, true).Process();
    EXPECT_STREQ(u->GetWritableName(), "u_x");
    EXPECT_STREQ(n->GetWritableName(), "n_1");
    EXPECT_EQ(u->GetAka(), nullptr);
    EXPECT_EQ(n->GetAka(), nullptr);
}

TEST_F(Legalizer, RenamesLibraryCellPinsForAllInstancesOnlyWhenAsked) {
    Nlw_NlType* t = b.AddLibraryType("T", false, false);
    b.AddTypePin(t, "a-b", NLW_DIR_INPUT);
    b.AddTypePinBus(t, "d-x", NLW_DIR_INPUT, 1, 0);
    b.AddTypePin(t, "ok", NLW_DIR_OUTPUT);
    b.AddTypePin(t, "a_b", NLW_DIR_OUTPUT);
    Nlw_NlBlock* u1 = b.CreateLeaf(top, t, "u1");
    Nlw_NlBlock* u2 = b.CreateLeaf(top, t, "u2");
    Run(true);
    EXPECT_EQ(Pins(u1), (Names{"a-b", "d-x[1]", "d-x[0]", "ok", "a_b"}));

    DashLU(&view, true, true, false, false, true).Process();
    for (const Nlw_NlBlock* u : {u1, u2}) {
        EXPECT_EQ(Pins(u), (Names{"a_b", "d_x[1]", "d_x[0]", "ok", "a_b_1"}));
        EXPECT_EQ(u->GetPinByAlias("d_x[0]"), u->GetPin(2));
        EXPECT_EQ(u->FindPin("a_b_1"), u->GetPin(4));
        EXPECT_STREQ(u->GetPin(0)->GetAka(), "a-b");
        EXPECT_EQ(u->GetPin(3)->GetAka(), nullptr);
    }
    EXPECT_STREQ(t->GetPinDefs()[2].name, "d_x[0]");
    EXPECT_EQ(t->FindPinDef("a_b_1"), 4);
}

TEST_F(Legalizer, ShortensLongNamesToDistinctNamesWithinTheLimit) {
    const std::string stem(2500, 'a');
    const std::string one = stem + "-one", two = stem + "-two";
    const std::string escaped = "\\" + std::string(3000, 'e') + " ";
    const std::string exact(2047, 'x');
    const std::string busBase(2045, 'b');
    Design d1, d2;
    for (Design* d : {&d1, &d2}) {
        for (const std::string* name : {&one, &two, &escaped, &exact, &exact})
            d->b.CreateLeaf(d->top, d->cell, name->c_str());
        d->b.GetSignalBusMember(d->b.AddSignalBus(d->top, busBase.c_str(), 100, 0), 100);
        DashLU(&d->view, true).Process();
    }

    const Names names = Instances(d1.top);
    EXPECT_EQ(names, Instances(d2.top));  // deterministic
    for (const std::string& name : names) EXPECT_LE(name.size(), 2047u);
    EXPECT_NE(names[0], names[1]);
    EXPECT_EQ(names[0].substr(0, 2000), stem.substr(0, 2000));
    EXPECT_EQ(names[2].front(), '\\');
    EXPECT_EQ(names[2].back(), ' ');
    EXPECT_EQ(names[3], exact);
    EXPECT_EQ(names[4], exact.substr(0, 2045) + "_1");
    const std::string bus = SignalBuses(d1.top)[0];
    EXPECT_LE(bus.size() + 5, 2047u);
    EXPECT_EQ(Signals(d1.top), Names{bus + "[100]"});
    EXPECT_STREQ(d1.top->GetChildren()[0]->GetAka(), one.c_str());
}

}  // namespace
