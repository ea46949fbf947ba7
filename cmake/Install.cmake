# What a device service needs: the library, its two companions, the headers, a package file.
include(CMakePackageConfigHelpers)

install(TARGETS fpnavi fpnavi_alog fpnavi_finger_detect EXPORT fpnavi-targets)
install(FILES fpsvc/callib/inc/FpNavi.h fpsvc/callib/inc/FingerDetect.h devhal/alog/inc/alog.h
        DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/fpnavi)
install(FILES devhal/alog/alog_host.h DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/fpnavi)
install(EXPORT fpnavi-targets NAMESPACE fpnavi::
        DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/fpnavi)
configure_package_config_file(cmake/fpnavi-config.cmake.in fpnavi-config.cmake
        INSTALL_DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/fpnavi)
write_basic_package_version_file(fpnavi-config-version.cmake COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/fpnavi-config.cmake
        ${CMAKE_CURRENT_BINARY_DIR}/fpnavi-config-version.cmake
        DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/fpnavi)
