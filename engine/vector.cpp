// Vector lengths and normalisation, UCS inversion and the local-coordinate operations, the pair
// turns behind every rotation of a UCS, and at the bottom the exported vector and UCS names.
#include "engine/vector.h"

#include <algorithm>
#include <initializer_list>

namespace vrx::engine {

// Squared length with 32 fraction bits. Each square is at most 2^62, so the unsigned sum of three
// cannot wrap.
static uint64_t square_sum(const VECTOR& v) {
    return static_cast<uint64_t>(int64_t{v.x} * v.x) + static_cast<uint64_t>(int64_t{v.y} * v.y) +
           static_cast<uint64_t>(int64_t{v.z} * v.z);
}

// Length as 1 / (1 / sqrt(q)) of the squared length q, scaled down where it would not fit a FIXED:
// by 1024 (result times 32) up to length 5792.6, and by 2^20 (result times 1024) beyond it;
// lengths of 32768.0 and more wrap in 32 bits.
FIXED vec_len(const VECTOR& v) {
    const uint64_t s = square_sum(v);
    if (s < (uint64_t{1} << 47)) {
        const FIXED q = static_cast<FIXED>(s >> 16);
        return q == 0 ? 0 : Inverse(InvSqrt(q));
    }
    if (s < (uint64_t{1} << 57)) {
        const FIXED q = static_cast<FIXED>(s >> 26);
        return q <= 0 ? 0 : wrap_shl(Inverse(InvSqrt(q)), 5);
    }
    const FIXED q = static_cast<FIXED>(s >> 36); // below 3 * 2^26: always positive
    return wrap_shl(Inverse(InvSqrt(q)), 10);
}

// The squares are F_MUL products summed with 32-bit wrap, without pre-scaling.
FIXED vec_inv_len(const VECTOR& v) {
    const FIXED q = wrap_add(wrap_add(f_mul(v.x, v.x), f_mul(v.y, v.y)), f_mul(v.z, v.z));
    return InvSqrt(q);
}

void vec_normalize(VECTOR& v) {
    // Bring the largest magnitude below 16.0 (at least 12 leading zeros) so the three squares
    // sum below 768.0 and cannot overflow the 32-bit sum of vec_inv_len.
    const int32_t n = std::min(
        {lead_zeros(magnitude(v.x)), lead_zeros(magnitude(v.y)), lead_zeros(magnitude(v.z))});
    if (n < 12) {
        const int32_t shift = 12 - n;
        v.x >>= shift;
        v.y >>= shift;
        v.z >>= shift;
    }
    // A zero vector gives 0x7FFFFFFF here, multiplied by zeros.
    vec_scale(vec_inv_len(v), v);
}

void vec2_norm(VECTOR2& v) {
    // Squares summed in 64 bits, shifted once, low 32 bits kept.
    const FIXED s = dot3_shift16(v.x, v.x, v.y, v.y, 0, 0);
    vec2_scale(InvSqrt(s), v);
}

// -(a0*b0 + a1*b1 + a2*b2) >> 16: the negated sum formed in 64 bits before the one shift.
static FIXED neg_dot3_shift16(FIXED a0, FIXED b0, FIXED a1, FIXED b1, FIXED a2, FIXED b2) {
    const uint64_t sum = 0u - static_cast<uint64_t>(int64_t{a0} * b0) -
                         static_cast<uint64_t>(int64_t{a1} * b1) -
                         static_cast<uint64_t>(int64_t{a2} * b2);
    return static_cast<FIXED>(static_cast<int64_t>(sum) >> 16);
}

int32_t ucs_inverse(const UCS& u, UCS& out) {
    // Axis rows a b c / d e f / g h i.
    const FIXED a = u.x.x, b = u.x.y, c = u.x.z;
    const FIXED d = u.y.x, e = u.y.y, f = u.y.z;
    const FIXED g = u.z.x, h = u.z.y, i = u.z.z;
    const VECTOR o = u.origin;

    // Cofactors: 64-bit differences of two products, each shifted once to 32 bits.
    const FIXED c0 = cross_shift16(e, i, f, h), c1 = cross_shift16(c, h, b, i),
                c2 = cross_shift16(b, f, c, e);
    const FIXED c3 = cross_shift16(f, g, d, i), c4 = cross_shift16(a, i, c, g),
                c5 = cross_shift16(c, d, a, f);
    const FIXED c6 = cross_shift16(d, h, e, g), c7 = cross_shift16(b, g, a, h),
                c8 = cross_shift16(a, e, b, d);

    // Expansion along the first column, with the 32-bit cofactors.
    const FIXED det = dot3_shift16(a, c0, d, c1, g, c2);
    if (det == 0) {
        out.origin = VECTOR{0, 0, 0};
        vec_identity_x(out.x);
        vec_identity_y(out.y);
        vec_identity_z(out.z);
        return 1;
    }

    const FIXED r = Inverse(det);
    out.x = VECTOR{f_mul(r, c0), f_mul(r, c1), f_mul(r, c2)};
    out.y = VECTOR{f_mul(r, c3), f_mul(r, c4), f_mul(r, c5)};
    out.z = VECTOR{f_mul(r, c6), f_mul(r, c7), f_mul(r, c8)};

    // The old origin, negated, carried through the new axes.
    out.origin.x = neg_dot3_shift16(o.x, out.x.x, o.y, out.y.x, o.z, out.z.x);
    out.origin.y = neg_dot3_shift16(o.x, out.x.y, o.y, out.y.y, o.z, out.z.y);
    out.origin.z = neg_dot3_shift16(o.x, out.x.z, o.y, out.y.z, o.z, out.z.z);
    return 0;
}

void ucs_to_local(const UCS& a, const UCS& f, UCS& out) {
    UCS inv{};
    ucs_inverse(f, inv); // a singular frame leaves the identity, and we go on with it
    ucs_to_global(a, inv, out);
}

void base_to_local(const VECTOR& p, const UCS& f, VECTOR& out) {
    UCS inv{};
    ucs_inverse(f, inv);
    base_to_global(p, inv, out);
}

void dir_to_local(const VECTOR& d, const UCS& f, VECTOR& out) {
    UCS inv{};
    ucs_inverse(f, inv);
    dir_to_global(d, inv, out);
}

namespace {

// Cosine and sine of an angle given in degrees as FIXED.
struct Turn {
    FIXED co, si;
};

Turn turn_of(FIXED degrees) {
    const FIXED rad = deg_to_rad(degrees);
    return {Cos(rad), Sin(rad)};
}

// first' = co*first + si*second, second' = co*second - si*first, from the old values. Each
// product is shifted by itself and the sums wrap in 32 bits.
void turn_pair(FIXED& first, FIXED& second, Turn t) {
    const FIXED p = first, q = second;
    first = wrap_add(f_mul(t.co, p), f_mul(t.si, q));
    second = wrap_sub(f_mul(t.co, q), f_mul(t.si, p));
}

void turn_vectors(VECTOR* a, VECTOR* b, Turn t) {
    turn_pair(a->x, b->x, t);
    turn_pair(a->y, b->y, t);
    turn_pair(a->z, b->z, t);
}

// Whole degrees into 0..359.
int32_t reduce_degrees(int32_t degrees) {
    const int32_t r = degrees % 360;
    return r < 0 ? r + 360 : r;
}

} // namespace

void ucs_rotate_pair(VECTOR* a, VECTOR* b, int32_t degrees) {
    turn_vectors(a, b, turn_of(reduce_degrees(degrees) << 16));
}

void ucs_rotate_pair_f(VECTOR* a, VECTOR* b, FIXED degrees) {
    turn_vectors(a, b, turn_of(degrees));
}

void ucs_rotate_about_x(VECTOR* v0, VECTOR* v1, VECTOR* v2, FIXED degrees) {
    const Turn t = turn_of(degrees);
    for (VECTOR* v : {v0, v1, v2}) turn_pair(v->y, v->z, t);
}

void ucs_rotate_about_y(VECTOR* v0, VECTOR* v1, VECTOR* v2, FIXED degrees) {
    const Turn t = turn_of(degrees);
    for (VECTOR* v : {v0, v1, v2}) turn_pair(v->z, v->x, t);
}

void ucs_rotate_about_z(VECTOR* v0, VECTOR* v1, VECTOR* v2, FIXED degrees) {
    const Turn t = turn_of(degrees);
    for (VECTOR* v : {v0, v1, v2}) turn_pair(v->x, v->y, t);
}

void ucs_rotate(UCS& u, int32_t a1, int32_t a2, int32_t a3) {
    if (a1 != 0) ucs_rotate_pair(&u.x, &u.y, a1);
    if (a2 != 0) ucs_rotate_pair(&u.y, &u.z, a2);
    if (a3 != 0) ucs_rotate_pair(&u.z, &u.x, a3);
}

void ucs_reverse_rotate(UCS& u, int32_t a1, int32_t a2, int32_t a3) {
    // Negating the remainder (always below 360 in magnitude) keeps INT32_MIN defined and
    // names the same turn as negating the angle.
    if (a3 != 0) ucs_rotate_pair(&u.z, &u.x, -(a3 % 360));
    if (a2 != 0) ucs_rotate_pair(&u.y, &u.z, -(a2 % 360));
    if (a1 != 0) ucs_rotate_pair(&u.x, &u.y, -(a1 % 360));
}

} // namespace vrx::engine

namespace eng = vrx::engine;

extern "C" {

VRX_API void Vpp(const VECTOR* a, const VECTOR* b, VECTOR* out) noexcept {
    eng::vec_add(*a, *b, *out);
}
VRX_API void Vmm(const VECTOR* a, const VECTOR* b, VECTOR* out) noexcept {
    eng::vec_sub(*a, *b, *out);
}
VRX_API void Vxx(FIXED s, VECTOR* v) noexcept {
    eng::vec_scale(s, *v);
}
VRX_API FIXED Vdot(const VECTOR* a, const VECTOR* b) noexcept {
    return eng::vec_dot(*a, *b);
}
VRX_API void Vcross(const VECTOR* a, const VECTOR* b, VECTOR* out) noexcept {
    eng::vec_cross(*a, *b, *out);
}
VRX_API FIXED Vlen(const VECTOR* v) noexcept {
    return eng::vec_len(*v);
}
VRX_API FIXED invVlen(const VECTOR* v) noexcept {
    return eng::vec_inv_len(*v);
}
VRX_API void vrxNormalize(VECTOR* v) noexcept {
    eng::vec_normalize(*v);
}
VRX_API void sim_normalize(VECTOR* v) noexcept {
    eng::vec_normalize(*v);
}

VRX_API void V2pp(const VECTOR2* a, const VECTOR2* b, VECTOR2* out) noexcept {
    eng::vec2_add(*a, *b, *out);
}
VRX_API void V2mm(const VECTOR2* a, const VECTOR2* b, VECTOR2* out) noexcept {
    eng::vec2_sub(*a, *b, *out);
}
VRX_API void V2xx(FIXED s, VECTOR2* v) noexcept {
    eng::vec2_scale(s, *v);
}
VRX_API FIXED V2dot(const VECTOR2* a, const VECTOR2* b) noexcept {
    return eng::vec2_dot(*a, *b);
}
VRX_API void V2norm(VECTOR2* v) noexcept {
    eng::vec2_norm(*v);
}

VRX_API void IdentityX(VECTOR* v) noexcept {
    eng::vec_identity_x(*v);
}
VRX_API void IdentityY(VECTOR* v) noexcept {
    eng::vec_identity_y(*v);
}
VRX_API void IdentityZ(VECTOR* v) noexcept {
    eng::vec_identity_z(*v);
}

VRX_API void GlobalUCS(const UCS* local, const UCS* parent, UCS* out) noexcept {
    eng::ucs_to_global(*local, *parent, *out);
}
VRX_API void GlobalBase(const VECTOR* p, const UCS* ucs, VECTOR* out) noexcept {
    eng::base_to_global(*p, *ucs, *out);
}
VRX_API void GlobalDir(const VECTOR* d, const UCS* ucs, VECTOR* out) noexcept {
    eng::dir_to_global(*d, *ucs, *out);
}
VRX_API int32_t LocalUCS(const UCS* a, const UCS* frame, UCS* out) noexcept {
    eng::ucs_to_local(*a, *frame, *out);
    return 0;
}
VRX_API int32_t LocalBase(const VECTOR* p, const UCS* frame, VECTOR* out) noexcept {
    eng::base_to_local(*p, *frame, *out);
    return 0;
}
VRX_API int32_t LocalDir(const VECTOR* d, const UCS* frame, VECTOR* out) noexcept {
    eng::dir_to_local(*d, *frame, *out);
    return 0;
}
VRX_API int32_t ucs_invert(const UCS* ucs, UCS* out) noexcept {
    return eng::ucs_inverse(*ucs, *out);
}
VRX_API int32_t VRX_RotateUCS(UCS* ucs, int32_t a1, int32_t a2, int32_t a3) noexcept {
    eng::ucs_rotate(*ucs, a1, a2, a3);
    return 0;
}
VRX_API int32_t VRX_ReverseRotateUCS(UCS* ucs, int32_t a1, int32_t a2, int32_t a3) noexcept {
    eng::ucs_reverse_rotate(*ucs, a1, a2, a3);
    return 0;
}

} // extern "C"
