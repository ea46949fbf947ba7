# Builds what scripts/demo builds below WORK, installs it as the README says and uses what is installed.
include(${CMAKE_CURRENT_LIST_DIR}/run.cmake)

file(REMOVE_RECURSE ${WORK})
# The cache variables of the preset release.
run(${CMAKE_COMMAND} -G Ninja -S ${SOURCE} -B ${WORK}/build -DCMAKE_BUILD_TYPE=Release
    -DCMAKE_C_COMPILER=${C} -DCMAKE_CXX_COMPILER=${CXX} -DFPNAVI_TESTS=OFF
    -DCMAKE_C_COMPILER_LAUNCHER=${LAUNCHER} -DCMAKE_CXX_COMPILER_LAUNCHER=${LAUNCHER})

# The target that the demo builds: its line as it is, with another build directory.
file(READ ${SOURCE}/scripts/demo demo)
string(REGEX MATCH "cmake --build --preset release([^\n]*)" line "${demo}")
separate_arguments(arguments UNIX_COMMAND "${CMAKE_MATCH_1}")
if(line STREQUAL "")
    message(FATAL_ERROR "scripts/demo has no line that builds the preset release")
endif()
run(${CMAKE_COMMAND} --build ${WORK}/build ${arguments})

run(${CMAKE_COMMAND} --install ${WORK}/build --prefix ${WORK}/prefix)
run(${WORK}/prefix/bin/fpnavi --version)
if(NOT output STREQUAL "fpnavi ${VERSION}\n")
    message(FATAL_ERROR "the installed command says: ${output}")
endif()
run(${CMAKE_COMMAND} -G Ninja -S ${SOURCE}/tests/install/consumer -B ${WORK}/consumer
    -DCMAKE_C_COMPILER=${C} -DCMAKE_CXX_COMPILER=${CXX} -DCMAKE_PREFIX_PATH=${WORK}/prefix)
run(${CMAKE_COMMAND} --build ${WORK}/consumer)
run(${WORK}/consumer/given_libraries)
