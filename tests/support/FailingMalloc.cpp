// The wrapped allocation functions. Everything is kept in fixed arrays: the wrappers run inside
// malloc and must not allocate.
#include "FailingMalloc.h"

#include <array>
#include <cstddef>
#include <cstdint>

namespace {

constexpr size_t kRoom = 4096;  // pointers remembered at most; further ones are only counted

enum class Mode { Off, Count, Nth, From };

Mode s_mode = Mode::Off;
int s_failAt = 0;
int s_calls = 0;
int s_allocations = 0;
int s_failures = 0;
int s_frees = 0;
std::array<uintptr_t, kRoom> s_live{};
size_t s_liveNum = 0;
std::array<uintptr_t, kRoom> s_freed{};
size_t s_freedNum = 0;

void Start(Mode mode, int failAt) {
    s_mode = mode;
    s_failAt = failAt;
    s_calls = s_allocations = s_failures = s_frees = 0;
    s_liveNum = s_freedNum = 0;
}

bool ShallFail() {
    if (s_mode == Mode::Off)
        return false;
    ++s_calls;
    const bool fail = (s_mode == Mode::Nth && s_calls == s_failAt) ||
                      (s_mode == Mode::From && s_calls >= s_failAt);
    s_failures += fail ? 1 : 0;
    return fail;
}

void* NoteAllocation(void* pointer) {
    if (s_mode != Mode::Off && pointer != nullptr) {
        ++s_allocations;
        if (s_liveNum < kRoom)
            s_live[s_liveNum++] = reinterpret_cast<uintptr_t>(pointer);
    }
    return pointer;
}

void NoteFree(uintptr_t address) {
    if (s_mode == Mode::Off || address == 0)
        return;
    ++s_frees;
    if (s_freedNum < kRoom)
        s_freed[s_freedNum++] = address;
    for (size_t i = 0; i < s_liveNum; ++i) {
        if (s_live[i] == address) {
            s_live[i] = s_live[--s_liveNum];
            return;
        }
    }
}

}  // namespace

// The linker fixes these names. The compilers turn a malloc that is filled with zeros into calloc.
// NOLINTBEGIN(bugprone-reserved-identifier)
extern "C" {
void* __real_malloc(size_t size);
void* __real_calloc(size_t number, size_t size);
void __real_free(void* pointer);

void* __wrap_malloc(size_t size) {
    return ShallFail() ? nullptr : NoteAllocation(__real_malloc(size));
}

void* __wrap_calloc(size_t number, size_t size) {
    return ShallFail() ? nullptr : NoteAllocation(__real_calloc(number, size));
}

void __wrap_free(void* pointer) {
    NoteFree(reinterpret_cast<uintptr_t>(pointer));
    __real_free(pointer);
}
}
// NOLINTEND(bugprone-reserved-identifier)

namespace fpnavi_test {

void FailingMalloc::Count() {
    Start(Mode::Count, 0);
}

void FailingMalloc::FailNth(int n) {
    Start(Mode::Nth, n);
}

void FailingMalloc::FailFrom(int n) {
    Start(Mode::From, n);
}

void FailingMalloc::Off() {
    s_mode = Mode::Off;
}

int FailingMalloc::Allocations() {
    return s_allocations;
}

int FailingMalloc::Failures() {
    return s_failures;
}

int FailingMalloc::Frees() {
    return s_frees;
}

int FailingMalloc::Live() {
    return static_cast<int>(s_liveNum);
}

bool FailingMalloc::WasFreed(const void* pointer) {
    for (size_t i = 0; i < s_freedNum; ++i) {
        if (s_freed[i] == reinterpret_cast<uintptr_t>(pointer))
            return true;
    }
    return false;
}

}  // namespace fpnavi_test
