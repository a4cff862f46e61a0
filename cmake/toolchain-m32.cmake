# 32-bit x86 build on an x86-64 Debian host (g++-multilib).  Everything,
# GoogleTest included, is compiled and linked with -m32, so pointers are
# 4 bytes and the layout checks of include/dpx_camel.h are compiled in.
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_SYSTEM_PROCESSOR i686)
set(CMAKE_C_COMPILER gcc)
set(CMAKE_CXX_COMPILER g++)
set(CMAKE_C_FLAGS_INIT "-m32")
set(CMAKE_CXX_FLAGS_INIT "-m32")
set(CMAKE_EXE_LINKER_FLAGS_INIT "-m32")
set(CMAKE_SHARED_LINKER_FLAGS_INIT "-m32")
set(CMAKE_MODULE_LINKER_FLAGS_INIT "-m32")
set(CMAKE_LIBRARY_ARCHITECTURE i386-linux-gnu)
# Header-only packages (nlohmann-json, CLI11) are found in the usual places;
# 32-bit libraries come from the multilib directories.
set(FIND_LIBRARY_USE_LIB32_PATHS ON)
