# What both mingw-w64 cross builds share, included by their toolchain files after they
# set QUORREL_MINGW_TRIPLE and the processor.
set(CMAKE_SYSTEM_NAME Windows)

find_program(CMAKE_C_COMPILER NAMES ${QUORREL_MINGW_TRIPLE}-gcc-posix ${QUORREL_MINGW_TRIPLE}-gcc REQUIRED)
find_program(CMAKE_CXX_COMPILER NAMES ${QUORREL_MINGW_TRIPLE}-g++-posix ${QUORREL_MINGW_TRIPLE}-g++ REQUIRED)
# The unprefixed windres writes x86-64 objects whatever the target.
find_program(CMAKE_RC_COMPILER NAMES ${QUORREL_MINGW_TRIPLE}-windres REQUIRED)

set(CMAKE_FIND_ROOT_PATH /usr/${QUORREL_MINGW_TRIPLE})
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)

# Link the C and C++ runtimes and winpthread statically: the DLL may import
# system DLLs only, never libgcc, libstdc++ or libwinpthread.
set(CMAKE_SHARED_LINKER_FLAGS_INIT "-static -static-libgcc -static-libstdc++")
set(CMAKE_EXE_LINKER_FLAGS_INIT "-static -static-libgcc -static-libstdc++")
# Release DLLs and programs (quorrel.exe ships beside the DLL) carry no symbol table;
# the exports are unaffected.
set(CMAKE_SHARED_LINKER_FLAGS_RELEASE_INIT "-s")
set(CMAKE_EXE_LINKER_FLAGS_RELEASE_INIT "-s")
