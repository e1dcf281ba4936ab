// Corrupted design files: every mutation of a valid file either loads or is
// refused with exactly one error; none crashes, hangs or half-fills the view.
#include <gtest/gtest.h>

#include <random>
#include <string>

#include "ReaderTestSupport.h"

namespace {

using readertest::LoadText;

// A small hierarchical design in the layout yosys writes: buses with offset
// and upto, constants, parameters of every form, a blackbox cell type.
const std::string kDesign = nlwtest::Data("json/mutation_base.json");

TEST(JsonReaderMutation, CorruptedFilesLoadOrGiveOneError) {
    ASSERT_TRUE(LoadText(kDesign).ok);
    const std::string original = kDesign;
    const std::string alphabet = "{}[]\":,0123456789-xz \\abcdefghijklmnopqrstuvwxyz$.e+";
    std::mt19937 random(20261206);
    // Fifteen hundred refusals need not reach the console.
    Port_MsgManager::Instance().SetConsole(false);
    for (int round = 0; round < 1500; ++round) {
        std::string text = original;
        const int edits = 1 + static_cast<int>(random() % 4);
        for (int e = 0; e < edits; ++e) {
            const size_t pos = random() % text.size();
            switch (random() % 3) {
                case 0:  // replace a character
                    text[pos] = alphabet[random() % alphabet.size()];
                    break;
                case 1:  // delete a run
                    text.erase(pos, 1 + random() % 8);
                    break;
                default:  // duplicate a run
                    text.insert(pos, text.substr(pos, 1 + random() % 24));
                    break;
            }
        }
        const readertest::Loaded loaded = LoadText(text);
        if (loaded.ok) {
            EXPECT_TRUE(loaded.errors.empty()) << text;
            EXPECT_NE(loaded.view->GetRootMacro(), nullptr) << text;
        } else {
            EXPECT_EQ(loaded.errors.size(), 1u) << text;
            EXPECT_EQ(loaded.view->GetRootMacro(), nullptr) << text;
        }
    }
    Port_MsgManager::Instance().SetConsole(true);
}

}  // namespace
