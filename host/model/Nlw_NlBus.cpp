// Buses: the process-wide delimiter settings, bus-bit name splitting, index
// tuple walks and member lookup.
#include <charconv>
#include <cstring>

#include "model/Nlw_NlBuilder.h"

namespace {

int gInputDelimiterType = 7;
int gOutputDelimiterType = 4;
bool gMultiDimensions = false;

}  // namespace

bool Nlw_NlSplitIndex(const char* name, size_t end, int style, size_t& left, int32_t& value) {
    if (end < 3) return false;
    const char right = name[end - 1];
    char open;
    if (right == ']')
        open = '[';
    else if (style == 7 && right == '>')
        open = '<';
    else if (style == 7 && right == ')')
        open = '(';
    else
        return false;
    size_t i = end - 1;  // one past the last digit
    size_t first = i;
    while (first > 0 && name[first - 1] >= '0' && name[first - 1] <= '9') --first;
    if (first == i) return false;
    size_t openPos = first;
    bool negative = false;
    if (openPos > 0 && name[openPos - 1] == '-') {
        negative = true;
        --openPos;
    }
    if (openPos == 0 || name[openPos - 1] != open) return false;
    --openPos;
    // Leading zeros are allowed; the magnitude must fit.
    int64_t magnitude = 0;
    for (size_t k = first; k < i; ++k) {
        magnitude = magnitude * 10 + (name[k] - '0');
        if (magnitude > int64_t(2147483648)) return false;
    }
    if (!negative && magnitude > int64_t(2147483647)) return false;
    value = static_cast<int32_t>(negative ? -magnitude : magnitude);
    left = openPos;
    return true;
}

std::string Nlw_NlMemberName(const char* base, int64_t index) {
    std::string text;
    Nlw_NlMemberName(text, base, index);
    return text;
}

void Nlw_NlMemberName(std::string& out, const char* base, int64_t index) {
    const int style = gOutputDelimiterType;
    char digits[24];
    const std::to_chars_result end = std::to_chars(digits, digits + sizeof digits, index);
    out.assign(base);
    out += Nlw_NlBus::GetLeftDelimiter(style);
    out.append(digits, end.ptr);
    out += Nlw_NlBus::GetRightDelimiter(style);
}

void Nlw_NlBus::SetMultiDimensions(bool on) {
    gMultiDimensions = on;
}
bool Nlw_NlBus::GetMultiDimensions() {
    return gMultiDimensions;
}
void Nlw_NlBus::SetInputDelimiterType(int type) {
    gInputDelimiterType = type;
}
int Nlw_NlBus::GetInputDelimiterType() {
    return gInputDelimiterType;
}
void Nlw_NlBus::SetOutputDelimiterType(int type) {
    gOutputDelimiterType = type;
}
int Nlw_NlBus::GetOutputDelimiterType() {
    return gOutputDelimiterType;
}
char Nlw_NlBus::GetLeftDelimiter(int) {
    return '[';
}
char Nlw_NlBus::GetRightDelimiter(int) {
    return ']';
}

bool Nlw_NlBus::IsBusName(const char* name, std::string& base, DARRAY_Util_INT32* indexes) {
    if (indexes) indexes->Clear();
    if (name == nullptr) return false;
    const int style = gInputDelimiterType;
    size_t end = std::strlen(name);
    size_t left = 0;
    int32_t value = 0;
    if (!Nlw_NlSplitIndex(name, end, style, left, value) || left == 0) return false;
    // Indexes are found from the last; they are given from the first. Names
    // are split for every bus bit written, so the common few indexes take
    // no allocation.
    int32_t few[4] = {value};
    size_t count = 1;
    std::vector<int32_t> more;
    end = left;
    while (gMultiDimensions && Nlw_NlSplitIndex(name, end, style, left, value) && left > 0) {
        if (count < 4)
            few[count++] = value;
        else
            more.push_back(value);
        end = left;
    }
    base.assign(name, end);
    if (indexes) {
        for (auto it = more.rbegin(); it != more.rend(); ++it) indexes->Add(*it);
        for (size_t i = count; i-- > 0;) indexes->Add(few[i]);
    }
    return true;
}

// The walk starts at the most significant index for order 0 and at the least
// significant one for order 1, and moves towards the other end.
bool Nlw_NlBus::HasMore(const DARRAY_Util_INT32& tuple) const {
    if (tuple.GetCount() == 0) return false;
    const int32_t i = tuple[0];
    return msb_ >= lsb_ ? (i <= msb_ && i >= lsb_) : (i >= msb_ && i <= lsb_);
}

bool Nlw_NlBus::IsFirst(const DARRAY_Util_INT32& tuple) const {
    if (tuple.GetCount() == 0) return false;
    return tuple[0] == (order_ == BUS_ORDER_MSB_FIRST ? msb_ : lsb_);
}

void Nlw_NlBus::Next(DARRAY_Util_INT32& tuple, int dimension) const {
    if (dimension != 0 || tuple.GetCount() == 0) return;
    const int32_t from = order_ == BUS_ORDER_MSB_FIRST ? msb_ : lsb_;
    const int32_t to = order_ == BUS_ORDER_MSB_FIRST ? lsb_ : msb_;
    // Stepping past the end leaves the range, so HasMore turns false; the
    // index saturates instead of overflowing at the 32-bit limits.
    int32_t& i = tuple[0];
    if (from >= to) {
        if (i == INT32_MIN) {
            i = INT32_MAX;  // outside any range that ends at INT32_MIN
            return;
        }
        --i;
    } else {
        if (i == INT32_MAX) {
            i = INT32_MIN;
            return;
        }
        ++i;
    }
}

Nlw_NlPin* Nlw_NlBus::GetPinMember(int32_t index) const {
    if (!isPinBus_ || owner_ == nullptr) return nullptr;
    const int64_t low = msb_ < lsb_ ? msb_ : lsb_;
    const int64_t high = msb_ < lsb_ ? lsb_ : msb_;
    if (index < low || index > high) return nullptr;
    const int64_t pos = firstPinPos_ + posStep_ * (int64_t(index) - low);
    if (pos < 0 || pos >= int64_t(owner_->GetPinCount())) return nullptr;
    return owner_->GetPin(static_cast<size_t>(pos));
}

Nlw_NlSignal* Nlw_NlBus::GetSignalMember(int32_t index) const {
    if (isPinBus_ || members_ == nullptr) return nullptr;
    const int64_t low = msb_ < lsb_ ? msb_ : lsb_;
    const int64_t high = msb_ < lsb_ ? lsb_ : msb_;
    if (index < low || index > high) return nullptr;
    return static_cast<Nlw_NlSignal*>(members_[int64_t(index) - low]);
}

std::string Nlw_NlBus::ToString() const {
    std::string text(name_);
    text += '[';
    text += std::to_string(msb_);
    text += ':';
    text += std::to_string(lsb_);
    text += ']';
    return text;
}

void Nlw_NlBus::SetWritableName(const char* name) {
    name_ = arena_->Copy(name ? name : "", name ? std::strlen(name) : 0);
    if (!isPinBus_) return;
    if (owner_ && owner_->macro_) owner_->macro_->index.busesBuilt = false;
    if (type_ && type_->index_) type_->index_->busesBuilt = false;
}

void Nlw_NlBus::SetAka(const char* aka) {
    aka_ = aka ? arena_->Copy(aka, std::strlen(aka)) : nullptr;
}
