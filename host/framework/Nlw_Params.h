// The parsed command line of a run.
#pragma once

#include <string>
#include <vector>

#include "port/Port.h"

// A file the run reads: what it is to the user ("design", "design map",
// "SDF") and its name as given. No output may land on one.
struct Nlw_InputFile {
    std::string role;
    std::string path;
};

class Nlw_Params {
public:
    // A text parameter that was not given reads as null.
#define NLW_TEXT_PARAM(Name)                             \
    const char* Get##Name() const {                      \
        return has##Name##_ ? Name##_.c_str() : nullptr; \
    }                                                    \
    void Set##Name(const char* v) {                      \
        has##Name##_ = v != nullptr;                     \
        Name##_ = v ? v : "";                            \
    }                                                    \
                                                         \
private:                                                 \
    std::string Name##_;                                 \
    bool has##Name##_ = false;                           \
                                                         \
public:
#define NLW_FLAG_PARAM(Name, Default) \
    bool Get##Name() const {          \
        return Name##_;               \
    }                                 \
    void Set##Name(bool v) {          \
        Name##_ = v;                  \
    }                                 \
                                      \
private:                              \
    bool Name##_ = Default;           \
                                      \
public:

    // Files.
    NLW_TEXT_PARAM(InputFileName)
    NLW_TEXT_PARAM(InputFileType)  // "qdb", "qda", "json"
    NLW_TEXT_PARAM(OutputFileName)
    NLW_TEXT_PARAM(CommandLine)
    NLW_TEXT_PARAM(Vornix)  // the installation roots as given
    NLW_TEXT_PARAM(SdfPath)
    NLW_TEXT_PARAM(QdmFileName)
    NLW_TEXT_PARAM(EcnTool)
    NLW_TEXT_PARAM(RootInstanceName)    // -ti
    NLW_TEXT_PARAM(TopModuleName)       // -tm
    NLW_TEXT_PARAM(GlobalSetResetPort)  // -gp
    NLW_TEXT_PARAM(GlobalTristatePort)  // -tp
    NLW_TEXT_PARAM(LogFileName)
    NLW_TEXT_PARAM(OutputDir)  // -dir
    NLW_TEXT_PARAM(IntStyle)
    // -s: the speed grade, which overrides the part's own; null when not
    // given.
    NLW_TEXT_PARAM(Speed)
    // The output file name was given on the command line rather than derived
    // from the input: -w may then replace whatever file is there.
    NLW_FLAG_PARAM(OutputFileNamed, false)

    // Modes.
    NLW_FLAG_PARAM(SimMode, true)
    NLW_FLAG_PARAM(EcnMode, false)
    NLW_FLAG_PARAM(StaMode, false)
    NLW_FLAG_PARAM(FuncellMode, false)
    NLW_FLAG_PARAM(MHFMode, false)

    // Files to write.
    NLW_FLAG_PARAM(WriteSdfFile, false)
    NLW_FLAG_PARAM(WritePinFile, false)
    NLW_FLAG_PARAM(WriteTestFile, false)
    NLW_FLAG_PARAM(WriteInstantiatedTimcells, false)

    // Writing options.
    NLW_FLAG_PARAM(WriteEscapedNames, true)
    NLW_FLAG_PARAM(WritePsTimePrecision, true)
    NLW_FLAG_PARAM(WriteUseLib, false)
    NLW_FLAG_PARAM(WriteCellDefine, false)
    NLW_FLAG_PARAM(WriteAka, false)
    NLW_FLAG_PARAM(Insert_chipwide, true)
    NLW_FLAG_PARAM(SdfAnnotate, true)
    NLW_FLAG_PARAM(WriteShm, false)
    NLW_FLAG_PARAM(WriteVcd, false)
    NLW_FLAG_PARAM(Flatten, false)
    NLW_FLAG_PARAM(RetainHierarchy, true)
    // --suh: the closing notices on setup and hold simulation.
    NLW_FLAG_PARAM(WriteSetupHoldNotes, true)

#undef NLW_TEXT_PARAM
#undef NLW_FLAG_PARAM

    // The files the run reads; every output name is checked against them.
    void AddInputFile(const char* role, const char* path) {
        if (path && *path) inputs_.push_back({role ? role : "input", path});
    }
    const std::vector<Nlw_InputFile>& GetInputFiles() const {
        return inputs_;
    }

    Port::Stream::Access GetOutputFileMode() const {
        return mode_;
    }
    void SetOutputFileMode(Port::Stream::Access m) {
        mode_ = m;
    }

private:
    Port::Stream::Access mode_ = Port::Stream::Create;
    std::vector<Nlw_InputFile> inputs_;
};
