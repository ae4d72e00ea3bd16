// libFuzzer harness for pack files: the input is written out as a pack file, selected, and
// every terminated entry name of its directory is read back through resourceGetData.
// Memory packs are not fuzzed: they carry no length, so the host vouches for them.
// Build: clang++ -std=c++20 -fsanitize=fuzzer,address,undefined -I. -Iinclude
//        fuzz/v3z_fuzz.cpp <build>/liblite_vrx.a -lz
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstring>
#include <string>

#include "assets/resource.h"
#include "engine/alloc.h"
#include "engine/state.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size > (1u << 20)) return 0;
    static const std::string path = "/tmp/v3z_fuzz_" + std::to_string(getpid()) + ".v3z";
    std::FILE* f = std::fopen(path.c_str(), "wb");
    if (!f) return 0;
    std::fwrite(data, 1, size, f);
    std::fclose(f);
    using vrx::engine::g_eng;
    if (vrx::assets::SelectResourceFile(path.c_str()) != 0) return 0;
    uint32_t esize = g_eng.pack_id == vrx::assets::kPackVRKZ ? 32 : 44;
    uint32_t field = esize == 32 ? 16 : 31;
    for (int32_t i = 0; i < g_eng.pack_count && i < 16; ++i) {
        const uint8_t* e = g_eng.pack_dir + uint32_t(i) * esize;
        if (!std::memchr(e, 0, field)) continue;
        uint32_t n = 0;
        int32_t owned = 0;
        uint8_t* p = vrx::assets::resourceGetData(reinterpret_cast<const char*>(e), &n, &owned);
        if (p && owned) vrx::engine::eng_free(p);
    }
    vrx::assets::SelectResourceFile(nullptr);
    return 0;
}
