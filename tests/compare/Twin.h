// The module and the reference model side by side: every call goes to both, and afterwards results,
// records, frames, flags and log lines must be equal.
#ifndef TESTS_COMPARE_TWIN_H
#define TESTS_COMPARE_TWIN_H

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "recording/Recording.h"

namespace fpnavi_test {

// There is one: both sides keep their state as long as the process lives.
class Twin {
  public:
    static Twin& Get();

    void SetParam(const host::ParamBlock* params);
    void Clear();
    void Zones(uint32_t reg24, uint32_t reg28);
    // Sorts raw into the image that Status and Frame take. width as GetNaviBlock has it.
    void Block(const std::vector<uint8_t>& raw, int32_t width);
    void Status(bool nullFrame = false);
    void Frame(int32_t timeOut, bool nullPrev = false, bool nullCurr = false);
    int32_t Vote(int32_t timeOut);
    void Tune(const std::vector<uint8_t>& image, uint32_t gain20, uint32_t gain2C);

    // Fills the image directly, without GetNaviBlock.
    void SetImage(const std::vector<uint8_t>& image);
    void SetDac(uint32_t value);
    // As a host that writes into the record.
    static void SetPairCount(int32_t calc_cnt);

    // In the next call of Frame allocation number (the first is 1) fails, alone or with all after.
    void FailAllocation(int32_t number, bool forGood);

    // The frames that the current parameters ask for fit the image buffer.
    static bool ImageFits();

    // The first difference seen; empty while there is none.
    const std::optional<std::string>& Difference() const { return m_difference; }
    int64_t Calls() const { return m_calls; }

  private:
    Twin();
    void Check(const std::string& call, int32_t module, int32_t reference);
    void Differ(const std::string& what);
    void CompareRecord(const std::string& call);
    void CompareFrames(const std::string& call);
    void CompareImages(const std::string& call, size_t bytes);
    void CompareFlags(const std::string& call);
    void CompareTuning(const std::string& call);
    void CompareLogs(const std::string& call);

    std::vector<uint8_t> m_image;
    std::vector<uint8_t> m_imageReference;
    int32_t m_failing = 0;  // allocation of the next frame; 0: none
    bool m_failingForGood = false;
    uint32_t m_dac = 0;
    uint32_t m_dacReference = 0;
    std::vector<std::string> m_log;
    std::vector<std::string> m_logReference;
    std::optional<std::string> m_difference;
    int64_t m_calls = 0;
};

}  // namespace fpnavi_test

#endif  // TESTS_COMPARE_TWIN_H
