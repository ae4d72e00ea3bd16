// The platform layer: file-system paths. Engine paths use '\' as their separator; on
// POSIX hosts the file-system step maps it to '/', and path splitting accepts both.
#pragma once

#include <cstddef>
#include <cstdio>

namespace vrx::engine {

// True for either separator.
constexpr bool is_path_sep(char c) noexcept {
    return c == '\\' || c == '/';
}

// The base name of a path: the text after its last separator of either kind.
const char* path_base_name(const char* path) noexcept;
// Length of the directory part of a path, separator included (0 when there is none).
size_t path_dir_length(const char* path) noexcept;
// Copies `path` into `out` (capacity `cap`) in the host file system's form: on POSIX,
// backslashes become slashes. False when it does not fit.
bool host_path(const char* path, char* out, size_t cap) noexcept;
// fopen of an engine path in the host's form; null when the path is too long or the
// file cannot be opened.
std::FILE* open_host_file(const char* path, const char* mode) noexcept;

} // namespace vrx::engine
