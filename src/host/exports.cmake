# Exports exactly the entry points listed in entry_points.txt. Included from
# src/host/CMakeLists.txt with quorrel_module defined.
set(QUORREL_ENTRY_POINTS_FILE ${CMAKE_CURRENT_LIST_DIR}/entry_points.txt)
set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${QUORREL_ENTRY_POINTS_FILE})

# QUORREL_ENTRY_POINT_NAMES, _ORDINALS, _ARG_BYTES, _SIDES: parallel lists.
file(STRINGS ${QUORREL_ENTRY_POINTS_FILE} quorrel_entry_lines REGEX "^[A-Za-z]")
set(QUORREL_ENTRY_POINT_NAMES "")
set(QUORREL_ENTRY_POINT_ORDINALS "")
set(QUORREL_ENTRY_POINT_ARG_BYTES "")
set(QUORREL_ENTRY_POINT_SIDES "")
foreach(line IN LISTS quorrel_entry_lines)
  string(REGEX MATCH "^([A-Za-z]+)[ \t]+([0-9]+)[ \t]+([0-9]+)[ \t]+([a-z]+)" matched "${line}")
  if(NOT matched)
    message(FATAL_ERROR "entry_points.txt: cannot read line '${line}'")
  endif()
  list(APPEND QUORREL_ENTRY_POINT_NAMES ${CMAKE_MATCH_1})
  list(APPEND QUORREL_ENTRY_POINT_ORDINALS ${CMAKE_MATCH_2})
  list(APPEND QUORREL_ENTRY_POINT_ARG_BYTES ${CMAKE_MATCH_3})
  list(APPEND QUORREL_ENTRY_POINT_SIDES ${CMAKE_MATCH_4})
endforeach()

# The same list for host programs (the host simulator, the Windows dialog test): a
# Windows host finds every entry point by its ordinal.
set(quorrel_ordinals_text "")
foreach(name ordinal IN ZIP_LISTS QUORREL_ENTRY_POINT_NAMES QUORREL_ENTRY_POINT_ORDINALS)
  string(APPEND quorrel_ordinals_text "QUORREL_ENTRY_POINT(${name}, ${ordinal})\n")
endforeach()
file(CONFIGURE OUTPUT ${CMAKE_BINARY_DIR}/generated/entry_point_ordinals.inc
  CONTENT "${quorrel_ordinals_text}" @ONLY)

if(NOT WIN32 AND NOT APPLE)
  set(quorrel_version_script ${CMAKE_CURRENT_BINARY_DIR}/quorrel.map)
  set(quorrel_map_text "{\n  global:\n")
  # Plus the portable platform services, when cmake/ModuleResources.cmake lists them.
  # And, in a build with notes, the listener the quorrel command registers.
  set(quorrel_note_exports "")
  if(QUORREL_NOTES)
    set(quorrel_note_exports QuorrelListenNotes)
  endif()
  foreach(name IN LISTS QUORREL_ENTRY_POINT_NAMES QUORREL_PLATFORM_EXPORTS quorrel_note_exports)
    string(APPEND quorrel_map_text "    ${name};\n")
  endforeach()
  string(APPEND quorrel_map_text "  local:\n    *;\n};\n")
  file(CONFIGURE OUTPUT ${quorrel_version_script} CONTENT "${quorrel_map_text}" @ONLY)
  target_link_options(quorrel_module PRIVATE "LINKER:--version-script=${quorrel_version_script}")
  set_property(TARGET quorrel_module APPEND PROPERTY LINK_DEPENDS ${quorrel_version_script})
  # A routine that is declared but never defined must fail the build, not the host.
  if(NOT QUORREL_SANITIZE AND NOT QUORREL_BUILD_FUZZ)
    target_link_options(quorrel_module PRIVATE "LINKER:--no-undefined")
  endif()
endif()
