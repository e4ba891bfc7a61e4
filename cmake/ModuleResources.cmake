# The module's resources. Included from src/host/CMakeLists.txt with quorrel_module
# defined.
#  - tools/rcgen, built for the build machine even in a cross build, writes the resource
#    script build/.../generated/quorrel.rc: the template resources/quorrel.rc with the
#    menus and strings of src/host/table.inc.
#  - Windows: the resource compiler builds that script into the DLL (WindowsDll.cmake).
#  - Elsewhere: rcgen turns the script into constant tables (quorrel_resource_data) that
#    the portable menu, string and dialog services read, and the module exports those
#    services for host programs.
set(QUORREL_RESOURCE_TEMPLATE ${CMAKE_SOURCE_DIR}/resources/quorrel.rc)
set(QUORREL_RESOURCE_SCRIPT ${CMAKE_BINARY_DIR}/generated/quorrel.rc)

if(CMAKE_CROSSCOMPILING)
  # Built with the build machine's compiler: the target's programs may not run here.
  include(ExternalProject)
  set(rcgen_dir ${CMAKE_BINARY_DIR}/rcgen-host)
  ExternalProject_Add(quorrel_rcgen_host
    SOURCE_DIR ${CMAKE_SOURCE_DIR}/tools/rcgen
    BINARY_DIR ${rcgen_dir}
    CMAKE_ARGS -DCMAKE_BUILD_TYPE=Release
    BUILD_ALWAYS ON
    INSTALL_COMMAND ""
    BUILD_BYPRODUCTS ${rcgen_dir}/quorrel_rcgen)
  set(rcgen_command ${rcgen_dir}/quorrel_rcgen)
  set(rcgen_depends quorrel_rcgen_host ${rcgen_dir}/quorrel_rcgen)
else()
  add_subdirectory(${CMAKE_SOURCE_DIR}/tools/rcgen ${CMAKE_BINARY_DIR}/rcgen)
  set(rcgen_command quorrel_rcgen)
  set(rcgen_depends quorrel_rcgen)
endif()

add_custom_command(
  OUTPUT ${QUORREL_RESOURCE_SCRIPT}
  COMMAND ${CMAKE_COMMAND} -E make_directory ${CMAKE_BINARY_DIR}/generated
  COMMAND ${rcgen_command} script ${QUORREL_RESOURCE_TEMPLATE} ${QUORREL_RESOURCE_SCRIPT}
  DEPENDS ${rcgen_depends} ${QUORREL_RESOURCE_TEMPLATE} ${CMAKE_SOURCE_DIR}/src/host/table.inc
  COMMENT "Writing the resource script with the menus and strings of the table"
  VERBATIM)
add_custom_target(quorrel_resource_script DEPENDS ${QUORREL_RESOURCE_SCRIPT})

if(WIN32)
  return()  # cmake/WindowsDll.cmake hands the script to the resource compiler
endif()

set(QUORREL_GENERATED_RESOURCES ${CMAKE_BINARY_DIR}/generated/quorrel_resources.cpp)
add_custom_command(
  OUTPUT ${QUORREL_GENERATED_RESOURCES}
  COMMAND ${rcgen_command} tables ${QUORREL_RESOURCE_SCRIPT} ${QUORREL_GENERATED_RESOURCES}
  DEPENDS ${rcgen_depends} ${QUORREL_RESOURCE_SCRIPT}
  COMMENT "Generating resource tables from the resource script"
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
