// ASCII-only case folding for names, extensions and pack entries. Bytes are signed
// characters; a byte with its top bit set starts a two-byte character.
#pragma once

#include <cstdint>

namespace vrx::engine {

char* StrUpper(char* s) noexcept;
int32_t StrCmpNoCase(const char* a, const char* b) noexcept;
int32_t StrNCmpNoCase(const char* a, const char* b, int32_t n) noexcept;

} // namespace vrx::engine
