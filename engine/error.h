// The one error path: every failure is formatted, printed on the on-screen console and
// kept in last_error for VRX_GetLastError.
#pragma once

namespace vrx::engine {

// printf-style; messages end in a line feed. Never fails.
void ReportError(const char* fmt, ...) noexcept __attribute__((format(printf, 1, 2)));

} // namespace vrx::engine
