// Rules that keep a run's output where it belongs: never onto an input,
// never over a file the user did not give or this program did not write,
// and module file names that stay inside the output folder.
#pragma once

#include <string>
#include <vector>

#include "framework/Nlw_Params.h"

class Nlw_FileSafety {
public:
    // True when both names lead to the same existing file (links and hard
    // links included), or are the same text.
    static bool IsSameFile(const char* a, const char* b);
    // The input that path would overwrite, or null.
    static const Nlw_InputFile* FindInput(const char* path,
                                          const std::vector<Nlw_InputFile>& inputs);
    // The one check every output goes through before anything is opened for
    // writing: reports "<what> '<path>' is the <role> file '<input>'; ..." as
    // an error and returns false when path is one of the inputs. what names
    // the output ("Output file", "Log file").
    static bool CheckNotInput(const char* path, const char* what,
                              const std::vector<Nlw_InputFile>& inputs);
    // True when the file's head shows it was written by this program (the
    // notice of the netlists and test fixtures, the first line of the pin
    // map and translation files, the chipwide guard, the netlist dump), or
    // it is empty. A file that cannot be read is not.
    static bool IsOwnFile(const char* path);

    // File base names for written module names: only letters, digits, "_"
    // and "-" (anything else becomes "_"), never starting with "-", never a
    // device name of any platform, at most kMaxBaseName characters, and
    // unique ignoring case among themselves and against reserved (the run's
    // own file base names, such as "chipwide"). A name that would collide
    // gets "_2", "_3", ... Names in, base names out, in the same order;
    // equal names in give equal base names out.
    static std::vector<std::string> SafeFileNames(const std::vector<std::string>& names,
                                                  const std::vector<std::string>& reserved);
    static constexpr size_t kMaxBaseName = 120;
};
