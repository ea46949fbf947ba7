// What the model's files share among themselves and tests have no use for: the counted
// allocation, the log writer, the size rules and the table of matching templates.

#ifndef REFERENCE_REFINTERNAL_H
#define REFERENCE_REFINTERNAL_H

#include <cstdint>
#include <string>
#include <vector>

namespace reference {

struct NaviVoteInfo_t;

// Largest side of an image that frames are processed at, in pixels.
constexpr int32_t kMaxSide = 4096;

// A matching template: its rectangle in the frame it is cut from and the gap correction of the
// displacement it proposes.
struct MatchTemplate {
    int32_t tpltWidth;
    int32_t tpltHeight;
    int32_t tplt_i0;  // top row
    int32_t tplt_j0;  // left column
    int32_t di;
    int32_t dj;
};

constexpr int32_t kTemplateNum = 8;

// Fills the eight templates from the current parameters.
void BuildTemplates(MatchTemplate (&templates)[kTemplateNum]);

// The template search's range of top-left corners, first and last inclusive, in 64 bits so that no
// parameter wraps it. Empty when a last lies before its first.
struct SearchRange {
    int64_t firstRow;
    int64_t lastRow;
    int64_t firstColumn;
    int64_t lastColumn;
};
SearchRange PlacementsOf(const MatchTemplate& tplt);

// malloc under the control of the test counters; null for a size below 1.
void* Allocate(int64_t bytes);

// Replaces each %d of `format` by the next value; values beyond the last %d are not printed.
std::string FormatValues(const char* format, const std::vector<int32_t>& values);

// How many pairs `info` holds: its calc_cnt, which a host can overwrite, cut to 0..kMaxPairs.
int32_t PairsOf(const NaviVoteInfo_t& info);

// Appends one line to s_logSink.
void LogLine(const char* function, int32_t line, const std::string& message);

bool IsSide(int64_t side);  // 1..kMaxSide
bool IsUsableImage();       // block geometry at least 1, image sides 1..kMaxSide

// Whether width * height, wrapped, is a multiple of 16.
bool IsTuneSizeDivisible(int32_t height, int32_t width);

// Whether every field of `g` and of the reference code that indexes a gain table lies inside it.
bool AreGainsUsable(uint32_t g);

void StoreParams(const int32_t* params);  // the 78 values only, nothing derived
void ResetTuningState();
void ResetTestHooks();

}  // namespace reference

#endif
