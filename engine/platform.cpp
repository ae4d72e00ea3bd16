// Path handling for the host file system.
#include "engine/platform.h"

#include <cstring>

namespace vrx::engine {

const char* path_base_name(const char* path) noexcept {
    const char* base = path;
    for (const char* p = path; *p; ++p)
        if (is_path_sep(*p)) base = p + 1;
    return base;
}

size_t path_dir_length(const char* path) noexcept {
    return static_cast<size_t>(path_base_name(path) - path);
}

bool host_path(const char* path, char* out, size_t cap) noexcept {
    size_t n = std::strlen(path);
    if (n + 1 > cap) return false;
    for (size_t i = 0; i <= n; ++i) {
#if defined(_WIN32)
        out[i] = path[i];
#else
        out[i] = path[i] == '\\' ? '/' : path[i];
#endif
    }
    return true;
}

std::FILE* open_host_file(const char* path, const char* mode) noexcept {
    char native[1024];
    if (!host_path(path, native, sizeof native)) return nullptr;
    return std::fopen(native, mode);
}

} // namespace vrx::engine
