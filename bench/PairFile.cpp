// Files of pairs: counts, parameters, then for each frame its image and registers.
#include <cstdio>
#include <memory>

#include "FramePairs.h"

namespace bench {
namespace {

struct CloseFile {
    void operator()(std::FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<std::FILE, CloseFile>;

constexpr uint32_t kMagic = 0x31504E46;  // "FNP1"
constexpr uint32_t kPairMax = 100000;
constexpr uint32_t kImageBytesMax = 1U << 24;

struct Header {
    uint32_t magic;
    uint32_t pairs;
    uint32_t imageBytes;
};

template <typename T>
bool WriteSome(std::FILE* file, const T* values, size_t count) {
    return std::fwrite(values, sizeof(T), count, file) == count;
}

template <typename T>
bool ReadSome(std::FILE* file, T* values, size_t count) {
    return std::fread(values, sizeof(T), count, file) == count;
}

bool WriteFrame(std::FILE* file, const Frame& frame) {
    return WriteSome(file, frame.image.data(), frame.image.size()) &&
           WriteSome(file, &frame.reg24, 1) && WriteSome(file, &frame.reg28, 1);
}

bool ReadFrame(std::FILE* file, size_t imageBytes, Frame* frame) {
    frame->image.resize(imageBytes);
    return ReadSome(file, frame->image.data(), imageBytes) && ReadSome(file, &frame->reg24, 1) &&
           ReadSome(file, &frame->reg28, 1);
}

}  // namespace

bool WritePairs(const std::string& path, const PairSet& set) {
    const File file(std::fopen(path.c_str(), "wb"));
    if (file == nullptr || set.pairs.empty())
        return false;
    const Header header = {kMagic, static_cast<uint32_t>(set.pairs.size()),
                           static_cast<uint32_t>(set.pairs.front().first.image.size())};
    if (!WriteSome(file.get(), &header, 1) || !WriteSome(file.get(), set.params, FPNAVI_PARAM_NUM))
        return false;
    for (const FramePair& pair : set.pairs) {
        if (!WriteFrame(file.get(), pair.first) || !WriteFrame(file.get(), pair.second))
            return false;
    }
    return std::fflush(file.get()) == 0;
}

bool ReadPairs(const std::string& path, PairSet* set) {
    const File file(std::fopen(path.c_str(), "rb"));
    Header header = {};
    if (file == nullptr || !ReadSome(file.get(), &header, 1) || header.magic != kMagic ||
        header.pairs > kPairMax || header.imageBytes > kImageBytesMax ||
        !ReadSome(file.get(), set->params, FPNAVI_PARAM_NUM))
        return false;
    set->pairs.resize(header.pairs);
    for (FramePair& pair : set->pairs) {
        if (!ReadFrame(file.get(), header.imageBytes, &pair.first) ||
            !ReadFrame(file.get(), header.imageBytes, &pair.second))
            return false;
    }
    return true;
}

}  // namespace bench
