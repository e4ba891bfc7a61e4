# Cross build of the extension for 32-bit Windows with mingw-w64 (Debian's
# g++-mingw-w64-i686-posix and binutils-mingw-w64-i686).
set(CMAKE_SYSTEM_PROCESSOR x86)
set(QUORREL_MINGW_TRIPLE i686-w64-mingw32)
# SSE2: every processor that runs a Windows version the host supports has it, and the
# CSV loader's 16-byte scan then takes the place of its word-at-a-time one. Measured
# under Wine (bench/wine/run --sse2, 20 MB table): a CSV load 103 -> 79 ms, every other
# load and save row within the noise. The core uses no floating point, so nothing
# computes differently. The m32 build keeps the word path under test.
set(CMAKE_C_FLAGS_INIT "-msse2")
set(CMAKE_CXX_FLAGS_INIT "-msse2")
include(${CMAKE_CURRENT_LIST_DIR}/mingw-common.cmake)
