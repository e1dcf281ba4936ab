// Parts and device data sets.
#include "port/PM.h"

#include <cstring>

#include "port/Port.h"

namespace {

std::string Trim(const std::string& s) {
    size_t b = s.find_first_not_of(" \t\r\n");
    if (b == std::string::npos) return std::string();
    size_t e = s.find_last_not_of(" \t\r\n");
    return s.substr(b, e - b + 1);
}

}  // namespace

PM_PIC::PM_PIC(const char* partName, bool flag, int binding) : part_(partName ? partName : "") {
    (void)flag;
    (void)binding;
    // device-package-speed; a speed grade may itself hold a '-' and keeps it.
    size_t first = part_.find('-');
    device_ = part_.substr(0, first);
    if (first == std::string::npos) return;
    size_t second = part_.find('-', first + 1);
    package_ = part_.substr(first + 1,
                            second == std::string::npos ? std::string::npos : second - first - 1);
    if (second != std::string::npos) speed_ = part_.substr(second + 1);
}

PM_DEVKEY::PM_DEVKEY(const char* name, const PM_PIC* part, bool f1, bool f2, bool f3) {
    // One data set serves every part of the installation.
    (void)part;
    (void)f1;
    (void)f2;
    (void)f3;
    const char* path = Port_Env::GetDataFileName(name, 1);
    if (!path) return;  // a data set the installation does not ship is empty
    file_ = path;
    Port::Stream stream(Port::Stream::Read);
    if (!Port::File::open(path, stream, 0)) return;
    loaded_ = true;
    std::string line;
    int lineNo = 0;
    while (stream.readline(line)) {
        ++lineNo;
        std::string text = Trim(line);
        if (text.empty() || text[0] == '#') continue;
        size_t eq = text.find('=');
        std::string key = eq == std::string::npos ? std::string() : Trim(text.substr(0, eq));
        if (key.empty()) {
            NLW_MSG().issueWarning(
                "Ignoring line %d of device data file '%s': expected KEY = items.\n", lineNo, path);
            continue;
        }
        std::vector<std::string>& items = lists_[key];
        std::string rest = text.substr(eq + 1);
        size_t start = 0;
        while (start <= rest.size()) {
            size_t comma = rest.find(',', start);
            if (comma == std::string::npos) comma = rest.size();
            std::string item = Trim(rest.substr(start, comma - start));
            if (!item.empty()) items.push_back(item);
            start = comma + 1;
        }
    }
}

const char* PM_DEVKEY::getstringbykey(const char* key, const char* separator, int index,
                                      void* unused, int flag) const {
    (void)separator;
    (void)unused;
    (void)flag;
    if (!key || index < 0) return nullptr;
    auto it = lists_.find(key);
    if (it == lists_.end() || static_cast<size_t>(index) >= it->second.size()) return nullptr;
    return it->second[static_cast<size_t>(index)].c_str();
}
