// What the clock tracer learns about one clock component of the top module:
// the port that feeds it, whether the clock arrives inverted, and the first
// clock device met on the way back to the port.
#pragma once

class Nlw_NlBlock;
class Nlw_NlPin;

// A plain record: copied field by field, it owns nothing.
struct Nlw_PcsComp {
    explicit Nlw_PcsComp(Nlw_NlBlock* block = nullptr) : component(block) {}

    // The clock component itself.
    Nlw_NlBlock* component = nullptr;
    // The top-level input port found by the tracer; null until found.
    Nlw_NlPin* primaryClock = nullptr;
    // Flipped at every inverting stage the trace passes.
    unsigned char inverted = 0;
    // The clock device (clock buffer, clock manager or clock multiplexer)
    // nearest the component, and the output of it the trace came through.
    Nlw_NlBlock* clockDevice = nullptr;
    Nlw_NlPin* clockDevicePin = nullptr;
};
