// Storage of the engine's global state. Before the first VRX_Open everything is zero
// except eng_flags, which starts with depth testing on as the hint defaults say.
#include "engine/state.h"

namespace vrx::engine {

constinit ENG_STATE g_eng{};
render::SVERTEX vtx_store[render::kVtxStoreCount];

} // namespace vrx::engine
