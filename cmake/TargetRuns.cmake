# Whether this machine can run the programs the build makes, probed once per build tree.
#
# A native build always can. A cross build (-m32, mingw) may not: some kernels refuse
# every 32-bit x86 program. Where the answer is no, everything still builds (the layout
# checks are compile-time), and each test that would run a target program is replaced by
# one that reports itself skipped with the reason.
#
#   QUORREL_TARGET_RUNS         ON or OFF; set it on the command line to force the answer
#                               (-DQUORREL_TARGET_RUNS=OFF proves the "cannot run" path)
#   QUORREL_TARGET_RUNS_REASON  why not, for the skip messages
#
#   quorrel_discover_tests(TARGET [gtest_discover_tests options...])
#   quorrel_add_test(NAME name COMMAND command [args...])   add_test for target programs

if(NOT DEFINED QUORREL_TARGET_RUNS)
  if(NOT CMAKE_CROSSCOMPILING)
    set(runs ON)
    set(reason "")
  elseif(WIN32)
    set(runs OFF)
    set(reason "Windows programs run only under Wine, through their own tests")
  else()
    set(probe_dir ${CMAKE_BINARY_DIR}/CMakeFiles/QuorrelTargetProbe)
    file(WRITE ${probe_dir}/probe.cpp "int main() { return 0; }\n")
    try_compile(probe_built ${probe_dir}/build ${probe_dir}/probe.cpp
      OUTPUT_VARIABLE probe_log COPY_FILE ${probe_dir}/probe)
    if(NOT probe_built)
      set(runs OFF)
      set(reason "the target's programs cannot even be linked here")
    else()
      execute_process(COMMAND ${probe_dir}/probe RESULT_VARIABLE probe_result
        OUTPUT_QUIET ERROR_VARIABLE probe_error TIMEOUT 20)
      if(probe_result STREQUAL "0")
        set(runs ON)
        set(reason "")
      else()
        string(STRIP "${probe_result} ${probe_error}" probe_error)
        set(runs OFF)
        set(reason "this machine does not run ${CMAKE_SYSTEM_PROCESSOR} programs (${probe_error})")
      endif()
    endif()
  endif()
  set(QUORREL_TARGET_RUNS ${runs} CACHE BOOL "Whether the programs this build makes run here")
  set(QUORREL_TARGET_RUNS_REASON "${reason}" CACHE STRING "Why the target's programs do not run")
elseif(NOT QUORREL_TARGET_RUNS AND NOT QUORREL_TARGET_RUNS_REASON)
  set(QUORREL_TARGET_RUNS_REASON "QUORREL_TARGET_RUNS was set to OFF" CACHE STRING
    "Why the target's programs do not run" FORCE)
endif()
if(NOT QUORREL_TARGET_RUNS)
  message(STATUS "Target programs do not run here: ${QUORREL_TARGET_RUNS_REASON}")
endif()

# One test that says why the checks of NAME cannot run here.
function(quorrel_add_skipped_test name)
  add_test(NAME ${name}
    COMMAND ${CMAKE_COMMAND} -E echo "skipped: ${QUORREL_TARGET_RUNS_REASON}")
  set_tests_properties(${name} PROPERTIES SKIP_REGULAR_EXPRESSION "skipped: ")
endfunction()

function(quorrel_discover_tests target)
  if(QUORREL_TARGET_RUNS)
    gtest_discover_tests(${target} DISCOVERY_MODE PRE_TEST ${ARGN})
  else()
    quorrel_add_skipped_test(${target})
  endif()
endfunction()

function(quorrel_add_test)
  cmake_parse_arguments(PARSE_ARGV 0 arg "" "NAME" "COMMAND")
  if(QUORREL_TARGET_RUNS)
    add_test(NAME ${arg_NAME} COMMAND ${arg_COMMAND})
  else()
    quorrel_add_skipped_test(${arg_NAME})
  endif()
endfunction()
