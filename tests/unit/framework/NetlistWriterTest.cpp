// The netlist writer base: padding, device data, the simulatable property
// table; services on the netlist model: external property lists,
// instantiability, the view's part and the netlist dump.

#include "HostTestSupport.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_NlBuilder.h"

namespace {

using namespace hosttest;

// "CELL:PARAM:TYPE:DEFAULT" per definition, in table order.
std::vector<std::string> Dump(const Nlw_NetlistWriter& nlw) {
    std::vector<std::string> out;
    for (const auto& entry : nlw.simPropTable)
        for (const Nlw_Property& p : *entry.second)
            out.push_back(std::string(entry.first.c_str()) + ":" + p.GetName().c_str() + ":" +
                          p.GetType().c_str() + ":" + p.GetDefault().c_str());
    return out;
}

TEST(NetlistWriter, PadOrTrimKeepsLeastSignificantDigits) {
    StubNetlistWriter nlw;
    for (const nlwtest::Row& c : nlwtest::Table("pad_or_trim")) {
        Port::String text(c[1].c_str());
        nlw.PadOrTrim(std::stoul(c[0]), text, nlwtest::Opt(c[2]));
        EXPECT_EQ(text.str(), c[3]) << c[0] << " " << c[1];
    }
}

TEST(NetlistWriter, DevkeyWithoutViewUsesAnEmptyPart) {
    TempDir dir;
    dir.File("data/device.key", "HexStringProperty = INIT\n");
    ScopedEnv root("VORNIX", dir.Path().c_str());
    StubNetlistWriter nlw;
    EXPECT_STREQ(nlw.GetPmPic()->get_partname(), "");
    PM_DEVKEY* key = nlw.GetDevkey();
    ASSERT_NE(key, nullptr);
    EXPECT_EQ(nlw.GetDevkey(), key);  // made once
    EXPECT_STREQ(key->getstringbykey("HexStringProperty", ",", 0, nullptr, 0), "INIT");
}

TEST(NetlistWriter, LoadsTheSimulatablePropertyTable) {
    StubNetlistWriter nlw;
    QuietCapture capture;
    // Comments, empty lines, tabs, CRLF; a cell type in another case and a
    // second definition of a parameter are kept after the first.
    ASSERT_TRUE(nlw.LoadSimPropTable(NLW_TEST_DATA_DIR "/sim_table.tbl"));
    EXPECT_TRUE(capture.msgs.empty());
    using V = std::vector<std::string>;
    EXPECT_EQ(Dump(nlw), (V{"X_FF:INIT:bl:FALSE", "X_LUT4:INIT:HV:16'h0000", "X_LUT4:MODE:S:\"A\"",
                            "X_LUT4:INIT:BV:4'b0000", "X_RAM:WIDTH:I:4"}));
    // Lookup ignores case.
    EXPECT_NE(nlw.simPropTable.find(Port::String("x_ram")), nlw.simPropTable.end());
}

TEST(NetlistWriter, BadOrMissingTableChangesNothing) {
    TempDir dir;
    for (const nlwtest::Row& c : nlwtest::Table("bad_sim_tables")) {
        WriteFile(dir / "bad.tbl", c[0]);
        StubNetlistWriter nlw;
        nlw.AddSimProperty("KEEP", "P", "I", "0");
        QuietCapture capture;
        EXPECT_FALSE(nlw.LoadSimPropTable((dir / "bad.tbl").c_str())) << c[0];
        std::vector<std::string> errors = capture.Texts(Port_MsgLevel::Error);
        ASSERT_EQ(errors.size(), 1u) << c[0];
        EXPECT_NE(errors[0].find("line " + c[1] + " "), std::string::npos) << errors[0];
        EXPECT_NE(errors[0].find(dir / "bad.tbl"), std::string::npos) << errors[0];
        EXPECT_EQ(Dump(nlw), std::vector<std::string>{"KEEP:P:I:0"});
    }
    // A missing table is silent; a directory in its place is unreadable.
    StubNetlistWriter nlw;
    QuietCapture capture;
    EXPECT_FALSE(nlw.LoadSimPropTable((dir / "none.tbl").c_str()));
    EXPECT_FALSE(nlw.LoadSimPropTable(nullptr));
    EXPECT_TRUE(capture.msgs.empty());
    EXPECT_FALSE(nlw.LoadSimPropTable(dir.Path().c_str()));
    EXPECT_EQ(capture.Count(Port_MsgLevel::Error), 1u);
}

TEST(NetlistWriter, CopyHasItsOwnTable) {
    StubNetlistWriter nlw;
    nlw.AddSimProperty("X_LUT4", "INIT", "HV", "16'h0000");
    std::vector<Nlw_Property> hostList{Nlw_Property("W", "I", "1")};
    nlw.simPropTable.emplace(Port::String("HOST"), &hostList);
    StubNetlistWriter copy(nlw);
    nlw.AddSimProperty("X_LUT4", "MODE", "S", "A");
    EXPECT_EQ(Dump(copy), (std::vector<std::string>{"HOST:W:I:1", "X_LUT4:INIT:HV:16'h0000"}));
    EXPECT_EQ(copy.simPropTable.find(Port::String("HOST"))->second, &hostList);
    StubNetlistWriter assigned;
    assigned = nlw;
    EXPECT_EQ(Dump(assigned), Dump(nlw));
    const Port::String lut("X_LUT4");
    EXPECT_NE(assigned.simPropTable.find(lut)->second, nlw.simPropTable.find(lut)->second);
}

// ---------------------------------------------------------------------------
// Host services that work on the netlist model: external property lists,
// instantiability, the view's part and the netlist dump.

// A writer that keeps one more property name out, the way a format does.
class PickyWriter : public PlainWriter {
public:
    using PlainWriter::PlainWriter;
    unsigned char IsExternalProperty(Vdm_Property* p, Nlw_NlBlock* block) override {
        if (std::string(p->GetName()) == "XON") return 0;
        return PlainWriter::IsExternalProperty(p, block);
    }
    using PlainWriter::IsExternalProperty;
};

// top (module) with a port "a", a net "n" and two cells.
struct SmallDesign {
    SmallDesign() {
        Nlw_NlBuilder b(&view);
        Nlw_NlType* buf = b.AddLibraryType("X_BUF", true, false);
        b.AddTypePin(buf, "I", NLW_DIR_INPUT);
        b.AddTypePin(buf, "O", NLW_DIR_OUTPUT);
        Nlw_NlType* top = b.AddModuleType("top");
        root = b.CreateRoot(top, "top");
        Nlw_NlPin* a = b.AddPort(root, "a", NLW_DIR_INPUT);
        Nlw_NlSignal* sa = b.AddSignal(root, "a");
        Nlw_NlSignal* n = b.AddSignal(root, "n");
        b.ConnectChild(a, sa);
        cell = b.CreateLeaf(root, buf, "u1");
        b.Connect(cell->GetPin(0), sa);
        b.Connect(cell->GetPin(1), n);
        other = b.CreateLeaf(root, buf, "u2");
        b.Connect(other->GetPin(0), n);
        b.SetDevice("vx100", "vx100-fg256-5");
    }
    Nlw_NlView view;
    Nlw_NlBlock* root = nullptr;
    Nlw_NlBlock* cell = nullptr;
    Nlw_NlBlock* other = nullptr;
};

std::vector<std::string> Names(const Vdm_Property* list) {
    std::vector<std::string> out;
    if (list)
        for (const Vdm_Property* p : list->GetElements()) out.push_back(p->GetName());
    return out;
}

TEST(ExternalProperties, ListKeptWholeOrFiltered) {
    SmallDesign d;
    TempDir dir;
    hosttest::WriteFile(dir / "f.pfd", "LOC\n");
    Vdh_PropOutFilter filter((dir / "f.pfd").c_str(), nullptr);
    PickyWriter w(nullptr, nullptr, Port::Stream::Memory);

    // No list, and an empty list: nothing.
    EXPECT_EQ(w.FindExternalProperties(d.cell->GetDataBlock()), nullptr);
    d.cell->SetExternalProperties(Vdm_Property::NewList("ext"));
    EXPECT_EQ(w.FindExternalProperties(d.cell->GetDataBlock()), nullptr);

    Vdm_Property* list = Vdm_Property::NewList("ext");
    list->CreatePropertyString("INIT", "16'hABCD");
    list->CreatePropertyString("LOC", "X0Y0");
    list->CreatePropertyString("XON", "\"TRUE\"");
    list->CreatePropertyString("MODE", "\"A\"");
    d.cell->SetExternalProperties(list);
    using V = std::vector<std::string>;

    // All kept without a filter except what the writer itself refuses.
    Vdm_Property* kept = w.FindExternalProperties(d.cell->GetDataBlock());
    EXPECT_EQ(Names(kept), (V{"INIT", "LOC", "MODE"}));
    EXPECT_EQ(list->GetCount(), 4u);                      // the stored list is unchanged
    EXPECT_EQ(kept->GetElement(0), list->GetElement(0));  // the block's elements, not copies

    w.SetExtPropFilter(&filter);
    kept = w.FindExternalProperties(d.cell->GetDataBlock());
    EXPECT_EQ(Names(kept), (V{"INIT", "MODE"}));

    // When nothing is left out the stored list itself comes back.
    Vdm_Property* plain = Vdm_Property::NewList("ext");
    plain->CreatePropertyString("INIT", "1'b0");
    d.other->SetExternalProperties(plain);
    EXPECT_EQ(w.FindExternalProperties(d.other->GetDataBlock()), plain);

    // Everything left out: nothing.
    Vdm_Property* refused = Vdm_Property::NewList("ext");
    refused->CreatePropertyString("LOC", "X1Y1");
    refused->CreatePropertyString("XON", "\"FALSE\"");
    d.other->SetExternalProperties(refused);
    EXPECT_EQ(w.FindExternalProperties(d.other->GetDataBlock()), nullptr);
}

TEST(NetlistWriterModel, PartOfTheViewAndInstantiability) {
    SmallDesign d;
    StubNetlistWriter nlw;
    d.cell->AddProperty(Vdm_Property::NewBool("NLW_NOT_INSTANTIATABLE", true));
    EXPECT_EQ(nlw.IsInstantiatable(d.cell), 0);
    EXPECT_EQ(nlw.IsInstantiatable(d.other), 1);
    nlw.SetView(&d.view);
    EXPECT_STREQ(nlw.GetPmPic()->get_device(), "vx100");
    EXPECT_STREQ(nlw.GetPmPic()->get_speed(), "5");

    std::unique_ptr<PM_PIC> pic(Nlw_Util::CreatePicSpec(&d.view, true));
    ASSERT_NE(pic, nullptr);
    EXPECT_STREQ(pic->get_package(), "fg256");
    Nlw_NlView empty;
    EXPECT_EQ(Nlw_Util::CreatePicSpec(&empty, true), nullptr);
    EXPECT_EQ(Nlw_Util::CreatePicSpec(nullptr, true), nullptr);
}

TEST(NetlistWriterModel, DumpListsTheNetlist) {
    SmallDesign d;
    TempDir dir;
    Nlw_Params params;
    params.SetOutputFileName((dir / "top.v").c_str());
    Nlw_Design design("demo");
    StubNetlistWriter nlw;
    nlw.SetParams(&params);
    nlw.SetView(&d.view);
    nlw.SetDesign(&design);
    hosttest::WriteFile(dir / "top.nlw", "# Netlist dump of design old\n");
    QuietCapture capture;
    nlw.WriteNlwFile();
    nlwtest::ExpectGolden("netlist_writer/dump_lists_the_netlist",
                          hosttest::ReadFile(dir / "top.nlw"));
    EXPECT_EQ(
        capture.Texts(Port_MsgLevel::Status),
        std::vector<std::string>{"Writing netlist dump file '" + dir / "top.nlw" + "' ...\n"});
    EXPECT_EQ(hosttest::ListDir(dir.Path()), "top.nlw\n");
    // Without an output name there is nowhere to write it.
    StubNetlistWriter nameless;
    nameless.SetView(&d.view);
    nameless.WriteNlwFile();
    EXPECT_EQ(capture.Count(Port_MsgLevel::Warning), 1u);
}

}  // namespace
