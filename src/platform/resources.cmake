# The module's resources, from the one script resources/quorrel.rc. Included from
# src/host/CMakeLists.txt with quorrel_module defined.
#  - Windows: the resource compiler builds the script into the DLL (WindowsDll.cmake).
#  - Elsewhere: rcgen, built for the build machine even in a cross build, turns the script into constant tables
#    (quorrel_resource_data) that the portable menu, string and dialog services read,
#    and the module exports those services for host programs.
set(QUORREL_RESOURCE_SCRIPT ${CMAKE_SOURCE_DIR}/resources/quorrel.rc)

# The script's menus and strings must offer exactly the rows of src/host/table.inc.
set(quorrel_table_stamp ${CMAKE_BINARY_DIR}/generated/resources_match_table.stamp)
add_custom_command(
  OUTPUT ${quorrel_table_stamp}
  COMMAND ${CMAKE_COMMAND} -DSCRIPT=${QUORREL_RESOURCE_SCRIPT}
          -DTABLE=${CMAKE_SOURCE_DIR}/src/host/table.inc -DSTAMP=${quorrel_table_stamp}
          -P ${CMAKE_SOURCE_DIR}/resources/check_table.cmake
  DEPENDS ${QUORREL_RESOURCE_SCRIPT} ${CMAKE_SOURCE_DIR}/src/host/table.inc
          ${CMAKE_SOURCE_DIR}/resources/check_table.cmake
  COMMENT "Checking quorrel.rc against the table of actions and expressions"
  VERBATIM)
add_custom_target(quorrel_resources_match_table DEPENDS ${quorrel_table_stamp})
add_dependencies(quorrel_module quorrel_resources_match_table)

if(WIN32)
  return()  # cmake/WindowsDll.cmake hands the script to the resource compiler
endif()

if(CMAKE_CROSSCOMPILING)
  # Built with the build machine's compiler: the target's programs may not run here.
  include(ExternalProject)
  set(rcgen_dir ${CMAKE_BINARY_DIR}/rcgen-host)
  ExternalProject_Add(quorrel_rcgen_host
    SOURCE_DIR ${CMAKE_SOURCE_DIR}/src/platform/rcgen
    BINARY_DIR ${rcgen_dir}
    CMAKE_ARGS -DCMAKE_BUILD_TYPE=Release
    BUILD_ALWAYS ON
    INSTALL_COMMAND ""
    BUILD_BYPRODUCTS ${rcgen_dir}/quorrel_rcgen)
  set(rcgen_command ${rcgen_dir}/quorrel_rcgen)
  set(rcgen_depends quorrel_rcgen_host ${rcgen_dir}/quorrel_rcgen)
else()
  add_subdirectory(${CMAKE_SOURCE_DIR}/src/platform/rcgen ${CMAKE_BINARY_DIR}/rcgen)
  set(rcgen_command quorrel_rcgen)
  set(rcgen_depends quorrel_rcgen)
endif()

set(QUORREL_GENERATED_RESOURCES ${CMAKE_BINARY_DIR}/generated/quorrel_resources.cpp)
add_custom_command(
  OUTPUT ${QUORREL_GENERATED_RESOURCES}
  COMMAND ${CMAKE_COMMAND} -E make_directory ${CMAKE_BINARY_DIR}/generated
  COMMAND ${rcgen_command} ${QUORREL_RESOURCE_SCRIPT} ${QUORREL_GENERATED_RESOURCES}
  DEPENDS ${rcgen_depends} ${QUORREL_RESOURCE_SCRIPT}
  COMMENT "Generating resource tables from quorrel.rc"
  VERBATIM)

add_library(quorrel_resource_data OBJECT ${QUORREL_GENERATED_RESOURCES})
target_include_directories(quorrel_resource_data PUBLIC ${CMAKE_SOURCE_DIR}/src)
target_link_libraries(quorrel_module PRIVATE quorrel_resource_data)

# The portable services host programs call on the module's menus and dialogs.
set(QUORREL_PLATFORM_EXPORTS
  LoadMenuA CreatePopupMenu DestroyMenu GetSubMenu GetMenuItemCount GetMenuItemID
  GetMenuStringA GetMenuState AppendMenuA LoadStringA LocalAlloc LocalFree
  DialogBoxParamA EndDialog SetWindowLongA GetWindowLongA GetDlgItem SetDlgItemTextA
  GetDlgItemTextA SetDlgItemInt GetDlgItemInt CheckDlgButton IsDlgButtonChecked
  EnableWindow IsWindowEnabled
  QuorrelSetDialogScript QuorrelDialogClick QuorrelDialogType QuorrelDialogKey
  QuorrelDialogIsOpen)
