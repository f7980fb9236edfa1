# Cross build for 64-bit Windows with the mingw-w64 "posix" thread variant.
set(CMAKE_SYSTEM_NAME Windows)
set(CMAKE_SYSTEM_PROCESSOR x86_64)
set(QO_MINGW_PREFIX x86_64-w64-mingw32)
set(CMAKE_C_COMPILER   ${QO_MINGW_PREFIX}-gcc-posix)
set(CMAKE_CXX_COMPILER ${QO_MINGW_PREFIX}-g++-posix)
set(CMAKE_RC_COMPILER  ${QO_MINGW_PREFIX}-windres)
set(CMAKE_FIND_ROOT_PATH /usr/${QO_MINGW_PREFIX})
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
# Every Windows binary of the build runs under Wine through the project's runner.
set(CMAKE_CROSSCOMPILING_EMULATOR ${CMAKE_CURRENT_LIST_DIR}/../tools/winrun)
