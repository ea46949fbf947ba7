// What a parent and its replaying child processes send each other through a socket: messages of a
// length and as many bytes, integers in the machine's own order, as both ends are the same program.
#ifndef FPNAVI_HOST_REPLAYWIRE_H
#define FPNAVI_HOST_REPLAYWIRE_H

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "replay/Replay.h"

namespace host::wire {

enum class Kind : int32_t {
    Task = 1,    // to the child: gestures to replay, in this order
    Result = 2,  // to the parent: the result of the next one of them
    Error = 3,   // to the parent: why the child gives up
};

struct Message {
    Kind kind = Kind::Error;
    std::string payload;
};

// A result without the calls of single frames, and back. Decode throws Error for bytes that Encode
// did not write.
std::string Encode(const ReplayResult& result);
ReplayResult Decode(const std::string& payload);

// The seqs of a task's gestures, and back.
std::string EncodeTask(const std::vector<int64_t>& seqs);
std::vector<int64_t> DecodeTask(const std::string& payload);

// What an Error of the child says, and the same thrown again in the parent.
std::string EncodeError(const std::string& file, const std::string& what);
[[noreturn]] void ThrowError(const std::string& payload);

// Sends one message. Returns false when the reader is gone or sending failed.
bool Send(int socket, Kind kind, const std::string& payload);

// Takes messages from a socket.
class Receiver {
  public:
    explicit Receiver(int socket) : m_socket(socket) {}

    // Waits for a whole message; empty at the end of the stream. Throws Error for a message that
    // Send did not write.
    std::optional<Message> Next();

    // Reads what is there, waiting if there is nothing. Returns false at the end of the stream.
    bool Fill();

    // The next whole message among what has been read; empty when there is none. Throws as Next.
    std::optional<Message> Take();

  private:
    int m_socket;
    std::string m_received;  // not yet taken
};

}  // namespace host::wire

#endif  // FPNAVI_HOST_REPLAYWIRE_H
