// Bus settings, bus-bit name splitting and index tuple walks.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "TestFiles.h"
#include "model/Nlw_NlBuilder.h"

namespace {

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
    // Any of [] <> () read, one dimension, by default.
    EXPECT_EQ(Nlw_NlBus::GetInputDelimiterType(), 7);
    EXPECT_EQ(Nlw_NlBus::GetOutputDelimiterType(), 4);
    EXPECT_FALSE(Nlw_NlBus::GetMultiDimensions());
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
