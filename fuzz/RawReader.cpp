// Raw dumps of frames and registers under any parameters. Wrong is any exception but host::Error,
// and a gesture that a store would not take.
#include "ByteSource.h"
#include "FuzzParams.h"
#include "InputFile.h"
#include "common/Error.h"
#include "importers/RawImport.h"
#include "store/Store.h"

namespace {

using fpnavi_fuzz::ByteSource;
using fpnavi_fuzz::InputFile;

void Write(InputFile& file, const std::vector<uint8_t>& bytes) {
    file.Write(bytes.data(), bytes.size());
}

host::RawRecording Recording(ByteSource& source) {
    constexpr host::Mode kModes[] = {host::Mode::Fp, host::Mode::Hg, host::Mode::DoubleScan};
    host::RawRecording recording;
    recording.mode = source.Pick(kModes);
    recording.params = fpnavi_fuzz::AnyParams(source);
    recording.end = source.OneIn(2) ? host::GestureEnd::TimeOut : host::GestureEnd::Lift;
    if (source.OneIn(2))
        recording.label = source.Range(-1, 6);
    if (source.OneIn(4))
        recording.id = std::string(1, static_cast<char>(source.U8()));
    return recording;
}

// The registers that the frames ask for, or any number of bytes.
std::vector<uint8_t> Registers(ByteSource& source) {
    return source.Take(source.OneIn(4) ? source.U8() : size_t{8} * (source.U8() % 7));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    static InputFile registers("input.reg");
    static InputFile frames("input.raw");
    ByteSource source(data, size);
    host::RawRecording recording = Recording(source);
    recording.framesPath = frames.Path();
    const bool withRegisters = (recording.mode == host::Mode::DoubleScan) != source.OneIn(16);
    if (withRegisters) {
        recording.registersPath = registers.Path();
        Write(registers, Registers(source));
    }
    Write(frames, source.Take(source.Left()));
    host::Gesture gesture;
    try {
        gesture = host::ImportRaw(recording);
    } catch (const host::Error&) {
        return 0;
    }
    host::CheckGesture(gesture, recording.framesPath);
    return 0;
}
