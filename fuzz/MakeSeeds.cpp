// Writes the first inputs of the readers' targets: small recordings of the simulated sensor, never
// of a real finger. Later inputs are found by the fuzzer.
//
//   make_seeds CORPUS_DIRECTORY
#include <sqlite3.h>

#include <cstdio>
#include <exception>
#include <filesystem>
#include <fstream>

#include "FngSeed.h"
#include "parameters/ParamFile.h"
#include "parameters/ParamTable.h"
#include "simulator/Arithmetic.h"
#include "simulator/Sensor.h"
#include "store/Store.h"

namespace {

namespace fs = std::filesystem;
using host::Mode;
using host::ParamValue;

void WriteFile(const fs::path& path, const std::string& content) {
    fs::create_directories(path.parent_path());
    std::ofstream file(path, std::ios::binary);
    file << content;
    if (!file.flush())
        throw std::runtime_error("cannot write " + path.string());
}

// A gesture of a sensor of 4 x 4 pixels: what a store holds, in few bytes.
host::Gesture TinyGesture(const std::string& id, Mode mode, int frames) {
    host::Gesture gesture;
    gesture.id = id;
    gesture.mode = mode;
    gesture.params = host::ParamsForMode(mode, true);
    for (const char* kind : {"Hg", "Fp"}) {
        for (const char* side : {"s_blockWidth", "s_blockHeight", "s_blockColNum", "s_blockRowNum"})
            ParamValue(gesture.params, std::string(side) + kind) = 2;
    }
    gesture.geometry = host::GeometryOf(gesture.params);
    for (int i = 0; i < frames; ++i) {
        host::RecordedFrame frame;
        frame.raw.assign(16, static_cast<uint8_t>(16 * i));
        frame.reg24 = mode == Mode::DoubleScan ? 0xF0F0U : 0;
        if (i > 0)
            frame.presence = host::Presence::Present;
        if (i > 1)
            frame.x16 = frame.y16 = -16 * i;
        gesture.frames.push_back(frame);
    }
    return gesture;
}

// Small pages, one file: less for the fuzzer to carry.
void Compact(const fs::path& path) {
    sqlite3* database = nullptr;
    const bool done =
        sqlite3_open(path.c_str(), &database) == SQLITE_OK &&
        sqlite3_exec(database, "PRAGMA journal_mode = DELETE; PRAGMA page_size = 512; VACUUM",
                     nullptr, nullptr, nullptr) == SQLITE_OK;
    sqlite3_close(database);
    if (!done)
        throw std::runtime_error("cannot compact " + path.string());
}

void MakeStores(const fs::path& directory) {
    fs::create_directories(directory);
    const auto make = [&](const char* name, const std::vector<host::Gesture>& gestures) {
        {
            fs::remove(directory / name);
            host::Store store = host::Store::Create((directory / name).string());
            for (const host::Gesture& gesture : gestures)
                store.Append(gesture);
        }
        Compact(directory / name);
    };
    host::Gesture labelled = TinyGesture("labelled", Mode::Fp, 2);
    labelled.label = VKEY_LEFT;
    labelled.accepted = {VKEY_LEFT, VKEY_NONE};
    labelled.tier = "core";
    labelled.tags = {"tiny", "kind:stroke"};
    labelled.end = host::GestureEnd::TimeOut;
    make("empty.db", {});
    make("one.db", {TinyGesture("one", Mode::Hg, 1)});
    make("labelled.db", {labelled});
    make("three.db",
         {labelled, TinyGesture("b", Mode::DoubleScan, 3), TinyGesture("c", Mode::Hg, 0)});
}

void MakeRecordings(const fs::path& directory) {
    for (const Mode mode : {Mode::Fp, Mode::Hg, Mode::DoubleScan}) {
        host::SimPlan plan = host::PlanOfKind(7, mode, false, host::SimKind::Stroke);
        host::Gesture gesture = host::Simulate(plan, "seed");
        gesture.frames.resize(1);
        for (const bool blocks : {false, true}) {
            const std::string name = "mode" + std::to_string(static_cast<int>(mode));
            WriteFile(directory / (name + (blocks ? "-blocks.fng" : ".fng")),
                      fpnavi_fuzz::FngBytes(gesture, mode != Mode::Hg, blocks));
        }
    }
    WriteFile(directory / "index.csv",
              "id,tier,mode,layout,kind,expect,accept,end,source,quality,frames\n"
              "a,core,fp,tiled,stroke:RIGHT,RIGHT,RIGHT,lift,sim,good,9\n"
              "b,hard,hg,plain,rest,NO_MOVE,NO_MOVE NONE,timeout,,,1\n"
              "c,,ds,plain,diagonal,,UP LEFT NONE,lift,sim,wet,12\n");
}

void MakeParamFiles(const fs::path& directory) {
    WriteFile(directory / "all.toml", host::ParamFileText(host::DefaultParams()));
    WriteFile(directory / "few.toml",
              "# comment\ns_minDelta = -5\n\"s_fpImp\" = 0x10\n"
              "_NAVI_range_mean = { RANGE_LOW = 140, RANGE_HIGH = 1_60 }\n");
    WriteFile(directory / "table.toml", "[_NAVI_range_mean]\nRANGE_LOW = 0b11\nRANGE_HIGH = 0o7\n");
    WriteFile(directory / "types.toml", "s_minDelta = \"5\"\n");
    WriteFile(directory / "dates.toml", "s_minDelta = 1979-05-27T07:32:00Z\n");
}

// Targets that take their input apart as a program: any bytes are one, and long ones do more.
void MakePrograms(const fs::path& corpus) {
    constexpr int kPrograms = 16;
    constexpr int kBytes = 320;
    for (const char* target : {"module_calls", "module_calls_ds", "gestures_compared",
                               "gestures_compared_ds", "tuning_compared", "raw_reader"}) {
        host::SimRandom random(2024);
        for (int i = 0; i < kPrograms; ++i) {
            std::string bytes;
            while (bytes.size() < kBytes)
                bytes += static_cast<char>(static_cast<uint8_t>(random.Below(256)));
            WriteFile(corpus / target / ("random" + std::to_string(i)), bytes);
        }
    }
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fprintf(stderr, "usage: %s CORPUS_DIRECTORY\n", argv[0]);
        return 2;
    }
    try {
        const fs::path corpus = argv[1];
        MakeStores(corpus / "sqlite_reader");
        MakeRecordings(corpus / "fng_reader");
        MakeParamFiles(corpus / "toml_reader");
        MakeParamFiles(corpus / "toml_reader_ascii");
        MakePrograms(corpus);
        return 0;
    } catch (const std::exception& error) {
        std::fprintf(stderr, "%s\n", error.what());
        return 1;
    }
}
