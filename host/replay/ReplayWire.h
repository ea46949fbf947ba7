// How a replaying child process hands results to its parent: messages of a length and as many
// bytes, integers in the machine's own order, as both ends are the same program.
#ifndef FPNAVI_HOST_REPLAYWIRE_H
#define FPNAVI_HOST_REPLAYWIRE_H

#include <string>

#include "replay/Replay.h"

namespace host::wire {

enum class Kind : int32_t {
    Begun = 1,       // a result that says which gesture comes next
    Result = 2,      // its result
    HandedBack = 3,  // no payload: the next gesture needs a process with double scan
    Error = 4,       // why the child gives up
};

struct Message {
    Kind kind = Kind::Error;
    std::string payload;
};

// A result without the calls of single frames, and back. Decode throws Error for bytes that Encode
// did not write.
std::string Encode(const ReplayResult& result);
ReplayResult Decode(const std::string& payload);

// What an Error of the child says, and the same thrown again in the parent.
std::string EncodeError(const std::string& file, const std::string& what);
[[noreturn]] void ThrowError(const std::string& payload);

// Writes one message to a pipe. Returns false when the reader is gone or writing failed.
bool Send(int pipe, Kind kind, const std::string& payload);

// Takes the first whole message off the front of received. Returns false when there is none yet;
// throws Error for a message that Send did not write.
bool Take(std::string* received, Message* message);

}  // namespace host::wire

#endif  // FPNAVI_HOST_REPLAYWIRE_H
