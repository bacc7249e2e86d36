#include "cxf3text.h"

#include <ctime>

namespace {

template <typename S> S UpToFirstNul(const S &ar_text) {
    const auto nul = ar_text.find(typename S::value_type(0));
    return nul == S::npos ? ar_text : ar_text.substr(0, nul);
}

} // namespace

std::wstring ToWide(const std::string &ar_text) {
    std::wstring wide;
    lmx::vtostring(wide, UpToFirstNul(ar_text));
    return wide;
}

std::string ToNarrow(const std::wstring &ar_text) {
    std::string narrow;
    lmx::convert(narrow, UpToFirstNul(ar_text));
    return narrow;
}

lmx::c_datetime CurrentUtcDateTime() {
    const std::time_t now = std::time(nullptr);
    std::tm broken_down{};
    gmtime_r(&now, &broken_down);
    lmx::c_datetime date;
    date.set_year(broken_down.tm_year + 1900);
    date.set_month(static_cast<std::uint32_t>(broken_down.tm_mon + 1));
    date.set_day(static_cast<std::uint32_t>(broken_down.tm_mday));
    date.set_hours(static_cast<std::uint32_t>(broken_down.tm_hour));
    date.set_minutes(static_cast<std::uint32_t>(broken_down.tm_min));
    date.set_seconds(static_cast<float>(broken_down.tm_sec));
    date.set_utc(true);
    return date;
}
