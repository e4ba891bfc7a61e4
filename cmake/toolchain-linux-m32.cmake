# Native 32-bit Linux build (Debian's g++-multilib): the host tests run with
# the pointer width and record layouts of the Windows DLL. Without SSE2, unlike the DLL,
# so that the parsers' word-at-a-time paths stay under test.
#
# It is a cross build: the kernel of some build machines refuses 32-bit programs, so the
# programs that run during the build are built for the build machine, and whether the
# tests can run is probed (cmake/TargetRuns.cmake).
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_SYSTEM_PROCESSOR i686)

set(CMAKE_C_FLAGS_INIT "-m32")
set(CMAKE_CXX_FLAGS_INIT "-m32")
set(CMAKE_EXE_LINKER_FLAGS_INIT "-m32")
set(CMAKE_SHARED_LINKER_FLAGS_INIT "-m32")
set(CMAKE_MODULE_LINKER_FLAGS_INIT "-m32")
# The distribution's GoogleTest is 64-bit only; build it from its sources.
set(QUORREL_GTEST_SOURCE_DIR /usr/src/googletest CACHE PATH "GoogleTest sources to build with the project")
