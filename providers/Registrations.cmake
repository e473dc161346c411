# The registrations that CIM servers read, written from cimom's: whoever serves a class is told once.

# What a server calls the interfaces of cimom's registration. OpenPegasus numbers them, and takes
# properties of who serves the instances.
set(zem_pegasus_instance 2)
set(zem_pegasus_association 3)
set(zem_pegasus_indication 4)
set(zem_pegasus_method 5)

# zem_registrations(<json> <folder>): zemproviders.pegasus.mof and zemproviders.sfcb.reg in the
# folder. Where there is no Java bridge they leave out who serves indications alone.
function(zem_registrations json folder)
  set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${json})
  file(READ ${json} json)
  string(JSON namespace GET ${json} namespace)
  string(JSON library GET ${json} library)
  string(JSON classes GET ${json} classes)
  # Who runs jobs, and who has the one Java VM that a process can have, must be in one process, and
  # that of a user who can become any other.
  set(pegasus "instance of PG_ProviderModule {
  Name = \"${library}\"; Vendor = \"${PROJECT_NAME}\"; Version = \"${PROJECT_VERSION}\";
  InterfaceType = \"CMPI\"; InterfaceVersion = \"2.0.0\"; Location = \"${library}\";
  UserContext = 4;  // Privileged User
};\n")
  set(sfcb "")
  set(providers "")
  string(JSON count LENGTH ${classes})
  math(EXPR last "${count} - 1")
  foreach(index RANGE ${last})
    string(JSON class MEMBER ${classes} ${index})
    string(JSON provider GET ${classes} ${class} provider)
    string(JSON interfaces GET ${classes} ${class} interfaces)
    string(REGEX MATCHALL "[a-z]+" interfaces ${interfaces})
    if(interfaces STREQUAL indication AND NOT ZEM_JAVA)
      continue()
    endif()

    set(types "")
    foreach(interface IN LISTS interfaces)
      list(APPEND types ${zem_pegasus_${interface}})
    endforeach()
    list(JOIN types ", " types)
    if(NOT provider IN_LIST providers)
      list(APPEND providers ${provider})
      string(APPEND pegasus
        "instance of PG_Provider { ProviderModuleName = \"${library}\"; Name = \"${provider}\"; };\n")
    endif()
    string(APPEND pegasus "instance of PG_ProviderCapabilities {
  ProviderModuleName = \"${library}\"; CapabilityID = \"${class}\"; ClassName = \"${class}\";
  ProviderName = \"${provider}\"; ProviderType = { ${types} }; Namespaces = { \"${namespace}\" };
};\n")

    # As they answer themselves; but sfcb asks one provider for all that are of its library.
    list(JOIN interfaces " " types)
    string(APPEND sfcb "[${class}]
   provider: ${provider}
   location: ${library}
   type: ${types}
   group: ${library}
   namespace: ${namespace}
   unload: never
#\n")
  endforeach()
  file(CONFIGURE OUTPUT ${folder}/zemproviders.pegasus.mof CONTENT "${pegasus}" @ONLY)
  file(CONFIGURE OUTPUT ${folder}/zemproviders.sfcb.reg CONTENT "${sfcb}" @ONLY)
endfunction()
