# Run by cpack when the files of all packages lie in folders of their own, before they are packed:
# adds to each what Debian wants in it.

file(STRINGS ${CPACK_ZEM_FILES}/changelog latest LIMIT_COUNT 1)
if(NOT latest MATCHES "\\(${CPACK_PACKAGE_VERSION}\\)")
  message(FATAL_ERROR "cmake/debian/changelog does not begin with version ${CPACK_PACKAGE_VERSION}")
endif()

# Programs look here for the packages of libraries that are not installed.
set(shlibs "")
foreach(component IN LISTS CPACK_COMPONENTS_ALL)
  string(APPEND shlibs "${CPACK_ZEM_SHLIBS_${component}}")
endforeach()

foreach(component IN LISTS CPACK_COMPONENTS_ALL)
  set(root ${CPACK_TEMPORARY_DIRECTORY}/${component})
  set(control ${CPACK_TEMPORARY_DIRECTORY}.control/${component})
  file(REMOVE_RECURSE ${control})
  string(TOUPPER CPACK_DEBIAN_${component} key)
  set(package ${${key}_PACKAGE_NAME})

  foreach(folder IN LISTS CPACK_ZEM_FOLDERS_${component})
    file(MAKE_DIRECTORY ${root}${folder})
  endforeach()
  set(doc ${root}/usr/share/doc/${package})
  file(COPY ${CPACK_ZEM_FILES}/copyright ${CPACK_ZEM_FILES}/changelog DESTINATION ${doc})
  file(GLOB pages ${root}/usr/share/man/man*/*)
  execute_process(COMMAND gzip -9nf ${doc}/changelog ${pages} COMMAND_ERROR_IS_FATAL ANY)
  if(EXISTS ${CPACK_ZEM_FILES}/${package}.overrides)
    configure_file(${CPACK_ZEM_FILES}/${package}.overrides
      ${root}/usr/share/lintian/overrides/${package} COPYONLY)
  endif()
  foreach(script postinst prerm postrm)
    if(EXISTS ${CPACK_ZEM_FILES}/${package}.${script})
      configure_file(${CPACK_ZEM_FILES}/${package}.${script} ${control}/${script} COPYONLY)
    endif()
  endforeach()

  if(${key}_PACKAGE_SHLIBDEPS)
    file(WRITE ${root}/debian/shlibs.local "${shlibs}")
  endif()
  if(CPACK_ZEM_SHLIBS_${component})
    file(WRITE ${control}/shlibs "${CPACK_ZEM_SHLIBS_${component}}")
    file(WRITE ${control}/triggers "activate-noawait ldconfig\n")
    file(GLOB_RECURSE library ${root}/usr/lib*/*.so.*.*)
    execute_process(COMMAND dpkg-gensymbols -q -p${package} -v${CPACK_PACKAGE_VERSION} -P${root}
      -e${library} -O${control}/symbols COMMAND_ERROR_IS_FATAL ANY)
  endif()
  # A script that is named but not there is left out. One that is not named cpack would write, with
  # calls of ldconfig for which there is a trigger.
  set(${key}_PACKAGE_CONTROL_EXTRA)
  foreach(file postinst prerm postrm shlibs symbols triggers)
    list(APPEND ${key}_PACKAGE_CONTROL_EXTRA ${control}/${file})
  endforeach()

  # Whoever builds may let nobody else read what he makes.
  execute_process(COMMAND chmod -R u+rwX,go+rX,go-w ${root} COMMAND_ERROR_IS_FATAL ANY)
endforeach()
