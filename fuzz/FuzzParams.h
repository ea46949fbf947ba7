// Parameter blocks made of the fuzzer's bytes, and what a frame pair under them costs.
#ifndef FUZZ_FUZZPARAMS_H
#define FUZZ_FUZZPARAMS_H

#include "ByteSource.h"
#include "parameters/ParamTable.h"

namespace fpnavi_fuzz {

// What s_modeFlag may become. The double scan, once on, stays on as long as the process lives, so
// a program that tests it cannot test anything else, and an input must not depend on those before.
#ifdef FPNAVI_FUZZ_DOUBLE_SCAN
inline constexpr bool kDoubleScan = true;
#else
inline constexpr bool kDoubleScan = false;
#endif

// Defaults or a small sensor in a mode of this program, with up to twelve values changed: near
// their own, small, at a boundary, and seldom anything at all.
host::ParamBlock ChangedParams(ByteSource& source);

// The same with all kinds of changes alike, or 78 values straight from the source.
host::ParamBlock AnyParams(ByteSource& source);

// The searches of a frame pair under the module's present parameters take few comparisons, or so
// many that the module refuses the pair. limit: byte comparisons.
bool PairIsCheap(double limit);

}  // namespace fpnavi_fuzz

#endif  // FUZZ_FUZZPARAMS_H
