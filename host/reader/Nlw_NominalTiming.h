// Nominal delays for a design of the shipped cell library, which has no
// place-and-route step: every cell gets the arcs and figures of its Liberty
// description, every net a zero delay.
#pragma once

#include "framework/Nlw_Timing.h"

class Nlw_NlView;
class Nlw_Liberty;

class Nlw_NominalTiming {
public:
    // Fills timing from the library's arcs for every cell of the view. A
    // cell type the library does not describe gets one warning. Returns the
    // number of cells given delays.
    static size_t Make(const Nlw_Liberty& library, Nlw_NlView& view, Nlw_Timing& timing);
};
