// Allocation with failure injection: a countdown armed by tests, off in normal use.
#include "engine/alloc.h"

#include <cstdlib>

namespace vrx::engine {

namespace {
struct AllocState {
    long fail_countdown; // allocations left before the injected failure; 0 = off
    bool sticky;         // keep failing once the countdown has fired
    bool fired;          // the injected failure has happened
    long count;          // allocations attempted since the last reset
    long outstanding;    // successful allocations not yet freed
};
constinit AllocState g_alloc{};

// Decides whether this allocation is the one that fails.
bool inject_failure() noexcept {
    ++g_alloc.count;
    if (g_alloc.fired) return g_alloc.sticky;
    if (g_alloc.fail_countdown == 0) return false;
    if (--g_alloc.fail_countdown == 0) {
        g_alloc.fired = true;
        return true;
    }
    return false;
}
} // namespace

void* eng_malloc(std::size_t bytes) noexcept {
    if (inject_failure()) return nullptr;
    void* p = std::malloc(bytes == 0 ? 1 : bytes);
    if (p) ++g_alloc.outstanding;
    return p;
}

void* eng_calloc(std::size_t count, std::size_t size) noexcept {
    if (inject_failure()) return nullptr;
    void* p = std::calloc(count == 0 ? 1 : count, size == 0 ? 1 : size);
    if (p) ++g_alloc.outstanding;
    return p;
}

void eng_free(void* p) noexcept {
    if (!p) return;
    --g_alloc.outstanding;
    std::free(p);
}

void alloc_fail_at(long n, bool sticky) noexcept {
    g_alloc.fail_countdown = n < 0 ? 0 : n;
    g_alloc.sticky = sticky;
    g_alloc.fired = false;
}

long alloc_count() noexcept {
    return g_alloc.count;
}
void alloc_count_reset() noexcept {
    g_alloc.count = 0;
}
long alloc_outstanding() noexcept {
    return g_alloc.outstanding;
}

} // namespace vrx::engine
