// A region handed to the arenas: the model is built in it, and it lives as
// long as the model does, whatever its giver and the donation list do.
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <memory>

#include "model/Nlw_NlBuilder.h"

namespace {

TEST(ArenaDonation, ModelLivesInTheDonatedRegionUntilTheViewGoes) {
    const size_t chunk = Nlw_NlArena::kChunk;
    const size_t size = 3 * chunk;
    std::shared_ptr<char> region(static_cast<char*>(std::aligned_alloc(chunk, size)),
                                 [](char* p) { std::free(p); });
    std::memset(region.get(), 0x5a, size);  // old text: the model must not need zeroes
    const char* begin = region.get();
    std::weak_ptr<char> watch = region;
    Nlw_NlArena::Donate(std::move(region), size);
    {
        Nlw_NlView view;
        Nlw_NlBuilder b{&view};
        Nlw_NlType* lut = b.AddLibraryType("LUT1", true, false);
        b.AddTypePin(lut, "O", NLW_DIR_OUTPUT);
        Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
        Nlw_NlBlock* leaf = b.CreateLeaf(top, lut, "u0");
        Nlw_NlArena::DropDonations();
        const char* at = reinterpret_cast<const char*>(leaf);
        EXPECT_TRUE(at >= begin && at < begin + size);
        EXPECT_FALSE(watch.expired());
        EXPECT_STREQ(leaf->GetPin(0)->GetWritableName(), "O");
        EXPECT_EQ(leaf->GetPin(0)->GetSignal(), nullptr);
        // Once the list is dropped, new chunks are fresh.
        Nlw_NlArena other;
        const char* fresh = static_cast<const char*>(other.Allocate(chunk, 8));
        EXPECT_FALSE(fresh >= begin && fresh < begin + size);
    }
    EXPECT_TRUE(watch.expired());
}

}  // namespace
