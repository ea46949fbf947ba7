# The replay loop, its processes and the frame-by-frame trace.
set(FPNAVI_REPLAY_SOURCES
        Explain.cpp
        Replay.cpp
        ReplayCorpus.cpp
        ReplayProcess.cpp
        ReplayWire.cpp
        TuneRun.cpp)
