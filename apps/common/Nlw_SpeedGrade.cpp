// -s with -timing nominal: the speed grade's delays.
//
// The shipped library's nominal figures are those of one speed grade; the
// device data list "NominalSpeedGrade" gives, per grade, the factor that
// turns them into that grade's ("4:1.25" makes grade 4 a quarter slower).
// Without -s the figures stay as the library gives them.
#include <cstdlib>
#include <string>

#include "Nlw_HostSteps.h"
#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Timing.h"
#include "port/PM.h"
#include "port/Port.h"

void Nlw_ApplySpeedGrade(Nlw_NetlistWriter& nlw, Nlw_Timing& timing) {
    const Nlw_Params* params = nlw.GetParams();
    const char* grade = params ? params->GetSpeed() : nullptr;
    if (grade == nullptr) return;
    PM_DEVKEY* data = nlw.GetDevkey();
    std::string known;
    for (int i = 0;; ++i) {
        const char* item = data->getstringbykey("NominalSpeedGrade", ",", i, nullptr, 0);
        if (item == nullptr) break;
        const std::string entry = item;
        const size_t colon = entry.find(':');
        if (colon == std::string::npos) continue;
        if (entry.compare(0, colon, grade) != 0) {
            known += (known.empty() ? "" : ", ") + entry.substr(0, colon);
            continue;
        }
        const double factor = std::atof(entry.c_str() + colon + 1);
        if (factor <= 0) break;
        for (Nlw_Rvalue& r : timing.values)
            for (double& v : r.v) v *= factor;
        NLW_MSG().issueStatus("Nominal delays of speed grade %s (x%g).\n", grade, factor);
        return;
    }
    NLW_MSG().issueWarning(
        "Speed grade %s has no nominal delays in the device data (grades: %s); the library's "
        "figures are used.\n",
        grade, known.empty() ? "none" : known.c_str());
}
