// The 73 span fillers: each is the one kernel (render/span_kernel.h) instantiated with the
// axes its line in render/span_list.inc names, as a named function with the SpanFn signature.
#include "render/span_fillers.h"

#include "render/span_kernel.h"

namespace vrx::render {

#define SPAN_FILLER(name, op, coverage, depth, uv, filter, texel)                                  \
    void name(const SPAN_EDGE* left, const SPAN_EDGE* right, int32_t y) noexcept {                 \
        span::fill_span<op, coverage, depth, uv, filter, texel>(*left, *right, y);                 \
    }
#include "render/span_list.inc"

} // namespace vrx::render
