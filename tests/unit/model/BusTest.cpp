// Bus settings, bus-bit name splitting and index tuple walks.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "model/Nlw_NlBuilder.h"

namespace {

using Ints = std::vector<int32_t>;

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
    struct Case {
        const char* name;
        int style;
        const char* base;  // null: no bus bit
        Ints indexes;
        bool multi = false;
    };
    const Case cases[] = {
        {"d[3]", 4, "d", {3}},
        {"d[-1]", 4, "d", {-1}},
        {"d[007]", 4, "d", {7}},
        {"\\a b [3]", 4, "\\a b ", {3}},
        {"d[1][2]", 4, "d[1]", {2}},  // one dimension only
        {"m[1][-2][3]", 4, "m", {1, -2, 3}, true},
        {"d[2147483647]", 4, "d", {2147483647}},
        {"d[-2147483648]", 4, "d", {INT32_MIN}},
        {"d[0]", 7, "d", {0}},
        {"d<3>", 7, "d", {3}},
        {"d(3)", 7, "d", {3}},
        {"d<3>", 4, nullptr, {}},
        {"d", 4, nullptr, {}},
        {"", 7, nullptr, {}},
        {"d[]", 4, nullptr, {}},
        {"d[-]", 4, nullptr, {}},
        {"d[x]", 4, nullptr, {}},
        {"d[+3]", 4, nullptr, {}},
        {"d[3]x", 4, nullptr, {}},
        {"d[3", 4, nullptr, {}},
        {"d3]", 4, nullptr, {}},
        {"d<3]", 7, nullptr, {}},
        {"[3]", 4, nullptr, {}},  // nothing but an index
        {"d[2147483648]", 4, nullptr, {}},
        {"d[-2147483649]", 4, nullptr, {}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(::testing::Message() << c.name << " style " << c.style);
        Nlw_NlBus::SetInputDelimiterType(c.style);
        Nlw_NlBus::SetMultiDimensions(c.multi);
        std::string base = "stale";
        DARRAY_Util_INT32 indexes;
        indexes.Add(42);
        EXPECT_EQ(Nlw_NlBus::IsBusName(c.name, base, &indexes), c.base != nullptr);
        if (c.base) {
            EXPECT_EQ(base, c.base);
        }
        EXPECT_EQ(Ints(indexes.begin(), indexes.end()), c.indexes);
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
    struct Case {
        int32_t msb, lsb;
        int order;
        Ints expected;
    };
    const Case cases[] = {
        {3, 0, BUS_ORDER_MSB_FIRST, {3, 2, 1, 0}},
        {3, 0, BUS_ORDER_LSB_FIRST, {0, 1, 2, 3}},
        {0, 3, BUS_ORDER_MSB_FIRST, {0, 1, 2, 3}},
        {0, 3, BUS_ORDER_LSB_FIRST, {3, 2, 1, 0}},
        {1, -2, BUS_ORDER_MSB_FIRST, {1, 0, -1, -2}},
        {5, 5, BUS_ORDER_LSB_FIRST, {5}},
        {INT32_MIN + 1, INT32_MIN, BUS_ORDER_MSB_FIRST, {INT32_MIN + 1, INT32_MIN}},
        {INT32_MAX, INT32_MAX - 1, BUS_ORDER_LSB_FIRST, {INT32_MAX - 1, INT32_MAX}},
    };
    int n = 0;
    for (const Case& c : cases) {
        SCOPED_TRACE(::testing::Message() << c.msb << ":" << c.lsb << " order " << c.order);
        Nlw_NlBus* bus = b.AddSignalBus(top, ("n" + std::to_string(n++)).c_str(), c.msb, c.lsb);
        bus->SetOrder(0, c.order);
        EXPECT_EQ(bus->GetOrder(0), c.order);
        DARRAY_Util_INT32 tuple;
        tuple.Add(c.order == BUS_ORDER_MSB_FIRST ? bus->GetMSB(0) : bus->GetLSB(0));
        Ints walked;
        std::vector<bool> first, firstExpected(c.expected.size(), false);
        firstExpected[0] = true;
        while (bus->HasMore(tuple) && walked.size() < 10) {
            walked.push_back(tuple[0]);
            first.push_back(bus->IsFirst(tuple));
            bus->Next(tuple, bus->GetDimension() - 1);
        }
        EXPECT_EQ(walked, c.expected);
        EXPECT_EQ(first, firstExpected);
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
