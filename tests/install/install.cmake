# Builds and installs the library of KIND (static or shared) below WORK, then builds and runs the
# consumer against the installed package. The shared library must export exactly nine functions.
include(${CMAKE_CURRENT_LIST_DIR}/run.cmake)

file(REMOVE_RECURSE ${WORK})
set(shared OFF)
if(KIND STREQUAL shared)
    set(shared ON)
endif()
run(${CMAKE_COMMAND} -G Ninja -S ${SOURCE} -B ${WORK}/build -DCMAKE_BUILD_TYPE=Release
    -DCMAKE_C_COMPILER=${C} -DCMAKE_CXX_COMPILER=${CXX} -DBUILD_SHARED_LIBS=${shared}
    -DFPNAVI_HOST=OFF -DFPNAVI_TESTS=OFF -DCMAKE_INSTALL_PREFIX=${WORK}/prefix)
run(${CMAKE_COMMAND} --build ${WORK}/build --target install)
run(${CMAKE_COMMAND} -G Ninja -S ${SOURCE}/tests/install/consumer -B ${WORK}/consumer
    -DCMAKE_C_COMPILER=${C} -DCMAKE_CXX_COMPILER=${CXX} -DCMAKE_PREFIX_PATH=${WORK}/prefix)
run(${CMAKE_COMMAND} --build ${WORK}/consumer)
run(${WORK}/consumer/own_libraries)
run(${WORK}/consumer/given_libraries)

if(KIND STREQUAL shared)
    file(GLOB library ${WORK}/prefix/lib/*/libfpnavi.so ${WORK}/prefix/lib/libfpnavi.so)
    execute_process(COMMAND nm -D --defined-only ${library} OUTPUT_VARIABLE symbols
                    COMMAND_ERROR_IS_FATAL ANY)
    string(REGEX MATCHALL " T [A-Za-z_0-9]+" exported "${symbols}")
    list(SORT exported)
    set(expected " T FpNaviClear; T GetDoubleScanNaviBlock; T GetNaviBlock; T OrientationCalc"
                 " T PrintNaviLog; T SetNaviParam; T Voting; T _NAVI_Tune"
                 " T vmk_fp_navigation_detect_finger_status")
    if(NOT exported STREQUAL expected)
        message(FATAL_ERROR "exported are:${exported}\nexpected:${expected}")
    endif()
    string(REGEX MATCHALL "\n" lines "${symbols}")
    list(LENGTH lines count)
    if(NOT count EQUAL 9)
        message(FATAL_ERROR "the library exports more than functions:\n${symbols}")
    endif()
endif()
