# What `cpack` gives: Debian packages, one for each component of the install rules. This is the only
# place that says which there are. What debhelper would do to their files, ZemPackageStage does.

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME zemutilities)
set(CPACK_PACKAGE_VENDOR zemutilities)
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "CIM providers for a virtualization appliance")
set(CPACK_PACKAGE_CONTACT "zemutilities maintainers <maintainers@zemutilities.example>"
  CACHE STRING "Whom packages name as their maintainer")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_THREADS 0)
set(CPACK_PRE_BUILD_SCRIPTS ${CMAKE_CURRENT_LIST_DIR}/ZemPackageStage.cmake)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_COMPONENTS_GROUPING IGNORE)
set(CPACK_COMPONENTS_ALL "")
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_COMPRESSION_TYPE xz)
set(CPACK_DEBIAN_PACKAGE_SOURCE zemutilities)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${CMAKE_LIBRARY_OUTPUT_DIRECTORY})
set(CPACK_ZEM_FILES ${CMAKE_CURRENT_LIST_DIR}/debian)

# zem_package(<component> <package> <section> "<summary>" "<description>"
#   [LIBRARY <target> | PROGRAMS | TEXT] [DEPENDS ...] [RECOMMENDS ...] [SUGGESTS ...]
#   [FOLDERS ...])
# LIBRARY, and PROGRAMS of whatever sort, depend on what they are linked with beside DEPENDS; TEXT
# is the same on all machines. The package of a library is named for it and its soname, as
# distributions want it. A dependency that ends with "=" is on the very same version. FOLDERS are
# empty at first.
function(zem_package component package section summary description)
  cmake_parse_arguments(P "PROGRAMS;TEXT" LIBRARY "DEPENDS;RECOMMENDS;SUGGESTS;FOLDERS" ${ARGN})
  string(TOUPPER ${component} key)
  set(CPACK_COMPONENTS_ALL ${CPACK_COMPONENTS_ALL} ${component} PARENT_SCOPE)
  set(key CPACK_DEBIAN_${key})
  set(${key}_PACKAGE_NAME ${package} PARENT_SCOPE)
  set(${key}_PACKAGE_SECTION ${section} PARENT_SCOPE)
  set(${key}_DESCRIPTION "${summary}\n${description}" PARENT_SCOPE)
  foreach(kind DEPENDS RECOMMENDS SUGGESTS)
    list(JOIN P_${kind} ", " others)
    string(REPLACE "=" " (= ${PROJECT_VERSION})" others "${others}")
    set(${key}_PACKAGE_${kind} "${others}" PARENT_SCOPE)
  endforeach()
  set(CPACK_ZEM_FOLDERS_${component} ${P_FOLDERS} PARENT_SCOPE)
  if(P_LIBRARY OR P_PROGRAMS)
    set(${key}_PACKAGE_SHLIBDEPS ON PARENT_SCOPE)
  elseif(P_TEXT)
    set(${key}_PACKAGE_ARCHITECTURE all PARENT_SCOPE)
  endif()
  if(P_LIBRARY)
    get_target_property(soversion ${P_LIBRARY} SOVERSION)
    set(CPACK_ZEM_SHLIBS_${component}
      "lib${P_LIBRARY} ${soversion} ${package} (>= ${PROJECT_VERSION})\n" PARENT_SCOPE)
  endif()
endfunction()

set(zem_binding_devel)  # the system's own comes with the system
if(TARGET cmpiCppImpl)
  set(zem_binding_devel libcmpicppimpl-dev=)
endif()
zem_package(library libzemutilities0 libs
  "library on which CIM providers for an appliance are made"
  "zemutilities turns the command-line tools and the management library of a
server-virtualization appliance into the DMTF virtualization model: hosts,
logical partitions, their settings and resource pools, under any CIM server
that speaks CMPI."
  LIBRARY zemutilities)
zem_package(devel libzemutilities-dev libdevel
  "library on which CIM providers are made - development files"
  "Headers, CMake package and pkg-config file of libzemutilities, the header of
the appliance's management library, and a first provider to copy."
  DEPENDS libzemutilities0= libapi0= ${zem_binding_devel}
  SUGGESTS cimom zemproviders zemutilities-doc)
zem_package(api libapi0 libs
  "management library of the stand-in appliance"
  "Answers with records what the stand-in appliance has: hosts, partitions,
profiles, adapters and pools. Providers on libzemutilities ask it."
  LIBRARY api)
if(TARGET cmpiCppImpl)
  zem_package(binding libcmpicppimpl0 libs
    "C++ binding of CMPI, the interface of CIM providers"
    "Objects for what a CIM server hands to a provider over the C interface
CMPI, and the entry points of providers that are written with them."
    LIBRARY cmpiCppImpl)
  zem_package(binding_devel libcmpicppimpl-dev libdevel
    "C++ binding of CMPI - development files"
    "C headers of CMPI, the interface between a CIM server and its providers, and
headers of the C++ binding on them."
    DEPENDS libcmpicppimpl0=)
endif()
zem_package(manager cimom net
  "small CIM object manager"
  "Serves the CMPI providers of a registration to one command at a time, or by
CIM-XML over HTTP to any WBEM client. Comes with a systemd unit, which serves
the loopback interface from when there is a file of passwords."
  PROGRAMS RECOMMENDS zemproviders SUGGESTS zemutilities-doc FOLDERS /etc/cimom)
zem_package(providers zemproviders net
  "CIM providers of a virtualization appliance"
  "Providers of the classes ORXC_ for any CIM server that speaks CMPI: hosts,
partitions, their settings, resource pools, changes and events of a
server-virtualization appliance. With their schema, their registration and
translated messages."
  PROGRAMS RECOMMENDS cimom
  SUGGESTS zemutilities-appliance zemutilities-doc default-jre-headless)
zem_package(appliance zemutilities-appliance net
  "stand-in for a server-virtualization appliance"
  "Behaves as an appliance that manages partitioned hosts: its state in a file,
the tools that query and change it, and the Java classes that tell of
changes. What is built on libzemutilities can be run and shown with it."
  PROGRAMS SUGGESTS default-jre-headless zemutilities-doc)
if(TARGET zemtrace)
  zem_package(trace zemtrace utils
    "report and picture of where the time of CIM requests went"
    "Reads the timing trace that providers on libzemutilities write, and tells for
each operation how often it ran, how long it took and what of that tools took."
    PROGRAMS SUGGESTS zemutilities-doc)
endif()
zem_package(documentation zemutilities-doc doc
  "CIM providers for a virtualization appliance - documentation"
  "How a request flows, how a provider is written, how clients are served, how
a CIM server is set up, and what the stand-in appliance understands."
  TEXT)

include(CPack)
