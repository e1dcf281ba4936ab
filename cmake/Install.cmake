# Installation: programs, the RTL flow script, the library archives with
# their public headers, the default installation data and a CMake package.
#
#   cmake --install <build> --prefix <dir>
#
# gives <dir>/bin/{qdb2ver,tessel,rtl2json}, <dir>/lib/libnlw_*.a,
# <dir>/include/nlw_verilog/..., <dir>/share/nlw_verilog (the default
# installation root of the installed programs) and
# <dir>/lib/cmake/nlw_verilog (find_package(nlw_verilog)).

include(CMakePackageConfigHelpers)

set(NLW_CMAKE_DIR ${CMAKE_INSTALL_LIBDIR}/cmake/nlw_verilog)

install(TARGETS qdb2ver tessel RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
install(PROGRAMS ${CMAKE_SOURCE_DIR}/flow/rtl2json ${CMAKE_SOURCE_DIR}/flow/rtl2qdm
        DESTINATION ${CMAKE_INSTALL_BINDIR})
install(TARGETS nlw_port nlw_model nlw_framework nlw_writers nlw_reader nlw_verilog
        EXPORT nlw_verilogTargets
        ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR}
        INCLUDES DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/nlw_verilog)
install(DIRECTORY ${CMAKE_SOURCE_DIR}/share/ DESTINATION ${CMAKE_INSTALL_DATADIR}/nlw_verilog)
install(EXPORT nlw_verilogTargets NAMESPACE nlw_verilog:: DESTINATION ${NLW_CMAKE_DIR})

set(NLW_INSTALL_SHARE ${CMAKE_INSTALL_DATADIR}/nlw_verilog)
configure_package_config_file(${CMAKE_SOURCE_DIR}/cmake/nlw_verilogConfig.cmake.in
  ${CMAKE_BINARY_DIR}/nlw_verilogConfig.cmake INSTALL_DESTINATION ${NLW_CMAKE_DIR}
  PATH_VARS NLW_INSTALL_SHARE)
write_basic_package_version_file(${CMAKE_BINARY_DIR}/nlw_verilogConfigVersion.cmake
  VERSION ${PROJECT_VERSION} COMPATIBILITY SameMinorVersion)
install(FILES ${CMAKE_BINARY_DIR}/nlw_verilogConfig.cmake ${CMAKE_BINARY_DIR}/nlw_verilogConfigVersion.cmake
        DESTINATION ${NLW_CMAKE_DIR})
