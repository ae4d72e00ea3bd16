// Name folding and comparison shared by every look-up by name.
#include "engine/names.h"

namespace vrx::engine {

namespace {
constexpr int32_t fold(char c) noexcept {
    auto v = static_cast<int32_t>(static_cast<signed char>(c));
    return (v >= 'a' && v <= 'z') ? v - ('a' - 'A') : v;
}
} // namespace

char* StrUpper(char* s) noexcept {
    for (char* p = s; *p; ++p) {
        if (static_cast<signed char>(*p) < 0) {
            // Lead byte of a two-byte character: keep it and its trail byte as they are.
            if (!p[1]) break;
            ++p;
            continue;
        }
        if (*p >= 'a' && *p <= 'z') *p = static_cast<char>(*p - ('a' - 'A'));
    }
    return s;
}

int32_t StrCmpNoCase(const char* a, const char* b) noexcept {
    for (;; ++a, ++b) {
        int32_t ca = fold(*a), cb = fold(*b);
        if (ca != cb) return ca - cb;
        if (ca == 0) return 0;
    }
}

int32_t StrNCmpNoCase(const char* a, const char* b, int32_t n) noexcept {
    for (int32_t i = 0; i < n; ++i) {
        int32_t ca = fold(a[i]), cb = fold(b[i]);
        if (ca != cb) return ca - cb;
    }
    return 0;
}

} // namespace vrx::engine
