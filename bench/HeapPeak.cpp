// The most heap that a gesture of moving pairs holds at any time, and how often a pair allocates.
// The linker turns the library's calls of malloc, calloc and free into those of this file.
//
//   heap_peak FILE
#include <algorithm>
#include <cstddef>
#include <cstdio>
#include <cstring>

#include "FramePairs.h"
#include "Sides.h"

namespace {

constexpr size_t kHeader = alignof(std::max_align_t);  // before each block, holds its size

size_t s_held = 0;
size_t s_peak = 0;
size_t s_calls = 0;

void* Note(void* block, size_t size) {
    if (block == nullptr)
        return nullptr;
    std::memcpy(block, &size, sizeof size);
    s_held += size;
    s_peak = std::max(s_peak, s_held);
    ++s_calls;
    return static_cast<char*>(block) + kHeader;
}

}  // namespace

// The linker fixes these names.
// NOLINTBEGIN(bugprone-reserved-identifier)
extern "C" {
void* __real_malloc(size_t size);
void* __real_calloc(size_t number, size_t size);
void __real_free(void* pointer);

void* __wrap_malloc(size_t size) {
    return Note(__real_malloc(size + kHeader), size);
}

void* __wrap_calloc(size_t number, size_t size) {
    return Note(__real_calloc(1, number * size + kHeader), number * size);
}

void __wrap_free(void* pointer) {
    if (pointer == nullptr)
        return;
    char* const block = static_cast<char*>(pointer) - kHeader;
    size_t size = 0;
    std::memcpy(&size, block, sizeof size);
    s_held -= size;
    __real_free(block);
}
}
// NOLINTEND(bugprone-reserved-identifier)

namespace {

template <class Side>
void Measure(const char* name, const bench::PairSet& set) {
    s_held = s_peak = s_calls = 0;
    Side::SetNaviParam(set.params);
    for (const bench::FramePair& pair : set.pairs) {
        Side::FpNaviClear();
        Side::OrientationCalc(pair.first.image.data());
        Side::OrientationCalc(pair.second.image.data());
        Side::OrientationCalc(pair.first.image.data());
    }
    Side::FpNaviClear();
    std::printf(
        "%s: %zu bytes at most, %zu allocations a gesture of three frames, %zu bytes left\n", name,
        s_peak, s_calls / set.pairs.size(), s_held);
}

}  // namespace

int main(int argc, char** argv) {
    bench::PairSet set;
    if (argc != 2 || !bench::ReadPairs(argv[1], &set) || set.pairs.empty()) {
        std::fputs("usage: heap_peak FILE (of pair_frames)\n", stderr);
        return 2;
    }
    Measure<bench::Plain>("plain", set);
    Measure<bench::Shipped>("shipped", set);
    return 0;
}
