// Vectors and coordinate systems (UCS): vector sums, products, lengths and normalisation; carrying
// points, directions and whole systems between a UCS and its parent; inverting a UCS; and turning
// a UCS about its own axes or its parent's.
//
// The exported names (Vpp, GlobalUCS, ucs_invert, VRX_RotateUCS, ...) are thin wrappers in
// vector.cpp over the functions declared here. Rows and dot products are accumulated in 64 bits
// and shifted once; the pair turns shift every product by itself. Both kinds are kept exactly as
// they are: results may differ in the last bit between them.
#pragma once

#include <cstdint>

#include "engine/fixed.h"
#include "lite_vrx.h"

namespace vrx::engine {

// ---- Vectors (inline: used per vertex) ---------------------------------------------------------

// out = a + b per component, wrapping in 32 bits; out may be a or b.
constexpr void vec_add(const VECTOR& a, const VECTOR& b, VECTOR& out) {
    out.x = wrap_add(a.x, b.x);
    out.y = wrap_add(a.y, b.y);
    out.z = wrap_add(a.z, b.z);
}

// out = a - b per component, wrapping in 32 bits; out may be a or b.
constexpr void vec_sub(const VECTOR& a, const VECTOR& b, VECTOR& out) {
    out.x = wrap_sub(a.x, b.x);
    out.y = wrap_sub(a.y, b.y);
    out.z = wrap_sub(a.z, b.z);
}

// v = s * v per component, in place.
constexpr void vec_scale(FIXED s, VECTOR& v) {
    v.x = f_mul(s, v.x);
    v.y = f_mul(s, v.y);
    v.z = f_mul(s, v.z);
}

// a . b: three 64-bit products summed in 64 bits, shifted right by 16 once.
constexpr FIXED vec_dot(const VECTOR& a, const VECTOR& b) {
    return dot3_shift16(a.x, b.x, a.y, b.y, a.z, b.z);
}

// out = a x b, each component a 64-bit difference shifted once. out must differ from a and b.
constexpr void vec_cross(const VECTOR& a, const VECTOR& b, VECTOR& out) {
    out.x = cross_shift16(a.y, b.z, a.z, b.y);
    out.y = cross_shift16(a.z, b.x, a.x, b.z);
    out.z = cross_shift16(a.x, b.y, a.y, b.x);
}

// Length of v (see vector.cpp for the ranges).
FIXED vec_len(const VECTOR& v);

// 1 / length of v: the squares are F_MUL products summed in 32 bits, so v must be shorter than
// 181.0; a zero vector gives 0x7FFFFFFF.
FIXED vec_inv_len(const VECTOR& v);

// Scales v to unit length in place, pre-scaling long vectors so the squares cannot overflow.
void vec_normalize(VECTOR& v);

// v = (1, 0, 0), (0, 1, 0), (0, 0, 1).
constexpr void vec_identity_x(VECTOR& v) {
    v = VECTOR{0x10000, 0, 0};
}
constexpr void vec_identity_y(VECTOR& v) {
    v = VECTOR{0, 0x10000, 0};
}
constexpr void vec_identity_z(VECTOR& v) {
    v = VECTOR{0, 0, 0x10000};
}

// ---- Two-component vectors ---------------------------------------------------------------------

// out = a + b; out may be a or b.
constexpr void vec2_add(const VECTOR2& a, const VECTOR2& b, VECTOR2& out) {
    out.x = wrap_add(a.x, b.x);
    out.y = wrap_add(a.y, b.y);
}

// out = a - b; out may be a or b.
constexpr void vec2_sub(const VECTOR2& a, const VECTOR2& b, VECTOR2& out) {
    out.x = wrap_sub(a.x, b.x);
    out.y = wrap_sub(a.y, b.y);
}

// v = s * v per component, in place.
constexpr void vec2_scale(FIXED s, VECTOR2& v) {
    v.x = f_mul(s, v.x);
    v.y = f_mul(s, v.y);
}

// a . b: two 64-bit products summed in 64 bits, shifted right by 16 once.
constexpr FIXED vec2_dot(const VECTOR2& a, const VECTOR2& b) {
    return dot3_shift16(a.x, b.x, a.y, b.y, 0, 0);
}

// Scales v to unit length in place; v must be shorter than 181.0.
void vec2_norm(VECTOR2& v);

// ---- Coordinate systems ------------------------------------------------------------------------

// A local direction d in the coordinates of u's parent: d.x*X + d.y*Y + d.z*Z, each component
// accumulated in 64 bits and shifted once. out may be d.
constexpr void dir_to_global(const VECTOR& d, const UCS& u, VECTOR& out) {
    const VECTOR v = d;
    out.x = dot3_shift16(v.x, u.x.x, v.y, u.y.x, v.z, u.z.x);
    out.y = dot3_shift16(v.x, u.x.y, v.y, u.y.y, v.z, u.z.y);
    out.z = dot3_shift16(v.x, u.x.z, v.y, u.y.z, v.z, u.z.z);
}

// A local point p in the coordinates of u's parent: the direction formula plus u's origin, added
// after the shift. out may be p.
constexpr void base_to_global(const VECTOR& p, const UCS& u, VECTOR& out) {
    VECTOR d{};
    dir_to_global(p, u, d);
    out.x = wrap_add(u.origin.x, d.x);
    out.y = wrap_add(u.origin.y, d.y);
    out.z = wrap_add(u.origin.z, d.z);
}

// The local system l expressed in the coordinates in which the parent p is given. Rows are
// written one by one after each is read, the origin last, so out may be l; never p.
constexpr void ucs_to_global(const UCS& l, const UCS& p, UCS& out) {
    dir_to_global(l.x, p, out.x);
    dir_to_global(l.y, p, out.y);
    dir_to_global(l.z, p, out.z);
    base_to_global(l.origin, p, out.origin);
}

// out = inverse of u (parent coordinates in terms of u): a general 3x3 inversion, not a
// transpose. Returns 0, or 1 with out set to the identity when the axes are singular. out must
// differ from u.
int32_t ucs_inverse(const UCS& u, UCS& out);

// The system a expressed in the frame f's coordinates; a singular frame counts as the identity.
// out may be a.
void ucs_to_local(const UCS& a, const UCS& f, UCS& out);

// A parent-space point in f's local coordinates. out may be p.
void base_to_local(const VECTOR& p, const UCS& f, VECTOR& out);

// A parent-space direction in f's local coordinates. out may be d.
void dir_to_local(const VECTOR& d, const UCS& f, VECTOR& out);

// ---- Rotations ---------------------------------------------------------------------------------

// Turns axis a toward axis b by a whole number of degrees, reduced into 0..359 first.
void ucs_rotate_pair(VECTOR* a, VECTOR* b, int32_t degrees);

// Turns axis a toward axis b by an angle in degrees as FIXED, without reduction.
void ucs_rotate_pair_f(VECTOR* a, VECTOR* b, FIXED degrees);

// Turns the (y, z) components of each of three vectors (a UCS's axes): a turn about the parent's
// X axis. Angle in degrees as FIXED.
void ucs_rotate_about_x(VECTOR* v0, VECTOR* v1, VECTOR* v2, FIXED degrees);

// Turns the (z, x) components of each vector: a turn about the parent's Y axis.
void ucs_rotate_about_y(VECTOR* v0, VECTOR* v1, VECTOR* v2, FIXED degrees);

// Turns the (x, y) components of each vector: a turn about the parent's Z axis.
void ucs_rotate_about_z(VECTOR* v0, VECTOR* v1, VECTOR* v2, FIXED degrees);

// Turns u about its own axes: (X, Y) by a1, then (Y, Z) by a2, then (Z, X) by a3, whole degrees,
// each only when non-zero. The origin stays.
void ucs_rotate(UCS& u, int32_t a1, int32_t a2, int32_t a3);

// Undoes ucs_rotate with the same angles: opposite turns in the opposite order.
void ucs_reverse_rotate(UCS& u, int32_t a1, int32_t a2, int32_t a3);

} // namespace vrx::engine
