#include "replay/ReplayWorker.h"

#include <unistd.h>

#include "common/Error.h"
#include "recording/Keys.h"
#include "replay/ReplayWire.h"

namespace host {
namespace {

// The parent deals by the mode in the list; the row can have changed since.
void CheckMode(const Gesture& gesture, bool doubleScan, const std::string& source) {
    if ((gesture.mode == Mode::DoubleScan) != doubleScan)
        throw Error(source, "gesture '" + gesture.id + "'",
                    "changed its mode to " + ModeName(gesture.mode) + " during the replay");
}

ReplayResult Answer(const ReplayJob& job, const GestureReader& read, const GestureHead& head,
                    bool doubleScan) {
    try {
        const Gesture gesture = read(head);
        CheckMode(gesture, doubleScan, job.source);
        return ReplayHere(gesture, {}, job.source);
    } catch (const std::exception& error) {
        ReplayResult result = ResultOfHead(head);
        result.verdict = Verdict::Unreadable;
        result.errors.emplace_back(error.what());
        return result;
    }
}

// Returns false when the parent is gone.
bool Serve(const ReplayJob& job, bool doubleScan, int socket) {
    const GestureReader read = job.openReader();
    wire::Receiver receiver(socket);
    while (const std::optional<wire::Message> task = receiver.Next()) {
        for (const GestureHead& head : wire::DecodeTask(task->payload)) {
            const ReplayResult result = Answer(job, read, head, doubleScan);
            if (!wire::Send(socket, wire::Kind::Result, wire::Encode(result)))
                return false;
        }
    }
    return true;
}

}  // namespace

ReplayResult ResultOfHead(const GestureHead& head) {
    ReplayResult result;
    result.id = head.id;
    result.mode = head.mode.value_or(Mode::Fp);
    result.tier = head.tier;
    result.label = head.label;
    result.frameCount = head.frameCount;
    return result;
}

void RunWorker(const ReplayJob& job, bool doubleScan, int socket) {
    bool done = false;
    try {
        done = Serve(job, doubleScan, socket);
    } catch (const Error& error) {
        done = wire::Send(socket, wire::Kind::Error, wire::EncodeError(error.File(), error.what()));
    } catch (const std::exception& error) {
        done = wire::Send(socket, wire::Kind::Error, wire::EncodeError(job.source, error.what()));
    }
    _exit(done ? 0 : 1);  // no exit: buffers and handlers are the parent's
}

}  // namespace host
