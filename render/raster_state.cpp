// Storage of the rasteriser's globals.
#include "render/raster.h"

namespace vrx::render {

constinit RasterContext g_raster{};
constinit TriangleFn draw_triangle = nullptr;
constinit SpanFn draw_span = nullptr;
constinit SpanFn SpanTable[kSpanSlotCount] = {};

} // namespace vrx::render
