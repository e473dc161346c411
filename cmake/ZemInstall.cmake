# What `cmake --install` gives: libraries, headers, programs, a CMake package, a pkg-config file.
include(CMakePackageConfigHelpers)

set(zem_installed zemutilities api)
file(GLOB zem_headers ${CMAKE_SOURCE_DIR}/utilities/*.h)
foreach(header IN LISTS ZEM_PRIVATE_HEADERS)
  list(REMOVE_ITEM zem_headers ${CMAKE_SOURCE_DIR}/utilities/${header})
endforeach()
install(FILES ${zem_headers} ${CMAKE_SOURCE_DIR}/appliance/api/libapi.h
  DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/zemutilities)

# The bundled binding goes along; the system's own is found again where the build found it.
if(TARGET cmpiCppImpl)
  set(zem_pc_cmpi_cflags "-I\${includedir}/cmpi")
  set(zem_pc_cmpi_libs -lcmpiCppImpl)
  get_target_property(zem_cmpi_headers cmpiCppImpl PUBLIC_HEADER)
  list(TRANSFORM zem_cmpi_headers PREPEND ${CMAKE_SOURCE_DIR}/cmpi/)
  install(FILES ${zem_cmpi_headers} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/cmpi)
  set_target_properties(cmpiCppImpl PROPERTIES PUBLIC_HEADER "")
  list(APPEND zem_installed cmpiCppImpl cmpi_headers)
else()
  set(zem_system_cmpi ${CMPI_LIBRARY})
  get_filename_component(zem_cmpi_libdir ${CMPI_LIBRARY} DIRECTORY)
  set(zem_pc_cmpi_libs "-L${zem_cmpi_libdir} -lcmpiCppImpl")
  set(zem_cmpi_run_path ":${zem_cmpi_libdir}")
  get_target_property(zem_system_cmpi_definitions cmpi::headers INTERFACE_COMPILE_DEFINITIONS)
  list(TRANSFORM zem_system_cmpi_definitions PREPEND -D OUTPUT_VARIABLE zem_pc_cmpi_cflags)
  list(JOIN zem_pc_cmpi_cflags " " zem_pc_cmpi_cflags)
  string(PREPEND zem_pc_cmpi_cflags "-I${CMPI_INCLUDE_DIR} ")
endif()

install(TARGETS ${zem_installed} EXPORT zemutilities
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
  RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
install(TARGETS cimom appliance appliance_tools RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
if(TARGET zemtrace)
  install(TARGETS zemtrace RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
endif()
# A CIM server looks for providers among the libraries, and so does cimom, wherever the registration
# lies.
install(TARGETS zemproviders LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR})
list(JOIN CMAKE_INSTALL_RPATH ":" zem_runpath)
string(APPEND zem_runpath "${zem_cmpi_run_path}")
install(CODE "get_filename_component(libdir \"${CMAKE_INSTALL_LIBDIR}\" ABSOLUTE
    BASE_DIR \"\${CMAKE_INSTALL_PREFIX}\")
  file(RPATH_SET FILE \"\$ENV{DESTDIR}\${libdir}/libzemproviders.so\"
    NEW_RPATH [[${zem_runpath}]])")
install(FILES ${CMAKE_SOURCE_DIR}/providers/zemproviders.json
  DESTINATION ${CMAKE_INSTALL_DATADIR}/zemutilities)
install(DIRECTORY ${CMAKE_SOURCE_DIR}/providers/mof ${CMAKE_SOURCE_DIR}/providers/messages
  DESTINATION ${CMAKE_INSTALL_DATADIR}/zemutilities)
install(FILES README.md DESTINATION ${CMAKE_INSTALL_DOCDIR})
install(DIRECTORY docs DESTINATION ${CMAKE_INSTALL_DOCDIR})

set(zem_package ${CMAKE_INSTALL_LIBDIR}/cmake/zemutilities)
install(EXPORT zemutilities FILE zemutilitiesTargets.cmake NAMESPACE zem:: DESTINATION ${zem_package})
configure_package_config_file(${CMAKE_SOURCE_DIR}/cmake/zemutilitiesConfig.cmake.in
  ${CMAKE_BINARY_DIR}/zemutilitiesConfig.cmake INSTALL_DESTINATION ${zem_package})
write_basic_package_version_file(${CMAKE_BINARY_DIR}/zemutilitiesConfigVersion.cmake
  COMPATIBILITY SameMinorVersion)
install(FILES ${CMAKE_BINARY_DIR}/zemutilitiesConfig.cmake
  ${CMAKE_BINARY_DIR}/zemutilitiesConfigVersion.cmake DESTINATION ${zem_package})

# The prefix is told from where the file lies, so that the tree may be installed anywhere.
file(RELATIVE_PATH zem_pc_up /${CMAKE_INSTALL_LIBDIR}/pkgconfig /)
configure_file(${CMAKE_SOURCE_DIR}/cmake/zemutilities.pc.in ${CMAKE_BINARY_DIR}/zemutilities.pc @ONLY)
install(FILES ${CMAKE_BINARY_DIR}/zemutilities.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
