# The product's word size on a Linux host of either word size: 32-bit x86.
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_SYSTEM_PROCESSOR i686)
# The last two: what every 32-bit x86 processor of Android has, and its compilers take for granted.
set(CMAKE_C_FLAGS_INIT "-m32 -mssse3 -mfpmath=sse")
set(CMAKE_CXX_FLAGS_INIT "-m32 -mssse3 -mfpmath=sse")
set(CMAKE_LIBRARY_ARCHITECTURE i386-linux-gnu)
set(CMAKE_CROSSCOMPILING_EMULATOR "")
# Packages of the host's own word size stand in the same tree.
set(CMAKE_IGNORE_PREFIX_PATH /usr/lib/x86_64-linux-gnu)
set(CMAKE_IGNORE_PATH /usr/lib/x86_64-linux-gnu /usr/lib/x86_64-linux-gnu/android /usr/lib/x86_64-linux-gnu/cmake)
set(ENV{PKG_CONFIG_LIBDIR} /usr/lib/i386-linux-gnu/pkgconfig:/usr/share/pkgconfig)
