# Manual pages and completion, for which programs are asked what they can do: their --help is the
# only place that tells.

find_program(ZEM_HELP2MAN help2man)
if(NOT ZEM_HELP2MAN)
  message(STATUS "Manual pages: off, help2man is not here (Debian: help2man)")
endif()

# zem_manual(<target> <component> <program>...): a page for each program that the target is called
# by, and its completion in bash. What --help does not tell may stand in cmake/manual/<target>.
function(zem_manual target component)
  set(pages)
  set(more ${CMAKE_SOURCE_DIR}/cmake/manual/${target})
  if(NOT EXISTS ${more})
    set(more /dev/null)
  endif()
  set(script ${CMAKE_SOURCE_DIR}/cmake/manual/manual.sh)
  foreach(program IN LISTS ARGN)
    install(FILES ${CMAKE_SOURCE_DIR}/cmake/manual/completion.bash RENAME ${program}
      DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions COMPONENT ${component})
    set(page ${CMAKE_BINARY_DIR}/man/${program}.1)
    list(APPEND pages ${page})
    add_custom_command(OUTPUT ${page}
      COMMAND sh ${script} ${CMAKE_RUNTIME_OUTPUT_DIRECTORY}/${program} ${more} ${page}
      DEPENDS ${target} ${more} ${script} VERBATIM)
  endforeach()
  # A program under sanitizers is slow to ask, and its pages nobody reads.
  if(ZEM_HELP2MAN AND NOT ZEM_SANITIZE)
    add_custom_target(${target}_manual ALL DEPENDS ${pages})
    install(FILES ${pages} DESTINATION ${CMAKE_INSTALL_MANDIR}/man1 COMPONENT ${component})
  endif()
endfunction()
