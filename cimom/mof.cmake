# Values, the class repository and its MOF parser: static library cimom_mof.

find_package(BISON 3.8 REQUIRED)
find_package(FLEX 2.6 REQUIRED)

set(mof_generated ${CMAKE_CURRENT_BINARY_DIR}/mof)
file(MAKE_DIRECTORY ${mof_generated})
bison_target(MofGrammar ${CMAKE_CURRENT_LIST_DIR}/MofGrammar.y ${mof_generated}/MofGrammar.cpp
  DEFINES_FILE ${mof_generated}/MofGrammar.h COMPILE_FLAGS "-Wall -Werror")
flex_target(MofLexer ${CMAKE_CURRENT_LIST_DIR}/MofLexer.l ${mof_generated}/MofLexer.cpp)
add_flex_bison_dependency(MofLexer MofGrammar)
# What the generators write is not held to the house's warnings.
set_source_files_properties(${BISON_MofGrammar_OUTPUT_SOURCE} ${FLEX_MofLexer_OUTPUTS}
  PROPERTIES COMPILE_OPTIONS -w)

add_library(cimom_mof STATIC
  ${CMAKE_CURRENT_LIST_DIR}/ClassLinker.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ClassRepository.cpp
  ${CMAKE_CURRENT_LIST_DIR}/Literal.cpp
  ${CMAKE_CURRENT_LIST_DIR}/MofParser.cpp
  ${CMAKE_CURRENT_LIST_DIR}/MofValue.cpp
  ${CMAKE_CURRENT_LIST_DIR}/PathText.cpp
  ${CMAKE_CURRENT_LIST_DIR}/Value.cpp
  ${BISON_MofGrammar_OUTPUTS}
  ${FLEX_MofLexer_OUTPUTS})
target_include_directories(cimom_mof PUBLIC ${CMAKE_CURRENT_LIST_DIR})
target_link_libraries(cimom_mof PRIVATE cmpi_headers INTERFACE cmpi::headers)
target_include_directories(cimom_mof SYSTEM PRIVATE ${mof_generated})
zem_target(cimom_mof)
