// The recorded fields of a gesture as one row of bytes, and their CRC-32.
#include "store/GestureChecksum.h"

#include <zlib.h>

#include <string>

namespace host {

namespace {

// Lists and texts go in with their length before them, so that no byte can change its field.
class Crc {
  public:
    void Number(int64_t value) {
        uint8_t bytes[8];  // lowest first
        for (int i = 0; i < 8; ++i)
            bytes[i] = static_cast<uint8_t>(static_cast<uint64_t>(value) >> 8 * i);
        m_crc = crc32_z(m_crc, bytes, sizeof bytes);
    }
    template <typename T>
    void Optional(const std::optional<T>& value) {
        Number(value.has_value() ? 1 : 0);
        Number(value ? static_cast<int64_t>(*value) : 0);
    }
    template <typename Bytes>
    void Sequence(const Bytes& bytes) {
        Number(static_cast<int64_t>(bytes.size()));
        if (!bytes.empty()) {  // without bytes zlib starts anew
            m_crc = crc32_z(m_crc, reinterpret_cast<const Bytef*>(bytes.data()), bytes.size());
        }
    }
    uint32_t Get() const { return static_cast<uint32_t>(m_crc); }

  private:
    uLong m_crc = 0;
};

}  // namespace

uint32_t GestureChecksum(const Gesture& gesture) {
    Crc crc;
    crc.Sequence(gesture.id);
    for (const int32_t value : gesture.params)
        crc.Number(value);
    // Mode and geometry follow from the parameters, which every reader checks.
    crc.Number(static_cast<int64_t>(gesture.frames.size()));
    for (const RecordedFrame& frame : gesture.frames) {
        crc.Sequence(frame.raw);
        crc.Number(frame.reg24);
        crc.Number(frame.reg28);
        crc.Optional(frame.x16);
        crc.Optional(frame.y16);
        crc.Optional(frame.presence);
    }
    crc.Number(static_cast<int64_t>(gesture.end));
    crc.Sequence(gesture.libraryVersion);
    return crc.Get();
}

}  // namespace host
