// libFuzzer harness for LoadTGA: the input is served as a stored entry of a memory pack (so
// in-place 16-bit files are exercised) and decoded with and without keep32.
// Build: clang++ -std=c++20 -fsanitize=fuzzer,address,undefined -I. -Iinclude
//        fuzz/tga_fuzz.cpp <build>/liblite_vrx.a -lz
#include <cstdint>
#include <cstring>
#include <vector>

#include "assets/resource.h"
#include "assets/tga.h"
#include "engine/alloc.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size > (1u << 20)) return 0;
    // Header "VRKZ", one entry, directory at 12; the entry's bytes follow the directory.
    std::vector<uint8_t> pack(12 + 32 + size);
    const uint32_t words[3] = {vrx::assets::kPackVRKZ, 1, 12};
    std::memcpy(pack.data(), words, sizeof words);
    std::memcpy(pack.data() + 12, "F.TGA", 6);
    const uint32_t entry[3] = {uint32_t(size), uint32_t(size), 44};
    std::memcpy(pack.data() + 12 + 20, entry, sizeof entry);
    if (size) std::memcpy(pack.data() + 44, data, size);
    vrx::assets::SelectResourceBuffer(pack.data());
    for (int32_t keep32 : {0, 1}) {
        int32_t w, h, fmt, owned;
        void* px = nullptr;
        if (vrx::assets::LoadTGA("F.TGA", &w, &h, &px, &fmt, &owned, keep32) && owned)
            vrx::engine::eng_free(px);
    }
    vrx::assets::SelectResourceBuffer(nullptr);
    return 0;
}
