// Triangle setup: sorts the three vertices, computes one step per scanline for each edge and
// carried field, and walks the left and right SPAN_EDGE records down the triangle, calling
// draw_span once per scanline. No gradients across the span are computed here: each filler
// derives its own per-pixel steps from the two ends.
//
// The eight drawers are one template, tri_walk<kGouraud, kTex, kDepth>: kGouraud carries
// r, g, b, a; kTex carries uw, vw; kDepth keeps zrow in step with row. The drawers without
// colour store the flat colour of the first vertex.
#include "render/triangle.h"

#include <algorithm>

#include "engine/state.h"

namespace vrx::render {

namespace {

using engine::g_eng;
using engine::wrap_add;
using engine::wrap_sub;

// d * k modulo 2^32: k scanlines of an edge's step at once, exactly as k additions give it.
constexpr int32_t wrap_mul(int32_t d, int32_t k) {
    return static_cast<int32_t>(static_cast<uint32_t>(d) * static_cast<uint32_t>(k));
}

// 1/h with 24 fraction bits for an edge height h >= 0. Heights up to 1280 read RecipTable;
// taller edges (only in buffers beyond the table's design size, or in the off-buffer part
// of a triangle) get the same quotient the table would hold.
inline int32_t edge_recip(int32_t h) noexcept {
    return h < engine::kRecipCount ? engine::RecipTable[h] : 0x1000000 / h;
}

// One edge step: the 32-bit difference times the reciprocal, a 64-bit product, >> 24.
inline int32_t edge_step(int32_t from, int32_t to, int32_t recip) noexcept {
    return static_cast<int32_t>((int64_t{wrap_sub(to, from)} * recip) >> 24);
}

// A texture coordinate times w: the 64-bit product >> 18 (u 16.16 times w with 26 fraction
// bits gives u*w with 24 fraction bits).
inline int32_t times_w(int32_t t, int32_t w) noexcept {
    return static_cast<int32_t>((int64_t{t} * w) >> 18);
}

// Puts an edge record at vertex v: the carried fields take v's values; the others keep
// whatever they held.
template <bool kGouraud, bool kTex> inline void load(SPAN_EDGE& e, const SVERTEX& v) noexcept {
    e.x = v.x;
    e.w = v.w;
    if constexpr (kGouraud) {
        e.r = v.r;
        e.g = v.g;
        e.b = v.b;
        e.a = v.a;
    }
    if constexpr (kTex) {
        e.uw = times_w(v.u, v.w);
        e.vw = times_w(v.v, v.w);
    }
}

// Per-scanline steps of the edge from p down to q over h scanlines. An edge of height 0 is
// never stepped; its steps are 0 (RecipTable[0] is 0 as well).
template <bool kGouraud, bool kTex>
inline SPAN_EDGE edge_steps(const SVERTEX& p, const SVERTEX& q, int32_t h) noexcept {
    SPAN_EDGE d{};
    if (h == 0) return d;
    const int32_t rc = edge_recip(h);
    d.x = edge_step(p.x, q.x, rc);
    d.w = edge_step(p.w, q.w, rc);
    if constexpr (kGouraud) {
        d.r = edge_step(p.r, q.r, rc);
        d.g = edge_step(p.g, q.g, rc);
        d.b = edge_step(p.b, q.b, rc);
        d.a = edge_step(p.a, q.a, rc);
    }
    if constexpr (kTex) {
        // The edge carries u*w and v*w, so the step is taken between those products.
        d.uw = edge_step(times_w(p.u, p.w), times_w(q.u, q.w), rc);
        d.vw = edge_step(times_w(p.v, p.w), times_w(q.v, q.w), rc);
    }
    return d;
}

// Advances an edge record by k scanlines (k = 1 on every drawn scanline).
template <bool kGouraud, bool kTex>
inline void advance(SPAN_EDGE& e, const SPAN_EDGE& d, int32_t k) noexcept {
    e.x = wrap_add(e.x, wrap_mul(d.x, k));
    e.w = wrap_add(e.w, wrap_mul(d.w, k));
    if constexpr (kGouraud) {
        e.r = wrap_add(e.r, wrap_mul(d.r, k));
        e.g = wrap_add(e.g, wrap_mul(d.g, k));
        e.b = wrap_add(e.b, wrap_mul(d.b, k));
        e.a = wrap_add(e.a, wrap_mul(d.a, k));
    }
    if constexpr (kTex) {
        e.uw = wrap_add(e.uw, wrap_mul(d.uw, k));
        e.vw = wrap_add(e.vw, wrap_mul(d.vw, k));
    }
}

template <bool kGouraud, bool kTex> inline void step(SPAN_EDGE& e, const SPAN_EDGE& d) noexcept {
    e.x = wrap_add(e.x, d.x);
    e.w = wrap_add(e.w, d.w);
    if constexpr (kGouraud) {
        e.r = wrap_add(e.r, d.r);
        e.g = wrap_add(e.g, d.g);
        e.b = wrap_add(e.b, d.b);
        e.a = wrap_add(e.a, d.a);
    }
    if constexpr (kTex) {
        e.uw = wrap_add(e.uw, d.uw);
        e.vw = wrap_add(e.vw, d.vw);
    }
}

// A sorted triangle with its scanlines, edge steps and sides.
template <bool kGouraud, bool kTex> struct Setup {
    const SVERTEX* t; // top
    const SVERTEX* m; // middle
    const SVERTEX* b; // bottom
    int32_t yt, ym, yb;
    SPAN_EDGE d_tm, d_tb, d_mb;
    bool short_left; // the short side (T->M then M->B) feeds `left`
};

// Sorts and steps a triangle; false when it cannot be drawn (an impossible sort row, or
// scanlines out of order, which also needs an overflowing y difference).
template <bool kGouraud, bool kTex>
inline bool set_up(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c,
                   Setup<kGouraud, kTex>& s) noexcept {
    const SortRow& row = SortOrderTable[static_cast<std::size_t>(sort_index(a->y, b->y, c->y))];
    if (sort_row_impossible(row)) return false;
    const SVERTEX* const v[3] = {a, b, c};
    s.t = v[row.top];
    s.m = v[row.mid];
    s.b = v[row.bot];
    // The scanline of a vertex is the upper half of its y, read as signed.
    s.yt = s.t->y >> 16;
    s.ym = s.m->y >> 16;
    s.yb = s.b->y >> 16;
    const int32_t h_tm = s.ym - s.yt, h_tb = s.yb - s.yt, h_mb = s.yb - s.ym;
    if (h_tm < 0 || h_mb < 0) return false;
    s.d_tm = edge_steps<kGouraud, kTex>(*s.t, *s.m, h_tm);
    s.d_tb = edge_steps<kGouraud, kTex>(*s.t, *s.b, h_tb);
    s.d_mb = edge_steps<kGouraud, kTex>(*s.m, *s.b, h_mb);
    // A flat top has no upper part: the short side starts at M, left of T or right of it.
    s.short_left = s.yt == s.ym ? s.m->x < s.t->x : s.d_tm.x < s.d_tb.x;
    return true;
}

// Where a triangle's spans can reach, relative to the render buffer.
enum class Reach {
    Inside,  // every span lies in the buffer
    Partly,  // some spans reach outside: walk the buffer rows, clip columns to the buffer
    Outside, // nothing in the buffer, or spans beyond the reciprocal table: not drawn
};

// Edge x values stay in (lowest vertex x - h, highest vertex x]: a step rounds toward minus
// infinity, so a falling edge can end up to one raw unit per scanline left of its lower
// vertex, never right of the higher one. Both coverage rules then keep every pixel between
// the floor of that lower bound and the floor of the highest x.
template <bool kGouraud, bool kTex> inline Reach reach(const Setup<kGouraud, kTex>& s) noexcept {
    const int32_t minx = std::min({s.t->x, s.m->x, s.b->x});
    const int32_t maxx = std::max({s.t->x, s.m->x, s.b->x});
    const int32_t lo = static_cast<int32_t>((int64_t{minx} - (s.yb - s.yt)) >> 16);
    const int32_t hi = maxx >> 16;
    const int32_t bw = g_eng.buf_w, bh = g_eng.buf_h;
    if (s.yt >= 0 && s.yb < bh && lo >= 0 && hi < bw) return Reach::Inside;
    if (s.yb < 0 || s.yt >= bh || hi < 0 || lo >= bw) return Reach::Outside;
    // A span of more than 1281 pixels would index the fillers' RecipTable beyond its end.
    if (hi - lo > engine::kRecipCount - 1) return Reach::Outside;
    return Reach::Partly;
}

// Narrows the clip rectangle to the render buffer (intersected with the window's clip when
// that is on) for the spans of one triangle, and puts the old rectangle back afterwards.
class BufferClip {
  public:
    BufferClip() noexcept
        : left_(g_eng.clip_left), top_(g_eng.clip_top), right_(g_eng.clip_right),
          bottom_(g_eng.clip_bottom), on_(g_eng.clip_on) {
        if (on_) {
            g_eng.clip_left = std::max(left_, 0);
            g_eng.clip_top = std::max(top_, 0);
            g_eng.clip_right = std::min(right_, g_eng.buf_w);
            g_eng.clip_bottom = std::min(bottom_, g_eng.buf_h);
        } else {
            g_eng.clip_left = 0;
            g_eng.clip_top = 0;
            g_eng.clip_right = g_eng.buf_w;
            g_eng.clip_bottom = g_eng.buf_h;
        }
        g_eng.clip_on = 1;
    }
    ~BufferClip() {
        g_eng.clip_left = left_;
        g_eng.clip_top = top_;
        g_eng.clip_right = right_;
        g_eng.clip_bottom = bottom_;
        g_eng.clip_on = on_;
    }
    BufferClip(const BufferClip&) = delete;
    BufferClip& operator=(const BufferClip&) = delete;

    bool empty() const noexcept {
        return g_eng.clip_left >= g_eng.clip_right || g_eng.clip_top >= g_eng.clip_bottom;
    }

  private:
    int32_t left_, top_, right_, bottom_, on_;
};

// Points row (and zrow) at scanline y, which lies inside the buffer.
template <bool kDepth> inline void point_rows(int32_t y) noexcept {
    const std::ptrdiff_t offset = std::ptrdiff_t{g_eng.buf_w} * y;
    g_raster.row = g_eng.color_buf + offset;
    if constexpr (kDepth) g_raster.zrow = g_eng.depth_buf + offset;
}

// Walks the scanlines yt to yb of a set-up triangle, calling the filler for those in
// [ylo, yhi); the scanlines before ylo are stepped over at once (k steps of an edge equal
// one step times k modulo 2^32, so the records arrive exactly as the full walk has them).
template <bool kGouraud, bool kTex, bool kDepth>
void walk(const Setup<kGouraud, kTex>& s, int32_t ylo, int32_t yhi, SpanFn span) noexcept {
    RasterContext& rc = g_raster;
    SPAN_EDGE& short_e = s.short_left ? rc.left : rc.right;
    SPAN_EDGE& long_e = s.short_left ? rc.right : rc.left;
    const int32_t pitch = g_eng.buf_w;

    load<kGouraud, kTex>(long_e, *s.t);
    load<kGouraud, kTex>(short_e, *s.t);
    int32_t y = s.yt;

    // Upper part: the short side runs T->M, the long side T->B, on scanlines yt to ym - 1.
    const int32_t skip_upper = std::min(ylo, s.ym) - y;
    if (skip_upper > 0) {
        advance<kGouraud, kTex>(long_e, s.d_tb, skip_upper);
        advance<kGouraud, kTex>(short_e, s.d_tm, skip_upper);
        y += skip_upper;
    }
    const int32_t end_upper = std::min(s.ym, yhi);
    if (y < end_upper) {
        point_rows<kDepth>(y);
        for (; y < end_upper; ++y) {
            span(&rc.left, &rc.right, y);
            step<kGouraud, kTex>(long_e, s.d_tb);
            step<kGouraud, kTex>(short_e, s.d_tm);
            rc.row += pitch;
            if constexpr (kDepth) rc.zrow += pitch;
        }
    }
    if (s.ym >= yhi) return;

    // Lower part: the short side restarts at M and runs M->B; scanlines ym to yb inclusive.
    load<kGouraud, kTex>(short_e, *s.m);
    const int32_t skip_lower = ylo - y;
    if (skip_lower > 0) {
        advance<kGouraud, kTex>(long_e, s.d_tb, skip_lower);
        advance<kGouraud, kTex>(short_e, s.d_mb, skip_lower);
        y += skip_lower;
    }
    const int32_t end_lower = std::min(s.yb + 1, yhi);
    if (y < end_lower) {
        point_rows<kDepth>(y);
        for (; y < end_lower; ++y) {
            span(&rc.left, &rc.right, y);
            step<kGouraud, kTex>(long_e, s.d_tb);
            step<kGouraud, kTex>(short_e, s.d_mb);
            rc.row += pitch;
            if constexpr (kDepth) rc.zrow += pitch;
        }
    }
}

// The one triangle drawer all eight are made from.
template <bool kGouraud, bool kTex, bool kDepth>
inline void tri_walk(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept {
    if constexpr (!kGouraud) {
        // The flat colour comes from the first vertex passed, whichever ends up on top.
        g_raster.flat_r = a->r;
        g_raster.flat_g = a->g;
        g_raster.flat_b = a->b;
        g_raster.flat_color = flat_color_of(a->r, a->g, a->b);
    }
    const SpanFn span = draw_span;
    if (!span || !g_eng.color_buf) return;
    if constexpr (kDepth) {
        if (!g_eng.depth_buf) return;
    }
    Setup<kGouraud, kTex> s;
    if (!set_up(a, b, c, s)) return;
    switch (reach(s)) {
        case Reach::Inside:
            walk<kGouraud, kTex, kDepth>(s, s.yt, s.yb + 1, span);
            return;
        case Reach::Partly: {
            const BufferClip clip;
            if (clip.empty()) return;
            walk<kGouraud, kTex, kDepth>(s, std::max(s.yt, 0), std::min(s.yb + 1, g_eng.buf_h),
                                         span);
            return;
        }
        case Reach::Outside:
            return;
    }
}

} // namespace

int32_t draw_triangle_clipped(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept {
    const engine::ENG_STATE& e = g_eng;
    if (e.clip_on) {
        // Whole-pixel bounds of the vertices; the triangle must overlap the rectangle
        // strictly on every side.
        const int32_t minx = std::min({a->x, b->x, c->x}) >> 16;
        const int32_t maxx = std::max({a->x, b->x, c->x}) >> 16;
        const int32_t miny = std::min({a->y, b->y, c->y}) >> 16;
        const int32_t maxy = std::max({a->y, b->y, c->y}) >> 16;
        if (!(e.clip_top < maxy && e.clip_bottom > miny && e.clip_left < maxx &&
              e.clip_right > minx))
            return 1;
    }
    if (!draw_triangle) return 1;
    draw_triangle(a, b, c);
    return 0;
}

void tri_flat(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept {
    tri_walk<false, false, false>(a, b, c);
}
void tri_flat_z(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept {
    tri_walk<false, false, true>(a, b, c);
}
void tri_gouraud(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept {
    tri_walk<true, false, false>(a, b, c);
}
void tri_gouraud_z(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept {
    tri_walk<true, false, true>(a, b, c);
}
void tri_tex(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept {
    tri_walk<false, true, false>(a, b, c);
}
void tri_tex_z(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept {
    tri_walk<false, true, true>(a, b, c);
}
void tri_tex_gouraud(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept {
    tri_walk<true, true, false>(a, b, c);
}
void tri_tex_gouraud_z(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept {
    tri_walk<true, true, true>(a, b, c);
}

} // namespace vrx::render
