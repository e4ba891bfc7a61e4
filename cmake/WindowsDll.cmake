# Turns quorrel_module into the 32-bit Windows DLL: quorrel.dll with every entry point
# exported by its plain name at its ordinal, the resource script linked in, and the
# runtimes linked statically (see toolchain-mingw-i686.cmake). Included from the root
# CMakeLists.txt on Windows builds after src/ is added.

# The module-definition file comes from the same list as the Linux version script.
# On 32-bit Windows __stdcall symbols carry an @bytes decoration; the .def names them
# decorated and --kill-at strips the decoration from the exported names. 64-bit Windows
# has one calling convention and no decoration.
set(quorrel_entry_points ${CMAKE_SOURCE_DIR}/src/host/entry_points.txt)
set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${quorrel_entry_points})
file(STRINGS ${quorrel_entry_points} quorrel_def_lines REGEX "^[A-Za-z]")
set(quorrel_def_text "LIBRARY quorrel.dll\nEXPORTS\n")
foreach(line IN LISTS quorrel_def_lines)
  if(NOT line MATCHES "^([A-Za-z]+)[ \t]+([0-9]+)[ \t]+([0-9]+)")
    message(FATAL_ERROR "entry_points.txt: cannot read line '${line}'")
  endif()
  if(CMAKE_SIZEOF_VOID_P EQUAL 4)
    string(APPEND quorrel_def_text "  ${CMAKE_MATCH_1}@${CMAKE_MATCH_3} @${CMAKE_MATCH_2}\n")
  else()
    string(APPEND quorrel_def_text "  ${CMAKE_MATCH_1} @${CMAKE_MATCH_2}\n")
  endif()
endforeach()
# The checked DLL (QUORREL_NOTES) adds, after every ordinal of the list, the listener
# through which quorrel.exe prints its notes.
if(QUORREL_NOTES)
  if(CMAKE_SIZEOF_VOID_P EQUAL 4)
    string(APPEND quorrel_def_text "  QuorrelListenNotes@8 @201\n")
  else()
    string(APPEND quorrel_def_text "  QuorrelListenNotes @201\n")
  endif()
endif()
set(quorrel_def ${CMAKE_BINARY_DIR}/quorrel.def)
file(CONFIGURE OUTPUT ${quorrel_def} CONTENT "${quorrel_def_text}" @ONLY)

set_target_properties(quorrel_module PROPERTIES
  PREFIX ""
  OUTPUT_NAME quorrel
  RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR})
target_sources(quorrel_module PRIVATE ${quorrel_def})
target_link_options(quorrel_module PRIVATE "LINKER:--kill-at")

# The resource script (menus, string tables, the setup dialog, bitmaps, data) written
# from resources/quorrel.rc and the table (cmake/ModuleResources.cmake); the resource
# compiler finds the pictures it names in resources/.
set(quorrel_rc ${CMAKE_BINARY_DIR}/generated/quorrel.rc)
target_sources(quorrel_module PRIVATE ${quorrel_rc})
add_dependencies(quorrel_module quorrel_resource_script)
target_include_directories(quorrel_module PRIVATE ${CMAKE_SOURCE_DIR}/resources)
file(GLOB quorrel_rc_inputs CONFIGURE_DEPENDS ${CMAKE_SOURCE_DIR}/resources/*.bmp)
set_property(SOURCE ${quorrel_rc} TARGET_DIRECTORY quorrel_module APPEND PROPERTY
  OBJECT_DEPENDS ${quorrel_rc_inputs})

# Layout checks compiled for i686, and the setup dialog test.
add_subdirectory(${CMAKE_SOURCE_DIR}/tests/windows ${CMAKE_BINARY_DIR}/tests/windows)
