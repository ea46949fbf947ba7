// Imports what a host service dumps: raw frames in sensor order back to back, and the double-scan
// registers in a second file. What the bytes cannot tell is given by the caller.
#ifndef FPNAVI_HOST_RAWIMPORT_H
#define FPNAVI_HOST_RAWIMPORT_H

#include <optional>
#include <string>

#include "parameters/ParamFile.h"

namespace host {

struct RawRecording {
    std::string id;          // empty: the name of framesPath without directory and extension
    std::string framesPath;  // frames of blockWidth x blockHeight x blockColNum x blockRowNum bytes
    std::string registersPath;  // per frame reg24, reg28 as little-endian 32 bits; mode ds only
    Mode mode = Mode::Fp;
    ParamBlock params = DefaultParams();  // mode becomes their s_modeFlag
    std::string paramFile;                // where settings come from, for errors
    std::vector<ParamSetting> settings;   // over params; they may not select another mode
    GestureEnd end = GestureEnd::Lift;
    std::optional<int32_t> label;  // accepted becomes this key alone
    std::string libraryVersion;
};

// The gesture of the recording. Error for a file that is empty or no whole number of frames, for
// registers that are missing in mode ds, given in another, or of another count than the frames, for
// settings of another mode or without a usable image, and for what CheckGesture (store/Store.h)
// refuses.
Gesture ImportRaw(const RawRecording& recording);

}  // namespace host

#endif  // FPNAVI_HOST_RAWIMPORT_H
