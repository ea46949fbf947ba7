# GoogleTest and the stand-in for RapidCheck in a cross build: Debian packages neither for foreign
# processors, so the first is built from Debian's sources (package googletest).
set(FPNAVI_GTEST_SOURCES /usr/src/googletest CACHE PATH "GoogleTest's sources, for cross builds")
set(INSTALL_GTEST OFF)
add_subdirectory(${FPNAVI_GTEST_SOURCES} ${CMAKE_BINARY_DIR}/googletest EXCLUDE_FROM_ALL SYSTEM)
foreach(target gtest gtest_main gmock gmock_main)
    # What is to be proved about optimised code is proved about the module, not about its framework.
    target_compile_options(${target} PRIVATE -w -O0)
    if(NOT TARGET GTest::${target})
        add_library(GTest::${target} ALIAS ${target})
    endif()
endforeach()

# Half of the time of a cross build went into reading these headers.
target_precompile_headers(gtest INTERFACE <gtest/gtest.h> <vector> <string>)
target_precompile_headers(gmock INTERFACE <gmock/gmock.h>)
# One file each, or hardly more: reading them ahead is no gain.
cmake_language(DEFER CALL set_target_properties digest_tests finger_detect_tests fpnavi_test_support
        soak PROPERTIES DISABLE_PRECOMPILE_HEADERS ON)

add_library(rapidcheck INTERFACE)
add_library(rapidcheck_gtest INTERFACE)
target_include_directories(rapidcheck INTERFACE ${PROJECT_SOURCE_DIR}/tests/cross)

# Likewise the simulated sensor and the plain model, which is defined after this: not optimised, they
# would take most of the time of the tests.
target_compile_options(fpnavi_sim PRIVATE $<$<CONFIG:Debug>:-O2>)
cmake_language(DEFER CALL target_compile_options fpnavi_reference PRIVATE $<$<CONFIG:Debug>:-O2>)
