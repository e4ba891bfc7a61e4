# Cross build for 64-bit Windows with mingw-w64 (Debian's g++-mingw-w64-x86-64-posix and
# binutils-mingw-w64-x86-64): the same DLL from the same sources, plus quorrel.exe and the
# dialog test, so that the Windows code runs under 64-bit Wine. The product stays the
# 32-bit DLL (toolchain-mingw-i686.cmake).
set(CMAKE_SYSTEM_PROCESSOR AMD64)
set(QUORREL_MINGW_TRIPLE x86_64-w64-mingw32)
include(${CMAKE_CURRENT_LIST_DIR}/mingw-common.cmake)
