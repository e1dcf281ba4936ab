// Device data: parts and named device data sets read from the installation.
//
// A device data set "name" is the file data/<name> below the first
// installation root that holds it. Each line "KEY = item,item,..." adds items
// to the list under KEY (several lines with the same key append); blank lines
// and lines starting with '#' are ignored; items are trimmed of blanks.
#pragma once

#include <map>
#include <string>
#include <vector>

enum PM_PARTNAME_BINDING { PM_PARTNAME_DEFAULT = 0 };

// A part: device, package and speed grade, parsed from a part name such as
// "vx100-fg256-5" (device-package-speed).
class PM_PIC {
public:
    PM_PIC(const char* partName, bool flag, int binding);
    const char* get_device() const { return device_.empty() ? nullptr : device_.c_str(); }
    const char* get_package() const { return package_.empty() ? nullptr : package_.c_str(); }
    const char* get_speed() const { return speed_.empty() ? nullptr : speed_.c_str(); }
    const char* get_partname() const { return part_.c_str(); }

private:
    std::string part_, device_, package_, speed_;
};

class PM_DEVKEY {
public:
    PM_DEVKEY(const char* name, const PM_PIC* part, bool f1, bool f2, bool f3);
    // Item index (from 0) of the list under key, or null past its end or
    // when the key is absent. The separator is the one the file uses (",").
    const char* getstringbykey(const char* key, const char* separator, int index, void* unused,
                               int flag) const;
    bool IsLoaded() const { return loaded_; }
    const char* GetFileName() const { return file_.c_str(); }

private:
    std::map<std::string, std::vector<std::string>> lists_;
    std::string file_;
    bool loaded_ = false;
};
