// Any bytes as a store of recordings, read by every function that reads. Wrong is any exception but
// host::Error, and a gesture read that a store would not take.
#include "InputFile.h"
#include "common/Error.h"
#include "store/Store.h"

namespace {

constexpr int kGesturesMax = 20;

struct Enough {};

void ReadAll(const std::string& path) {
    const host::Store store = host::Store::OpenForReading(path);
    store.Count();
    const std::vector<std::string> ids = store.Ids();
    if (!ids.empty() && store.Contains(ids.front()))
        host::CheckGesture(store.Read(ids.front()), path);
    int read = 0;
    store.ForEach([&](const host::Gesture& gesture) {
        host::CheckGesture(gesture, path);
        if (++read == kGesturesMax)
            throw Enough{};
    });
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    static fpnavi_fuzz::InputFile file("input.db");
    file.Write(data, size);
    try {
        ReadAll(file.Path());
    } catch (const host::Error&) {
        return 0;
    } catch (const Enough&) {
        return 0;
    }
    return 0;
}
