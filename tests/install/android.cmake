# The module's sources in Android.bp are those of its directory.
file(GLOB sources RELATIVE ${SOURCE} ${SOURCE}/fpsvc/callib/FpNavi/*/*.cpp)
file(READ ${SOURCE}/Android.bp text)
string(REGEX MATCHALL "fpsvc/callib/FpNavi/[a-z]+/[A-Za-z]+\\.cpp" listed "${text}")
list(SORT sources)
list(SORT listed)
if(NOT sources STREQUAL listed)
    message(FATAL_ERROR "Android.bp lists\n${listed}\nthe module has\n${sources}")
endif()
