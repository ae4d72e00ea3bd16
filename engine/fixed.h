// Fixed-point arithmetic of the engine: 16.16 values (FIXED, 0x10000 is 1.0), the multiply
// convention, reciprocal, high-precision reciprocal, division, inverse square root, square root,
// sine and cosine with their constant tables, minimum/maximum/rounding, the degree-to-radian
// conversion, and the small-count reciprocal table of the span fillers.
//
// Everything except RecipTable is constexpr so hot code inlines it; the exported EGL_/F_/I_ names
// (fixed.cpp) are thin wrappers over these functions. All arithmetic is defined behaviour: sums
// that wrap on the target are done in uint32_t, products in int64_t, and narrowing casts keep the
// low 32 bits.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

namespace vrx::engine {

// ---- 32-bit wrap-around helpers --------------------------------------------------------------

// a + b modulo 2^32: engine sums wrap like the target's registers instead of overflowing.
constexpr int32_t wrap_add(int32_t a, int32_t b) {
    return static_cast<int32_t>(static_cast<uint32_t>(a) + static_cast<uint32_t>(b));
}

// a - b modulo 2^32.
constexpr int32_t wrap_sub(int32_t a, int32_t b) {
    return static_cast<int32_t>(static_cast<uint32_t>(a) - static_cast<uint32_t>(b));
}

// a * b modulo 2^32 (the low word of the product).
constexpr int32_t wrap_mul(int32_t a, int32_t b) {
    return static_cast<int32_t>(static_cast<uint32_t>(a) * static_cast<uint32_t>(b));
}

// -a modulo 2^32 (INT32_MIN stays INT32_MIN).
constexpr int32_t wrap_neg(int32_t a) {
    return static_cast<int32_t>(0u - static_cast<uint32_t>(a));
}

// a << s modulo 2^32 for 0 <= s <= 31 (bits shifted out are lost, as on the target).
constexpr int32_t wrap_shl(int32_t a, int32_t s) {
    return static_cast<int32_t>(static_cast<uint32_t>(a) << s);
}

// |a| as an unsigned value, so that the magnitude of INT32_MIN (2^31) is representable.
constexpr uint32_t magnitude(int32_t a) {
    return a < 0 ? 0u - static_cast<uint32_t>(a) : static_cast<uint32_t>(a);
}

// ---- Multiply ----------------------------------------------------------------------------------

// (a * b) >> 16 on the full 64-bit product, low 32 bits kept. Operands may be up to 2^31 in
// magnitude (the reciprocal routines multiply by the unsigned magnitude of their argument).
constexpr int32_t mul_shift16(int64_t a, int64_t b) {
    return static_cast<int32_t>((a * b) >> 16);
}

// Fixed-point product: signed 64-bit product, arithmetic shift right by 16, low 32 bits kept.
// No rounding, no saturation.
constexpr int32_t f_mul(int32_t a, int32_t b) {
    return mul_shift16(a, b);
}

// The engine's traditional name for f_mul.
constexpr int32_t F_MUL(int32_t a, int32_t b) {
    return f_mul(a, b);
}

// Sum of three 64-bit products, accumulated modulo 2^64 (three products of INT32_MIN squared
// would overflow a signed sum), then shifted right by 16 once and cut to 32 bits.
constexpr int32_t dot3_shift16(int32_t a0, int32_t b0, int32_t a1, int32_t b1, int32_t a2,
                               int32_t b2) {
    const uint64_t sum = static_cast<uint64_t>(int64_t{a0} * b0) +
                         static_cast<uint64_t>(int64_t{a1} * b1) +
                         static_cast<uint64_t>(int64_t{a2} * b2);
    return static_cast<int32_t>(static_cast<int64_t>(sum) >> 16);
}

// (a0*b0 - a1*b1) >> 16 with the difference formed in 64 bits (modulo 2^64), cut to 32 bits.
constexpr int32_t cross_shift16(int32_t a0, int32_t b0, int32_t a1, int32_t b1) {
    const uint64_t diff =
        static_cast<uint64_t>(int64_t{a0} * b0) - static_cast<uint64_t>(int64_t{a1} * b1);
    return static_cast<int32_t>(static_cast<int64_t>(diff) >> 16);
}

// ---- Constant tables ---------------------------------------------------------------------------

// Seeds of the reciprocal: entry k is floor(2^30 / (8 + k)).
inline constexpr std::array<int32_t, 8> InverseSeed = {0x8000000, 0x71C71C7, 0x6666666, 0x5D1745D,
                                                       0x5555555, 0x4EC4EC4, 0x4924924, 0x4444444};

// Seeds of the inverse square root: entry k is floor(2^17 / sqrt(8 + k)).
inline constexpr std::array<uint16_t, 8> InvSqrtSeed = {0xB504, 0xAAAA, 0xA1E8, 0x9A5F,
                                                        0x93CD, 0x8E00, 0x88D6, 0x8432};

namespace detail {

constexpr bool inverse_seeds_ok() {
    for (int32_t k = 0; k < 8; ++k) {
        if (InverseSeed[static_cast<std::size_t>(k)] != (int32_t{1} << 30) / (8 + k)) return false;
    }
    return true;
}

// y = floor(2^17 / sqrt(m)) exactly when y^2 * m <= 2^34 < (y + 1)^2 * m.
constexpr bool inv_sqrt_seeds_ok() {
    for (uint64_t k = 0; k < 8; ++k) {
        const uint64_t y = InvSqrtSeed[k];
        const uint64_t m = 8 + k;
        if (y * y * m > (uint64_t{1} << 34) || (y + 1) * (y + 1) * m <= (uint64_t{1} << 34))
            return false;
    }
    return true;
}

// 64x64 -> 128-bit unsigned product as (hi, lo), built from 32-bit halves so it stays portable
// and usable in constant evaluation.
struct U128 {
    uint64_t hi, lo;
};
constexpr U128 mul_u64(uint64_t a, uint64_t b) {
    const uint64_t al = a & 0xFFFFFFFFu, ah = a >> 32, bl = b & 0xFFFFFFFFu, bh = b >> 32;
    const uint64_t ll = al * bl, lh = al * bh, hl = ah * bl, hh = ah * bh;
    const uint64_t mid = (ll >> 32) + (lh & 0xFFFFFFFFu) + (hl & 0xFFFFFFFFu);
    return {hh + (lh >> 32) + (hl >> 32) + (mid >> 32), (mid << 32) | (ll & 0xFFFFFFFFu)};
}

// Product of two unsigned values with 62 fraction bits (both below 2^63), truncated.
constexpr uint64_t mul_q62(uint64_t a, uint64_t b) {
    const U128 p = mul_u64(a, b);
    return (p.hi << 2) | (p.lo >> 62);
}

// pi with 62 fraction bits, truncated (pi = 3.243F6A8885A308D313... in hexadecimal).
inline constexpr uint64_t kPiQ62 = 0xC90FDAA22168C234u;

// sin(x) for 0 <= x <= pi/2, x and result with 62 fraction bits, by its Taylor series. Each
// term is below the previous one and the partial sums stay positive on this interval, so plain
// unsigned arithmetic serves; every step truncates by under one unit of 2^-62.
constexpr uint64_t sin_q62(uint64_t x) {
    const uint64_t x2 = mul_q62(x, x);
    uint64_t term = x, sum = x;
    for (uint64_t n = 1; term != 0; ++n) {
        term = mul_q62(term, x2) / ((2 * n) * (2 * n + 1));
        sum = (n & 1) ? sum - term : sum + term;
    }
    return sum;
}

struct SinEntry {
    uint16_t value;
    bool certain; // the exact product lies far enough from an integer for the floor to be sure
};

// floor(65535 * sin(k * pi / 2046)) from integer arithmetic. The angle carries an error below
// 1100 units of 2^-62 (pi/2046 is truncated once and multiplied by k <= 1023) and the series
// adds under 50 more, so 65535 * sin is known to within 2^-35; the floor is certain whenever the
// fractional part keeps 2^-30 away from an integer, which the table build checks for every entry.
constexpr SinEntry sin_entry(uint64_t k) {
    const uint64_t x = k * (kPiQ62 / 2046);
    const U128 p = mul_u64(sin_q62(x), 65535);
    const uint64_t frac = p.lo & ((uint64_t{1} << 62) - 1);
    const uint64_t margin = uint64_t{1} << 32;
    return {static_cast<uint16_t>((p.hi << 2) | (p.lo >> 62)),
            k == 0 || (frac > margin && frac < (uint64_t{1} << 62) - margin)};
}

struct SinTableBuild {
    std::array<uint16_t, 1024> table{};
    bool certain = true;
};

// The quarter-wave table. Entry 1023 is 65534: the table never reaches 1.0.
constexpr SinTableBuild build_sin_table() {
    SinTableBuild b;
    for (uint64_t k = 0; k < 1023; ++k) {
        const SinEntry e = sin_entry(k);
        b.table[k] = e.value;
        b.certain = b.certain && e.certain;
    }
    b.table[1023] = 65534;
    return b;
}

inline constexpr SinTableBuild kSinBuild = build_sin_table();
static_assert(kSinBuild.certain, "a sine table entry lies too close to an integer");

} // namespace detail

static_assert(detail::inverse_seeds_ok(), "InverseSeed must be floor(2^30 / (8 + k))");
static_assert(detail::inv_sqrt_seeds_ok(), "InvSqrtSeed must be floor(2^17 / sqrt(8 + k))");

// Quarter-wave sine table: entry k (0..1022) is floor(65535 * sin(k * pi / 2046)); entry 1023
// is 65534. Built at compile time from exact integer arithmetic (see detail::sin_entry).
inline constexpr std::array<uint16_t, 1024> SinTable = detail::kSinBuild.table;
static_assert(SinTable[0] == 0 && SinTable[1] == 100 && SinTable[2] == 201);
static_assert(SinTable[341] == 32767); // sin(pi / 6) = 0.5 exactly
static_assert(SinTable[1020] == 65534 && SinTable[1021] == 65534 && SinTable[1022] == 65534 &&
              SinTable[1023] == 65534);

// Reciprocals of small counts for the span fillers: entry 0 is 0, entry i is 0x1000000 / i.
// Filled by FillRecipTable (once per process).
inline constexpr int32_t kRecipCount = 1281;
extern int32_t RecipTable[kRecipCount];

// Fills RecipTable on the first call; later calls do nothing.
void FillRecipTable();

// ---- Normalisation step ------------------------------------------------------------------------

// Result of the normalisation step: n leading zero bits, seed index k (the three bits after the
// leading one, 0 below 8) and scale s = n - 16.
struct NormStep {
    int32_t n, k, s;
};

// Leading-zero count of a 32-bit value by a fixed binary search; 0 counts 31, like 1.
constexpr int32_t lead_zeros(uint32_t a) {
    int32_t n = 31;
    uint32_t w = a;
    if (a & 0xFFFF0000u) {
        n = 15;
        w = a >> 16;
    }
    if (w & 0xFF00u) {
        n -= 8;
        w >>= 8;
    }
    if (w & 0xF0u) {
        n -= 4;
        w >>= 4;
    }
    if (w & 0xCu) {
        n -= 2;
        w >>= 2;
    }
    if (w & 2u) n -= 1;
    return n;
}

// Normalisation shared by the reciprocal and inverse-square-root routines.
constexpr NormStep normalise(uint32_t a) {
    const int32_t n = lead_zeros(a);
    // Below 8 the shift count 28 - n would be negative; the seed index is then 0.
    const int32_t k = n <= 28 ? static_cast<int32_t>((a >> (28 - n)) & 7u) : 0;
    return {n, k, n - 16};
}

// ---- Reciprocals and division ------------------------------------------------------------------

// 1/x as FIXED (about 2^32 / x raw): table seed plus two Newton steps. 0 gives 0x7FFFFFFF; the
// magnitudes 1 and 2, whose reciprocals do not fit, give +-0x7FFFFFFF.
constexpr int32_t Inverse(int32_t x) {
    if (x == 0) return 0x7FFFFFFF;
    const bool neg = x < 0;
    const uint32_t a = magnitude(x);
    if (a <= 2) return neg ? -0x7FFFFFFF : 0x7FFFFFFF;
    const NormStep ns = normalise(a);
    int32_t y = InverseSeed[static_cast<std::size_t>(ns.k)] >> 10; // ~2^32 / a to three bits
    y = ns.s > 0 ? wrap_shl(y, ns.s) : y >> -ns.s;
    for (int step = 0; step < 2; ++step) {
        // y = y * (2 - y * a), with 2.0 as 0x20000; the difference wraps like the target's.
        y = mul_shift16(wrap_sub(0x20000, mul_shift16(y, a)), y);
    }
    return neg ? wrap_neg(y) : y;
}

// 1/x with 24 fraction bits (about 2^40 / x raw), for |x| above 0x8000: two Newton steps from the
// seed scaled to 26 fraction bits. 0 gives 0x7FFFFFFF; magnitudes up to 0x8000 give the
// truncated quotient 2^40 / |x| saturated at 0x7FFFFFFF, with the sign of x.
constexpr int32_t hInverse(int32_t x) {
    if (x == 0) return 0x7FFFFFFF;
    const bool neg = x < 0;
    const uint32_t a = magnitude(x);
    if (a <= 0x8000u) {
        // The 30-fraction-bit intermediate would overflow; use the exact quotient instead.
        const int64_t q = (int64_t{1} << 40) / a;
        const int32_t r = q > 0x7FFFFFFF ? 0x7FFFFFFF : static_cast<int32_t>(q);
        return neg ? -r : r;
    }
    const NormStep ns = normalise(a);
    // a > 0x8000 means s <= 0: the seed (~2^42 / a) only shifts right.
    int32_t y = InverseSeed[static_cast<std::size_t>(ns.k)] >> -ns.s;
    // 26 -> 28 fraction bits: t = 2.0 - y * a with 2.0 as 0x8000000.
    int32_t t = wrap_sub(0x8000000, mul_shift16(y, a));
    y = static_cast<int32_t>((int64_t{t} * y) >> 24);
    // 28 -> 30 fraction bits: y * a has 44 fraction bits, >> 18 brings it back to 26.
    t = wrap_sub(0x8000000, static_cast<int32_t>((int64_t{y} * a) >> 18));
    y = static_cast<int32_t>((int64_t{t} * y) >> 24);
    y >>= 6; // 30 -> 24 fraction bits
    return neg ? wrap_neg(y) : y;
}

// a / b as FIXED. A divisor of about 256.0 or more is pre-shifted by 8 bits (its reciprocal would
// fall below a raw unit); a zero divisor multiplies a by 0x7FFFFFFF.
constexpr int32_t Div(int32_t a, int32_t b) {
    const int32_t top = b >> 24;
    if (top != 0 && top != -1) return f_mul(a >> 8, Inverse(b >> 8));
    return f_mul(Inverse(b), a);
}

// ---- Square roots ------------------------------------------------------------------------------

// 1/sqrt(x) as FIXED for positive x: seed plus three Newton steps. 0 and negative arguments
// give 0x7FFFFFFF; 1.0 gives 1.0 exactly.
constexpr int32_t InvSqrt(int32_t x) {
    if (x <= 0) return 0x7FFFFFFF;
    if (x == 0x10000) return 0x10000;
    const NormStep ns = normalise(static_cast<uint32_t>(x));
    int32_t y = 2 * InvSqrtSeed[static_cast<std::size_t>(ns.k)];
    // Halve the scale for the square root; an odd scale leaves a factor 1/sqrt(2) (46340/65536).
    if (ns.s <= 0) {
        y >>= (-ns.s) >> 1;
    } else {
        y = wrap_shl(y, (ns.s & 1) + (ns.s >> 1));
    }
    if (ns.s & 1) y = f_mul(y, 46340);
    for (int step = 0; step < 3; ++step) {
        // y = (y / 2) * (3 - y * x * y), with 3.0 as 0x30000 and y / 2 from the entering y.
        y = f_mul(wrap_sub(0x30000, f_mul(f_mul(y, x), y)), y >> 1);
    }
    return y;
}

// sqrt(x) as FIXED through 1 / (1 / sqrt(x)); 0 for x <= 0.
constexpr int32_t Sqrt(int32_t x) {
    return x <= 0 ? 0 : Inverse(InvSqrt(x));
}

// ---- Sine and cosine ---------------------------------------------------------------------------

// One turn in raw radian units (2 * pi * 65536, rounded).
inline constexpr int32_t kTurn = 411775;

// Brings a negative angle into 0..kTurn-1 by adding whole turns; positive angles are left alone
// (the phase computation wraps them).
constexpr int32_t reduce_negative_angle(int32_t angle) {
    if (angle >= 0) return angle;
    const int64_t turns = (-int64_t{angle} - 1) / kTurn + 1;
    return static_cast<int32_t>(angle + turns * kTurn);
}

// 32-bit phase of an angle: angle * 10430 (65536 / 2pi) wrapped in 32 bits, read as signed.
constexpr int32_t angle_phase(int32_t angle) {
    return static_cast<int32_t>(static_cast<uint32_t>(reduce_negative_angle(angle)) * 10430u);
}

// Table lookup for a 12-bit phase (4096 steps per turn): quarter by bit 10 (mirror) and half by
// bit 11 (negate).
constexpr int32_t sin_of_phase(int32_t phase) {
    const int32_t i = phase & 0x3FF;
    const int32_t mag = (phase & 0x400) ? SinTable[static_cast<std::size_t>(1023 - i)]
                                        : SinTable[static_cast<std::size_t>(i)];
    return (phase & 0x800) ? -mag : mag;
}

// sin(angle) for an angle in radians as FIXED; the result lies in -65534..65534.
constexpr int32_t Sin(int32_t angle) {
    return sin_of_phase(angle_phase(angle) >> 20);
}

// cos(angle): the sine phase advanced by a quarter turn (0x4000 in 16-bit phase units).
constexpr int32_t Cos(int32_t angle) {
    return sin_of_phase(((angle_phase(angle) >> 16) + 0x4000) >> 4);
}

// Degrees (FIXED) to radians (FIXED): times 1144 (65536 * pi / 180, rounded) on a 64-bit
// product, shifted right by 16.
constexpr int32_t deg_to_rad(int32_t degrees) {
    return static_cast<int32_t>((int64_t{degrees} * 1144) >> 16);
}

// ---- Minimum, maximum, clamp, rounding ---------------------------------------------------------

// The smaller of a and b (signed); FIXED and integers compare alike.
constexpr int32_t f_min(int32_t a, int32_t b) {
    return a < b ? a : b;
}

// The larger of a and b (signed).
constexpr int32_t f_max(int32_t a, int32_t b) {
    return a > b ? a : b;
}

// low if v < low, else high if v > high, else v.
constexpr int32_t f_clamp(int32_t v, int32_t low, int32_t high) {
    return v < low ? low : (v > high ? high : v);
}

// Nearest integer of a FIXED value, halves upward: (x + 0.5) >> 16, the sum wrapping in 32 bits.
constexpr int32_t i_rnd(int32_t x) {
    return wrap_add(x, 0x8000) >> 16;
}

} // namespace vrx::engine
