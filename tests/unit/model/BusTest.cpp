// Bus settings, bus-bit name splitting and index tuple walks.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Nlw_NlBuilder.h"

namespace {

// Restores the process-wide bus settings after each test.
class Bus : public ::testing::Test {
protected:
    void TearDown() override {
        Nlw_NlBus::SetInputDelimiterType(7);
        Nlw_NlBus::SetOutputDelimiterType(4);
        Nlw_NlBus::SetMultiDimensions(false);
    }
};

TEST_F(Bus, StartsWithTheDefaultSettings) {
    EXPECT_EQ(Nlw_NlBus::GetInputDelimiterType(), 7);
    EXPECT_EQ(Nlw_NlBus::GetOutputDelimiterType(), 4);
    EXPECT_FALSE(Nlw_NlBus::GetMultiDimensions());
    for (int style : {4, 7, 0, 1}) {
        EXPECT_EQ(Nlw_NlBus::GetLeftDelimiter(style), '[');
        EXPECT_EQ(Nlw_NlBus::GetRightDelimiter(style), ']');
    }
}

struct SplitCase {
    const char* name;
    int style;
    bool isBus;
    const char* base;
    std::vector<int32_t> indexes;
};

TEST_F(Bus, SplitsBusBitNamesInTheInputStyle) {
    const std::vector<SplitCase> cases = {
        {"d[3]", 4, true, "d", {3}},
        {"d[0]", 7, true, "d", {0}},
        {"d[-1]", 4, true, "d", {-1}},
        {"d[007]", 4, true, "d", {7}},
        {"\\a b [3]", 4, true, "\\a b ", {3}},
        {"a.b/c[12]", 4, true, "a.b/c", {12}},
        {"d[1][2]", 4, true, "d[1]", {2}},  // one dimension only
        {"d[2147483647]", 4, true, "d", {2147483647}},
        {"d[-2147483648]", 4, true, "d", {INT32_MIN}},
        {"d<3>", 7, true, "d", {3}},
        {"d(3)", 7, true, "d", {3}},
        {"d<3>", 4, false, "", {}},
        {"d(3)", 4, false, "", {}},
        {"d", 4, false, "", {}},
        {"", 7, false, "", {}},
        {"d[]", 4, false, "", {}},
        {"d[-]", 4, false, "", {}},
        {"d[x]", 4, false, "", {}},
        {"d[+3]", 4, false, "", {}},
        {"d[3]x", 4, false, "", {}},
        {"d[3", 4, false, "", {}},
        {"d3]", 4, false, "", {}},
        {"d<3]", 7, false, "", {}},
        {"d[3>", 7, false, "", {}},
        {"[3]", 4, false, "", {}},  // nothing but an index
        {"d[2147483648]", 4, false, "", {}},
        {"d[-2147483649]", 4, false, "", {}},
        {"d[99999999999999999999]", 4, false, "", {}},
    };
    for (const SplitCase& c : cases) {
        Nlw_NlBus::SetInputDelimiterType(c.style);
        std::string base = "stale";
        DARRAY_Util_INT32 indexes;
        indexes.Add(42);
        const bool isBus = Nlw_NlBus::IsBusName(c.name, base, &indexes);
        EXPECT_EQ(isBus, c.isBus) << c.name << " style " << c.style;
        if (isBus) {
            EXPECT_EQ(base, c.base) << c.name;
        }
        std::vector<int32_t> got(indexes.begin(), indexes.end());
        EXPECT_EQ(got, c.indexes) << c.name << " style " << c.style;
    }
}

TEST_F(Bus, SplitsEveryTrailingIndexWithMultiDimensions) {
    Nlw_NlBus::SetMultiDimensions(true);
    std::string base;
    DARRAY_Util_INT32 indexes;
    ASSERT_TRUE(Nlw_NlBus::IsBusName("m[1][-2][3]", base, &indexes));
    EXPECT_EQ(base, "m");
    EXPECT_EQ(std::vector<int32_t>(indexes.begin(), indexes.end()),
              (std::vector<int32_t>{1, -2, 3}));
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

struct WalkCase {
    int32_t msb;
    int32_t lsb;
    int order;
    std::vector<int32_t> expected;
};

// The walk a port map makes: start at the msb for order 0 and at the lsb
// for order 1, step with Next while HasMore.
TEST_F(Bus, WalksIndexTuplesInEveryRangeAndOrder) {
    const std::vector<WalkCase> cases = {
        {3, 0, BUS_ORDER_MSB_FIRST, {3, 2, 1, 0}},
        {3, 0, BUS_ORDER_LSB_FIRST, {0, 1, 2, 3}},
        {0, 3, BUS_ORDER_MSB_FIRST, {0, 1, 2, 3}},
        {0, 3, BUS_ORDER_LSB_FIRST, {3, 2, 1, 0}},
        {1, -2, BUS_ORDER_MSB_FIRST, {1, 0, -1, -2}},
        {-2, 1, BUS_ORDER_LSB_FIRST, {1, 0, -1, -2}},
        {5, 5, BUS_ORDER_MSB_FIRST, {5}},
        {5, 5, BUS_ORDER_LSB_FIRST, {5}},
        {INT32_MIN + 1, INT32_MIN, BUS_ORDER_MSB_FIRST, {INT32_MIN + 1, INT32_MIN}},
        {INT32_MAX, INT32_MAX - 1, BUS_ORDER_LSB_FIRST, {INT32_MAX - 1, INT32_MAX}},
    };
    for (const WalkCase& c : cases) {
        Nlw_NlView view;
        Nlw_NlBuilder b(&view);
        Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
        Nlw_NlBus* bus = b.AddSignalBus(top, "n", c.msb, c.lsb);
        bus->SetOrder(0, c.order);
        EXPECT_EQ(bus->GetOrder(0), c.order);
        DARRAY_Util_INT32 tuple;
        tuple.Add(c.order == BUS_ORDER_MSB_FIRST ? bus->GetMSB(0) : bus->GetLSB(0));
        std::vector<int32_t> walked;
        std::vector<bool> first;
        while (bus->HasMore(tuple) && walked.size() < 10) {
            walked.push_back(tuple[0]);
            first.push_back(bus->IsFirst(tuple));
            bus->Next(tuple, bus->GetDimension() - 1);
        }
        EXPECT_EQ(walked, c.expected) << c.msb << ":" << c.lsb << " order " << c.order;
        std::vector<bool> firstExpected(c.expected.size(), false);
        firstExpected[0] = true;
        EXPECT_EQ(first, firstExpected) << c.msb << ":" << c.lsb << " order " << c.order;
    }
}

TEST_F(Bus, HasNoMoreForAnEmptyTuple) {
    Nlw_NlView view;
    Nlw_NlBuilder b(&view);
    Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
    Nlw_NlBus* bus = b.AddSignalBus(top, "n", 3, 0);
    DARRAY_Util_INT32 tuple;
    EXPECT_FALSE(bus->HasMore(tuple));
    EXPECT_FALSE(bus->IsFirst(tuple));
    bus->Next(tuple, 0);
    EXPECT_EQ(tuple.GetCount(), 0u);
    EXPECT_EQ(bus->GetDimension(), 1);
    EXPECT_EQ(bus->GetMSB(1), 0);
}

}  // namespace
