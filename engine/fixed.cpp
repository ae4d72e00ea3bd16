// Storage of the small-count reciprocal table and the exported arithmetic names. The exports are
// out-of-line copies of the constexpr routines in fixed.h, so host programs compute with exactly
// the engine's arithmetic.
#include "engine/fixed.h"

#include "lite_vrx.h"

namespace vrx::engine {

int32_t RecipTable[kRecipCount];

namespace {
bool g_recip_filled = false; // RecipTable is filled once per process, at the first start
} // namespace

// Entry i is 0x1000000 / i (set-up work, so a real division is fine); entry 0 stays 0.
void FillRecipTable() {
    if (g_recip_filled) return;
    RecipTable[0] = 0;
    for (int32_t i = 1; i < kRecipCount; ++i) RecipTable[i] = 0x1000000 / i;
    g_recip_filled = true;
}

} // namespace vrx::engine

namespace eng = vrx::engine;

extern "C" {

VRX_API int32_t EGL_Sqrt(int32_t x) noexcept {
    return eng::Sqrt(x);
}
VRX_API int32_t EGL_InvSqrt(int32_t x) noexcept {
    return eng::InvSqrt(x);
}
VRX_API int32_t EGL_Inverse(int32_t x) noexcept {
    return eng::Inverse(x);
}
VRX_API int32_t EGL_hInverse(int32_t x) noexcept {
    return eng::hInverse(x);
}
VRX_API int32_t EGL_Div(int32_t a, int32_t b) noexcept {
    return eng::Div(a, b);
}
VRX_API int32_t EGL_Sin(int32_t angle) noexcept {
    return eng::Sin(angle);
}
VRX_API int32_t EGL_Cos(int32_t angle) noexcept {
    return eng::Cos(angle);
}
VRX_API int32_t F_MIN(int32_t a, int32_t b) noexcept {
    return eng::f_min(a, b);
}
VRX_API int32_t F_MAX(int32_t a, int32_t b) noexcept {
    return eng::f_max(a, b);
}
VRX_API int32_t I_MIN(int32_t a, int32_t b) noexcept {
    return eng::f_min(a, b);
}
VRX_API int32_t I_MAX(int32_t a, int32_t b) noexcept {
    return eng::f_max(a, b);
}
VRX_API int32_t I_RND(int32_t x) noexcept {
    return eng::i_rnd(x);
}

} // extern "C"
