# What `cmake --install` gives: libraries, headers, programs, a CMake package, a pkg-config file.
# Each rule names the component, and so the package (ZemPackage), to which its files belong.
include(CMakePackageConfigHelpers)
include(ZemManual)

# zem_install_library(<target> <component> <component of what only builds need>)
function(zem_install_library target component devel)
  install(TARGETS ${target} EXPORT zemutilities
    LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT ${component} NAMELINK_COMPONENT ${devel})
endfunction()

zem_install_library(zemutilities library devel)
zem_install_library(api api devel)
file(GLOB zem_headers ${CMAKE_SOURCE_DIR}/utilities/*.h)
foreach(header IN LISTS ZEM_PRIVATE_HEADERS)
  list(REMOVE_ITEM zem_headers ${CMAKE_SOURCE_DIR}/utilities/${header})
endforeach()
install(FILES ${zem_headers} ${CMAKE_SOURCE_DIR}/appliance/api/libapi.h
  DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/zemutilities COMPONENT devel)

# The bundled binding goes along; the system's own is found again where the build found it.
if(TARGET cmpiCppImpl)
  set(zem_pc_cmpi_cflags "-I\${includedir}/cmpi")
  set(zem_pc_cmpi_libs -lcmpiCppImpl)
  get_target_property(zem_cmpi_headers cmpiCppImpl PUBLIC_HEADER)
  list(TRANSFORM zem_cmpi_headers PREPEND ${CMAKE_SOURCE_DIR}/cmpi/)
  install(FILES ${zem_cmpi_headers}
    DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/cmpi COMPONENT binding_devel)
  set_target_properties(cmpiCppImpl PROPERTIES PUBLIC_HEADER "")
  zem_install_library(cmpiCppImpl binding binding_devel)
  install(TARGETS cmpi_headers EXPORT zemutilities)
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

# zem_install_program(<target> <component> <name>...): a program by each of its names, the first of
# which is its own, with their manual pages and completion.
function(zem_install_program target component own)
  install(TARGETS ${target} RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT ${component})
  foreach(link IN LISTS ARGN)
    # A link is installed as a link, to the program that is installed beside it.
    install(PROGRAMS ${CMAKE_RUNTIME_OUTPUT_DIRECTORY}/${link}
      DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT ${component})
  endforeach()
  zem_manual(${target} ${component} ${own} ${ARGN})
endfunction()

zem_install_program(cimom manager cimom)
zem_install_program(appliance appliance appliance)
zem_install_program(appliance_tools appliance qyplat ${ZEM_TOOLS})
if(TARGET zemtrace)
  zem_install_program(zemtrace trace zemtrace)
endif()

# The unit names programs and files where they are installed, which may be elsewhere than where
# the build was to be installed.
if(TARGET cimom_http)
  install(CODE "
    get_filename_component(CMAKE_INSTALL_FULL_BINDIR \"${CMAKE_INSTALL_BINDIR}\" ABSOLUTE
      BASE_DIR \"\${CMAKE_INSTALL_PREFIX}\")
    get_filename_component(CMAKE_INSTALL_FULL_DATADIR \"${CMAKE_INSTALL_DATADIR}\" ABSOLUTE
      BASE_DIR \"\${CMAKE_INSTALL_PREFIX}\")
    set(unit \"\${CMAKE_INSTALL_PREFIX}/lib/systemd/system/cimom.service\")
    configure_file(\"${CMAKE_SOURCE_DIR}/cimom/cimom.service.in\" \"\$ENV{DESTDIR}\${unit}\" @ONLY)
    list(APPEND CMAKE_INSTALL_MANIFEST_FILES \"\${unit}\")" COMPONENT manager)
endif()

# A CIM server looks for providers among the libraries, and so does cimom, wherever the registration
# lies.
install(TARGETS zemproviders LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT providers)
list(JOIN CMAKE_INSTALL_RPATH ":" zem_runpath)
string(APPEND zem_runpath "${zem_cmpi_run_path}")
install(CODE "get_filename_component(libdir \"${CMAKE_INSTALL_LIBDIR}\" ABSOLUTE
    BASE_DIR \"\${CMAKE_INSTALL_PREFIX}\")
  file(RPATH_SET FILE \"\$ENV{DESTDIR}\${libdir}/libzemproviders.so\"
    NEW_RPATH [[${zem_runpath}]])" COMPONENT providers)
install(FILES ${CMAKE_SOURCE_DIR}/providers/zemproviders.json
  DESTINATION ${CMAKE_INSTALL_DATADIR}/zemutilities COMPONENT providers)
install(DIRECTORY ${CMAKE_SOURCE_DIR}/providers/mof ${CMAKE_SOURCE_DIR}/providers/messages
  DESTINATION ${CMAKE_INSTALL_DATADIR}/zemutilities COMPONENT providers)
install(FILES README.md DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation)
install(DIRECTORY docs DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation)

# The first provider that the page makes lies ready to be copied.
set(zem_page ${CMAKE_SOURCE_DIR}/docs/writing-a-provider.md)
set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${zem_page})
file(READ ${zem_page} zem_page)
foreach(file disks.mof DiskProvider.cpp CMakeLists.txt disks.json)
  set(zem_rest "${zem_page}")
  foreach(mark "`${file}`:\n" "\n```" "\n")  # its name, the fence, what else is on that line
    string(FIND "${zem_rest}" "${mark}" zem_at)
    if(zem_at EQUAL -1)
      message(FATAL_ERROR "docs/writing-a-provider.md prints no ${file}")
    endif()
    string(LENGTH "${mark}" zem_length)
    math(EXPR zem_at "${zem_at} + ${zem_length}")
    string(SUBSTRING "${zem_rest}" ${zem_at} -1 zem_rest)
  endforeach()
  string(FIND "${zem_rest}" "\n```" zem_at)
  string(SUBSTRING "${zem_rest}" 0 ${zem_at} zem_rest)
  file(CONFIGURE OUTPUT ${CMAKE_BINARY_DIR}/disks/${file} CONTENT "${zem_rest}\n" @ONLY)
endforeach()
install(DIRECTORY ${CMAKE_BINARY_DIR}/disks
  DESTINATION ${CMAKE_INSTALL_DOCDIR}/examples COMPONENT devel)

set(zem_package ${CMAKE_INSTALL_LIBDIR}/cmake/zemutilities)
install(EXPORT zemutilities FILE zemutilitiesTargets.cmake NAMESPACE zem::
  DESTINATION ${zem_package} COMPONENT devel)
configure_package_config_file(${CMAKE_SOURCE_DIR}/cmake/zemutilitiesConfig.cmake.in
  ${CMAKE_BINARY_DIR}/zemutilitiesConfig.cmake INSTALL_DESTINATION ${zem_package})
write_basic_package_version_file(${CMAKE_BINARY_DIR}/zemutilitiesConfigVersion.cmake
  COMPATIBILITY SameMinorVersion)
install(FILES ${CMAKE_BINARY_DIR}/zemutilitiesConfig.cmake
  ${CMAKE_BINARY_DIR}/zemutilitiesConfigVersion.cmake DESTINATION ${zem_package} COMPONENT devel)

# The prefix is told from where the file lies, so that the tree may be installed anywhere.
file(RELATIVE_PATH zem_pc_up /${CMAKE_INSTALL_LIBDIR}/pkgconfig /)
configure_file(${CMAKE_SOURCE_DIR}/cmake/zemutilities.pc.in ${CMAKE_BINARY_DIR}/zemutilities.pc @ONLY)
install(FILES ${CMAKE_BINARY_DIR}/zemutilities.pc
  DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT devel)
