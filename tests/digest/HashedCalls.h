// The calls of one side with everything that they answer hashed: results, images, vote records, DC
// registers and log lines, in the order of the calls.
#ifndef TESTS_DIGEST_HASHEDCALLS_H
#define TESTS_DIGEST_HASHEDCALLS_H

#include <array>
#include <cstdint>
#include <string>
#include <vector>

#include "Digest.h"
#include "Side.h"
#include "recording/Recording.h"

namespace fpnavi_test {

// What went into a hash.
struct Counts {
    int64_t gestures = 0;
    int64_t pairs = 0;  // counted by their vote records
    int64_t calibrations = 0;
    int64_t tuneCalls = 0;
    int64_t logLines = 0;
    int64_t absent = 0;                // finger tests that found none
    int64_t refused = 0;               // frames and finger tests that failed
    std::array<int64_t, 7> results{};  // of votes, from -1 to VKEY_NO_MOVE
};

class HashedCalls {
  public:
    // Bytes of the image buffer; the frames of params must fit, see Fits.
    static constexpr int64_t kImageBytes = 65536;
    static bool Fits(const host::ParamBlock& params);

    explicit HashedCalls(const Side& side);
    HashedCalls(const HashedCalls&) = delete;
    HashedCalls& operator=(const HashedCalls&) = delete;

    void SetParam(const host::ParamBlock& params);
    void Clear();
    void Zones(uint32_t reg24, uint32_t reg28);
    // Sorts raw, any number of bytes up to kImageBytes, into the image of the calls below.
    void Block(const std::vector<uint8_t>& raw, int32_t width);
    void Status(bool null = false);
    void Frame(int32_t timeOut, bool nullPrev = false, bool nullCurr = false);
    void Vote(int32_t timeOut);
    // Returns what _NAVI_Tune returns; the register is kept from call to call.
    int32_t Tune(uint32_t gain20, uint32_t gain2C);
    void SetDac(uint32_t value) { m_dac = value; }
    uint32_t Dac() const { return m_dac; }

    void EndGesture();
    void EndCalibration() { ++m_counts.calibrations; }

    const Counts& Seen() const { return m_counts; }
    uint64_t Hash() const { return m_digest.Value(); }

  private:
    void Take(int32_t result);  // and the log lines of the call
    void TakeRecord();

    const Side& m_side;
    Digest m_digest;
    Counts m_counts;
    std::vector<std::string> m_lines;
    std::vector<uint8_t> m_raw;
    std::vector<uint8_t> m_image;
    size_t m_imageSize = 0;  // of the current parameters; 0 when they give no image
    uint32_t m_dac = 0;
};

}  // namespace fpnavi_test

#endif  // TESTS_DIGEST_HASHEDCALLS_H
