// The engine's one allocation routine. Every record and buffer the engine owns goes
// through here, so tests can make the Nth allocation fail and check that each caller
// reports the failure, releases what it had and leaves nothing behind.
#pragma once

#include <cstddef>

namespace vrx::engine {

// malloc/calloc/free over the C runtime; a null result means "out of memory".
void* eng_malloc(std::size_t bytes) noexcept;
void* eng_calloc(std::size_t count, std::size_t size) noexcept;
void eng_free(void* p) noexcept;

// Test hook: fail the Nth allocation from now (1 = the next one); with `sticky`, every
// allocation after it fails too. n = 0 switches injection off.
void alloc_fail_at(long n, bool sticky) noexcept;
// Number of allocations made since the counter was last reset, and the reset.
long alloc_count() noexcept;
void alloc_count_reset() noexcept;
// Blocks handed out and not yet freed through eng_free.
long alloc_outstanding() noexcept;

} // namespace vrx::engine
