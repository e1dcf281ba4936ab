// Nets, ports, buses and constants of a module read from netlist JSON.
#include "ReaderTestSupport.h"

using namespace readertest;

namespace {

// Port a[3:0], port b[4:5] (upto), y on a[0], k tied to 1, q; named nets of
// every rank; one bit that nothing names.
const std::string kNetsJson = nlwtest::Data("json/nets.json");

// Nets named by port, then public, then internal name, else nlw_net_<n>; a
// bus that names none of its bits is not made; buses with the file's
// indexes; ports on one net share it; constant ports get hidden global
// signals; constant cell pins are tied, x on an input to x (2); akas
// from hdlname.
TEST(JsonReaderNets, NamesConnectsAndTies) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    Loaded l = LoadText(kNetsJson);
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/nets", Text(l));
    EXPECT_EQ(l.design->GetName(), std::string("t"));
    l = LoadText(nlwtest::Data("json/scattered_bits.json"));
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/scattered_bits", Text(l));
}

}  // namespace
