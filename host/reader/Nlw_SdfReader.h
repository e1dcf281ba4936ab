// Reads the delays a place-and-route tool wrote for a design (SDF 3.0 or
// 2.1) and carries them onto the design's model: every entry is matched to
// the blocks and pins by the design's original names.
#pragma once

#include <cstddef>

#include "framework/Nlw_Timing.h"

class Nlw_NlView;

class Nlw_SdfReader {
public:
    // Reads fileName and adds what it finds to timing. A malformed file
    // gives one error naming the file and line, and false (timing is then
    // to be thrown away). An entry that matches nothing in the view gives a
    // warning naming it and is left out; a last warning counts them.
    static bool Load(const char* fileName, Nlw_NlView& view, Nlw_Timing& timing);
    // The same on text in memory; fileName names it in messages.
    static bool LoadText(const char* fileName, const char* text, size_t size, Nlw_NlView& view,
                         Nlw_Timing& timing);
};
