// Checks the module's integer square root for all 2^32 inputs, or for those from FROM to TO
// inclusive. Exit code 1 names the first wrong one.
#include <cinttypes>
#include <cstdio>
#include <cstdlib>
#include <limits>

#include "SqrtCheck.h"

namespace {

constexpr int64_t kMin = std::numeric_limits<int32_t>::min();
constexpr int64_t kMax = std::numeric_limits<int32_t>::max();
constexpr int64_t kPart = int64_t{1} << 28;  // inputs between two lines of progress

bool ReadInput(const char* text, int64_t* value) {
    char* end = nullptr;
    *value = std::strtoll(text, &end, 10);
    return end != text && *end == '\0' && *value >= kMin && *value <= kMax;
}

}  // namespace

int main(int argc, char** argv) {
    int64_t from = kMin;
    int64_t to = kMax;
    if ((argc != 1 && argc != 3) ||
        (argc == 3 && (!ReadInput(argv[1], &from) || !ReadInput(argv[2], &to) || from > to))) {
        std::fprintf(stderr, "usage: exhaustive_sqrt [FROM TO]\n");
        return 2;
    }
    for (int64_t at = from; at <= to; at += kPart) {
        const int64_t end = at + kPart <= to ? at + kPart : to + 1;
        if (const auto wrong = fpnavi_test::FirstWrongRoot(at, end, 1)) {
            std::printf("IntSqrt(%" PRId64 ") is wrong: %d\n", *wrong,
                        fpnavi::IntSqrt(static_cast<int32_t>(*wrong)));
            return 1;
        }
        std::fprintf(stderr, "%" PRId64 " to %" PRId64 ": right\n", at, end - 1);
    }
    std::printf("%" PRId64 " inputs right, %" PRId64 " to %" PRId64 "\n", to - from + 1, from, to);
    return 0;
}
