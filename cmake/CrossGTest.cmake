# GoogleTest and the stand-in for RapidCheck in a cross build: Debian packages neither for foreign
# processors, so the first is built from Debian's sources (package googletest).
set(FPNAVI_GTEST_SOURCES /usr/src/googletest CACHE PATH "GoogleTest's sources, for cross builds")
set(INSTALL_GTEST OFF)
add_subdirectory(${FPNAVI_GTEST_SOURCES} ${CMAKE_BINARY_DIR}/googletest EXCLUDE_FROM_ALL SYSTEM)
foreach(target gtest gtest_main gmock gmock_main)
    target_compile_options(${target} PRIVATE -w)
    if(NOT TARGET GTest::${target})
        add_library(GTest::${target} ALIAS ${target})
    endif()
endforeach()

add_library(rapidcheck INTERFACE)
add_library(rapidcheck_gtest INTERFACE)
target_include_directories(rapidcheck INTERFACE ${PROJECT_SOURCE_DIR}/tests/cross)
