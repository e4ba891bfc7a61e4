# Turns quorrel_module into the 32-bit Windows DLL: quorrel.dll with every entry point
# exported by its plain name at its ordinal, the resource script linked in, and the
# runtimes linked statically (see toolchain-mingw-i686.cmake). Included from the root
# CMakeLists.txt on Windows builds after src/ is added.

# The module-definition file and --kill-at come from src/host/exports.cmake, with the
# Linux version script (the notes listener too, in a build with notes).
set_target_properties(quorrel_module PROPERTIES
  PREFIX ""
  OUTPUT_NAME quorrel
  RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR})

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
