#include "replay/ReplayWire.h"

#include <sys/socket.h>

#include <cerrno>
#include <cstring>

#include "common/Error.h"

namespace host::wire {
namespace {

constexpr size_t kHeadSize = 2 * sizeof(int32_t);  // kind and length

void PutInt(std::string* out, int32_t value) {
    char bytes[sizeof value];
    std::memcpy(bytes, &value, sizeof value);
    out->append(bytes, sizeof bytes);
}

void PutLong(std::string* out, int64_t value) {
    char bytes[sizeof value];
    std::memcpy(bytes, &value, sizeof value);
    out->append(bytes, sizeof bytes);
}

void PutText(std::string* out, const std::string& text) {
    PutInt(out, static_cast<int32_t>(text.size()));
    out->append(text);
}

class Parser {
  public:
    explicit Parser(std::string_view bytes) : m_bytes(bytes) {}

    int32_t Int() { return Number<int32_t>(); }
    int64_t Long() { return Number<int64_t>(); }

    std::string Text() {
        const int32_t size = Int();
        if (size < 0)
            throw Error("replay", "", "a replaying process sent a damaged message");
        return std::string(Bytes(static_cast<size_t>(size)));
    }

  private:
    template <typename T>
    T Number() {
        T value = 0;
        const std::string_view bytes = Bytes(sizeof value);
        std::memcpy(&value, bytes.data(), sizeof value);
        return value;
    }

    std::string_view Bytes(size_t size) {
        if (size > m_bytes.size())
            throw Error("replay", "", "a replaying process sent a damaged message");
        const std::string_view taken = m_bytes.substr(0, size);
        m_bytes.remove_prefix(size);
        return taken;
    }

    std::string_view m_bytes;
};

}  // namespace

ReplayResult Decode(const std::string& payload) {
    Parser in(payload);
    ReplayResult result;
    result.id = in.Text();
    result.mode = static_cast<Mode>(in.Int());
    result.tier = in.Text();
    const bool labelled = in.Int() != 0;
    const int32_t label = in.Int();
    if (labelled)
        result.label = label;
    result.frameCount = in.Int();
    result.key = in.Int();
    result.pairs = in.Int();
    result.voteTimeOut = in.Int();
    result.verdict = static_cast<Verdict>(in.Int());
    for (int32_t left = in.Int(); left > 0; --left)
        result.errors.push_back(in.Text());
    return result;
}

std::string Encode(const ReplayResult& result) {
    std::string out;
    PutText(&out, result.id);
    PutInt(&out, static_cast<int32_t>(result.mode));
    PutText(&out, result.tier);
    PutInt(&out, result.label ? 1 : 0);
    PutInt(&out, result.label.value_or(0));
    PutInt(&out, result.frameCount);
    PutInt(&out, result.key);
    PutInt(&out, result.pairs);
    PutInt(&out, result.voteTimeOut);
    PutInt(&out, static_cast<int32_t>(result.verdict));
    PutInt(&out, static_cast<int32_t>(result.errors.size()));
    for (const std::string& error : result.errors)
        PutText(&out, error);
    return out;
}

std::string EncodeTask(const std::vector<int64_t>& seqs) {
    std::string out;
    PutInt(&out, static_cast<int32_t>(seqs.size()));
    for (const int64_t seq : seqs)
        PutLong(&out, seq);
    return out;
}

std::vector<int64_t> DecodeTask(const std::string& payload) {
    Parser in(payload);
    std::vector<int64_t> seqs;
    for (int32_t left = in.Int(); left > 0; --left)
        seqs.push_back(in.Long());
    return seqs;
}

std::string EncodeError(const std::string& file, const std::string& what) {
    const std::string start = file + ": ";  // which the parent's Error will put there again
    std::string out;
    PutText(&out, file);
    PutText(&out, what.compare(0, start.size(), start) == 0 ? what.substr(start.size()) : what);
    return out;
}

void ThrowError(const std::string& payload) {
    Parser in(payload);
    const std::string file = in.Text();
    throw Error(file, "", in.Text());
}

bool Send(int socket, Kind kind, const std::string& payload) {
    std::string message;
    PutInt(&message, static_cast<int32_t>(kind));
    PutText(&message, payload);
    size_t sent = 0;
    while (sent < message.size()) {
        const ssize_t count =
            send(socket, message.data() + sent, message.size() - sent, MSG_NOSIGNAL);
        if (count < 0 && errno == EINTR)
            continue;
        if (count <= 0)
            return false;
        sent += static_cast<size_t>(count);
    }
    return true;
}

std::optional<Message> Receiver::Next() {
    std::optional<Message> message = Take();
    while (!message && Fill())
        message = Take();
    return message;
}

bool Receiver::Fill() {
    char buffer[16384];
    const ssize_t count = recv(m_socket, buffer, sizeof buffer, 0);
    if (count < 0)
        return errno == EINTR;
    m_received.append(buffer, static_cast<size_t>(count));
    return count > 0;
}

std::optional<Message> Receiver::Take() {
    if (m_received.size() < kHeadSize)
        return std::nullopt;
    Parser head(std::string_view(m_received).substr(0, kHeadSize));
    Message message;
    const int32_t kind = head.Int();
    const int32_t size = head.Int();
    if (kind < static_cast<int32_t>(Kind::Task) || kind > static_cast<int32_t>(Kind::Error) ||
        size < 0)
        throw Error("replay", "", "a replaying process sent a damaged message");
    const size_t end = kHeadSize + static_cast<size_t>(size);
    if (m_received.size() < end)
        return std::nullopt;
    message.kind = static_cast<Kind>(kind);
    message.payload = m_received.substr(kHeadSize, static_cast<size_t>(size));
    m_received.erase(0, end);
    return message;
}

}  // namespace host::wire
