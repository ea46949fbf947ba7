# Builds the consumer below WORK with this project as a part of it, once by add_subdirectory and once by
# FetchContent.
include(${CMAKE_CURRENT_LIST_DIR}/run.cmake)

file(REMOVE_RECURSE ${WORK})
foreach(by add_subdirectory FetchContent)
    run(${CMAKE_COMMAND} -G Ninja -S ${SOURCE}/tests/install/subproject -B ${WORK}/${by} -DBY=${by}
        -DFPNAVI_SOURCE=${SOURCE} -DCMAKE_C_COMPILER=${C} -DCMAKE_CXX_COMPILER=${CXX}
        # A package that is looked for is not found, and that is an error.
        -DCMAKE_FIND_ROOT_PATH=${WORK}/empty -DCMAKE_FIND_ROOT_PATH_MODE_PACKAGE=ONLY
        -DCMAKE_FIND_ROOT_PATH_MODE_LIBRARY=ONLY -DCMAKE_FIND_ROOT_PATH_MODE_INCLUDE=ONLY)
    run(${CMAKE_COMMAND} --build ${WORK}/${by})
    run(${WORK}/${by}/given_libraries)
    run(${CMAKE_COMMAND} --install ${WORK}/${by} --prefix ${WORK}/${by}-prefix)
    file(GLOB_RECURSE installed ${WORK}/${by}-prefix/*)
    if(installed)
        message(FATAL_ERROR "the subproject installs ${installed}")
    endif()
endforeach()
