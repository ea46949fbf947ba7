// Writes a file of frame pairs for pair_driver and heap_peak.
//
//   pair_frames moved|still|hg|ds COUNT FILE [--size=WIDTHxHEIGHT] [--one-window]
//
// --size: of the frames, tiled with the default gaps or, with --one-window, without; not for ds.
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "FramePairs.h"

namespace {

bool ParseKind(const std::string& name, bench::PairKind* kind) {
    const char* const names[] = {"moved", "still", "hg", "ds"};
    for (int32_t i = 0; i < 4; ++i) {
        if (name == names[i]) {
            *kind = static_cast<bench::PairKind>(i);
            return true;
        }
    }
    return false;
}

struct Request {
    bench::PairKind kind = bench::PairKind::Moved;
    int32_t count = 0;
    std::string path;
    bench::FrameSize size = bench::kDefaultFp;
};

bool ParseArguments(const std::vector<std::string>& arguments, Request* request) {
    if (arguments.size() < 4 || !ParseKind(arguments[1], &request->kind))
        return false;
    request->count = std::atoi(arguments[2].c_str());
    request->path = arguments[3];
    if (request->kind == bench::PairKind::Hg)
        request->size = bench::kDefaultHg;
    for (size_t i = 4; i < arguments.size(); ++i) {
        const bool fp =
            request->kind == bench::PairKind::Moved || request->kind == bench::PairKind::Still;
        if (arguments[i] == "--one-window" && fp)
            request->size.layout = bench::Layout::OneWindow;
        else if (arguments[i].rfind("--size=", 0) != 0 ||
                 request->kind == bench::PairKind::DoubleScan ||
                 !bench::ParseSides(arguments[i].substr(7), &request->size))
            return false;
    }
    return request->count > 0;
}

}  // namespace

int main(int argc, char** argv) {
    Request request;
    if (!ParseArguments({argv, argv + argc}, &request)) {
        std::fputs(
            "usage: pair_frames moved|still|hg|ds COUNT FILE [--size=WIDTHxHEIGHT] "
            "[--one-window]\n",
            stderr);
        return 2;
    }
    const bench::PairSet set = bench::MakePairs(request.kind, request.count, request.size);
    if (!bench::WritePairs(request.path, set)) {
        std::fprintf(stderr, "pair_frames: cannot write %s\n", request.path.c_str());
        return 3;
    }
    return 0;
}
