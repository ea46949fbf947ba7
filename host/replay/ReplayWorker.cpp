#include "replay/ReplayWorker.h"

#include <unistd.h>

#include "common/Error.h"
#include "recording/Keys.h"
#include "replay/Replay.h"
#include "replay/ReplayWire.h"

namespace host {
namespace {

// The parent deals by the mode in the list; the row can have changed since.
void CheckMode(const Gesture& gesture, bool doubleScan, const std::string& source) {
    if ((gesture.mode == Mode::DoubleScan) != doubleScan)
        throw Error(source, "gesture '" + gesture.id + "'",
                    "changed its mode to " + ModeName(gesture.mode) + " during the replay");
}

ReplayResult Answer(const ReplayJob& job, const GestureReader& read, int64_t seq, bool doubleScan) {
    try {
        const Gesture gesture = read(seq);
        CheckMode(gesture, doubleScan, job.source);
        return ReplayHere(gesture, {}, job.source);
    } catch (const std::exception& error) {
        ReplayResult result;  // the parent knows the rest from the list
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
        for (const int64_t seq : wire::DecodeTask(task->payload)) {
            const ReplayResult result = Answer(job, read, seq, doubleScan);
            if (!wire::Send(socket, wire::Kind::Result, wire::Encode(result)))
                return false;
        }
    }
    return true;
}

}  // namespace

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
