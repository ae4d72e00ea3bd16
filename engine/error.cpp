// ReportError and VRX_GetLastError.
#include "engine/error.h"

#include <cstdarg>
#include <cstdio>
#include <cstring>

#include "engine/console.h"
#include "engine/state.h"
#include "lite_vrx.h"

namespace vrx::engine {

void ReportError(const char* fmt, ...) noexcept {
    // Messages longer than the buffer are cut at 1023 characters (vsnprintf bounds it).
    char message[kLastErrorSize];
    va_list args;
    va_start(args, fmt);
    std::vsnprintf(message, sizeof message, fmt, args);
    va_end(args);

    ConPrintf("%s", message);

    // The text restarts with the message that would make it reach 1024 bytes.
    size_t have = std::strlen(g_eng.last_error);
    size_t add = std::strlen(message);
    if (have + add >= kLastErrorSize)
        std::memcpy(g_eng.last_error, message, add + 1);
    else
        std::memcpy(g_eng.last_error + have, message, add + 1);
}

} // namespace vrx::engine

extern "C" {

VRX_API int32_t VRX_GetLastError(char* dst) noexcept {
    if (!dst) return -1;
    std::memcpy(dst, vrx::engine::g_eng.last_error, std::strlen(vrx::engine::g_eng.last_error) + 1);
    return 0;
}

} // extern "C"
