# The simulated sensor: skin, finger path, frames, answers.
set(FPNAVI_SIM_SOURCES
        SimCorpus.cpp
        SimFrame.cpp
        SimFrontEnd.cpp
        SimLabel.cpp
        SimMath.cpp
        SimPath.cpp
        SimPlan.cpp
        SimPresence.cpp
        SimSensor.cpp
        SimSkin.cpp)
