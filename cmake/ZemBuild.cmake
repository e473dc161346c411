# What every target of the tree shares: language level, warnings, sanitizers, output folders.

set(CMAKE_CXX_STANDARD 17)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_C_STANDARD 11)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
if(NOT CMAKE_BUILD_TYPE AND NOT CMAKE_CONFIGURATION_TYPES)
  set(CMAKE_BUILD_TYPE Release CACHE STRING "Build type" FORCE)
endif()

# Programs and libraries of one build lie together, so that tools find each other. They lie as the
# installed ones do, and one search path does for both: CMake would pad that of the build with
# colons, and what is empty between two of them stands for the current folder.
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/bin)
set(CMAKE_LIBRARY_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/lib)
file(RELATIVE_PATH zem_libdir ${CMAKE_INSTALL_FULL_BINDIR} ${CMAKE_INSTALL_FULL_LIBDIR})
set(CMAKE_INSTALL_RPATH $ORIGIN $ORIGIN/../lib $ORIGIN/${zem_libdir})
list(REMOVE_DUPLICATES CMAKE_INSTALL_RPATH)
set(CMAKE_INSTALL_RPATH_USE_LINK_PATH ON)
set(CMAKE_BUILD_WITH_INSTALL_RPATH ON)

find_program(ZEM_CCACHE ccache)
if(ZEM_CCACHE AND NOT CMAKE_CXX_COMPILER_LAUNCHER)
  set(CMAKE_C_COMPILER_LAUNCHER ${ZEM_CCACHE})
  # Without these it passes by whatever uses a precompiled header. Nothing here reads the time
  # macros.
  set(CMAKE_CXX_COMPILER_LAUNCHER ${CMAKE_COMMAND} -E env
    CCACHE_SLOPPINESS=pch_defines,time_macros,include_file_mtime,include_file_ctime ${ZEM_CCACHE})
endif()

find_package(Threads REQUIRED)

if(ZEM_SANITIZE)
  add_compile_options(-fsanitize=${ZEM_SANITIZE} -fno-omit-frame-pointer -fno-sanitize-recover=all)
  add_link_options(-fsanitize=${ZEM_SANITIZE})
  # What a library keeps to its end is no leak for having been unmapped before the process looks;
  # gcc never unmaps one that has templates in it. ZEM_UNMAPPED excepts what tests unload.
  add_link_options("$<$<NOT:$<BOOL:$<TARGET_PROPERTY:ZEM_UNMAPPED>>>:LINKER:-z,nodelete>")
else()
  # What is shipped is hardened; a debug build stays as its debugger likes it.
  add_compile_options("$<$<NOT:$<CONFIG:Debug>>:-fstack-protector-strong;-U_FORTIFY_SOURCE;-D_FORTIFY_SOURCE=2>")
  add_link_options(-Wl,-z,relro,-z,now,-z,noexecstack)
endif()
include(CheckPIESupported)
check_pie_supported()

# zem_target(<target>): the house's warnings on a target of ours. One source is made of many where
# the build is told so, which clang-tidy is not to wonder at.
function(zem_target target)
  set_target_properties(${target} PROPERTIES
    UNITY_BUILD_CODE_BEFORE_INCLUDE "// NOLINTNEXTLINE(bugprone-suspicious-include)")
  target_compile_options(${target} PRIVATE
    -Wall -Wextra -Wpedantic -Wshadow
    $<$<COMPILE_LANGUAGE:CXX>:-Wconversion -Wnon-virtual-dtor>
    $<$<COMPILE_LANG_AND_ID:CXX,Clang>:-Wno-gnu-zero-variadic-macro-arguments>)
  # What is private to a source gcc takes for a header's when it is compiled with others.
  if(CMAKE_UNITY_BUILD)
    target_compile_options(${target} PRIVATE
      $<$<COMPILE_LANG_AND_ID:CXX,GNU>:-Wno-subobject-linkage>)
  endif()
endfunction()
