# Exports exactly the entry points listed in entry_points.inc. Included from
# src/host/CMakeLists.txt with quorrel_module defined.
set(QUORREL_ENTRY_POINTS_FILE ${CMAKE_CURRENT_LIST_DIR}/entry_points.inc)
set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${QUORREL_ENTRY_POINTS_FILE})

# QUORREL_ENTRY_POINT_NAMES, _ORDINALS, _ARG_BYTES: parallel lists, one entry per row.
# The rows exported only with notes count in a build with notes.
set(quorrel_entry_kinds "ENTRY_POINT")
if(QUORREL_NOTES)
  set(quorrel_entry_kinds "(NOTES_)?ENTRY_POINT")
endif()
file(STRINGS ${QUORREL_ENTRY_POINTS_FILE} quorrel_entry_lines
  REGEX "^QUORREL_${quorrel_entry_kinds}\\(")
set(QUORREL_ENTRY_POINT_NAMES "")
set(QUORREL_ENTRY_POINT_ORDINALS "")
set(QUORREL_ENTRY_POINT_ARG_BYTES "")
foreach(line IN LISTS quorrel_entry_lines)
  string(REGEX MATCH
    "^QUORREL_(NOTES_)?ENTRY_POINT\\(([A-Za-z]+), ([0-9]+), ([0-9]+), [a-z]+, [A-Za-z]+\\)$"
    matched "${line}")
  if(NOT matched)
    message(FATAL_ERROR "entry_points.inc: cannot read line '${line}'")
  endif()
  list(APPEND QUORREL_ENTRY_POINT_NAMES ${CMAKE_MATCH_2})
  list(APPEND QUORREL_ENTRY_POINT_ORDINALS ${CMAKE_MATCH_3})
  list(APPEND QUORREL_ENTRY_POINT_ARG_BYTES ${CMAKE_MATCH_4})
endforeach()

if(WIN32)
  # The module-definition file. On 32-bit Windows __stdcall symbols carry an @bytes
  # decoration; the .def names them decorated and --kill-at strips the decoration from
  # the exported names. 64-bit Windows has one calling convention and no decoration.
  set(quorrel_def_text "LIBRARY quorrel.dll\nEXPORTS\n")
  foreach(name ordinal bytes IN ZIP_LISTS QUORREL_ENTRY_POINT_NAMES
          QUORREL_ENTRY_POINT_ORDINALS QUORREL_ENTRY_POINT_ARG_BYTES)
    if(CMAKE_SIZEOF_VOID_P EQUAL 4)
      string(APPEND quorrel_def_text "  ${name}@${bytes} @${ordinal}\n")
    else()
      string(APPEND quorrel_def_text "  ${name} @${ordinal}\n")
    endif()
  endforeach()
  set(quorrel_def ${CMAKE_BINARY_DIR}/quorrel.def)
  file(CONFIGURE OUTPUT ${quorrel_def} CONTENT "${quorrel_def_text}" @ONLY)
  target_sources(quorrel_module PRIVATE ${quorrel_def})
  target_link_options(quorrel_module PRIVATE "LINKER:--kill-at")
elseif(NOT APPLE)
  set(quorrel_version_script ${CMAKE_CURRENT_BINARY_DIR}/quorrel.map)
  set(quorrel_map_text "{\n  global:\n")
  # Plus the portable platform services, when cmake/ModuleResources.cmake lists them.
  foreach(name IN LISTS QUORREL_ENTRY_POINT_NAMES QUORREL_PLATFORM_EXPORTS)
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
