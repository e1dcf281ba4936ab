#include "Nlw_RunFiles.h"

#include "framework/Nlw_FileSafety.h"

bool Nlw_CheckRunFiles(Nlw_Params& params, const char* wrapLog) {
    params.AddInputFile("design", params.GetInputFileName());
    params.AddInputFile("design map", params.GetQdmFileName());
    const std::vector<Nlw_InputFile>& inputs = params.GetInputFiles();
    const char* log = params.GetLogFileName();
    if (log && !Nlw_FileSafety::CheckNotInput(log, "Log file", inputs)) return false;
    if (wrapLog && *wrapLog && !Nlw_FileSafety::CheckNotInput(wrapLog, "Log file", inputs))
        return false;
    return Nlw_FileSafety::CheckNotInput(params.GetOutputFileName(), "Output file", inputs);
}
