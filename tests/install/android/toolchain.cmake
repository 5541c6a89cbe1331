# Compiles for 32-bit x86 Android, as the preset android-x86 does with the NDK, as far as objects. In place of the NDK's
# headers stand those of the host's LLVM C++ library, which is the NDK's, too, and sysroot/: the functions of Android's C
# library that the sources use, and no others.
set(CMAKE_SYSTEM_NAME Android)
set(CMAKE_SYSTEM_VERSION 1) # keeps CMake from looking for an NDK
set(CMAKE_SYSTEM_PROCESSOR i686)
set(CMAKE_C_COMPILER clang-13)
set(CMAKE_CXX_COMPILER clang++-13)
set(CMAKE_C_COMPILER_TARGET i686-linux-android21)
set(CMAKE_CXX_COMPILER_TARGET i686-linux-android21)
set(CMAKE_TRY_COMPILE_TARGET_TYPE STATIC_LIBRARY)
set(CMAKE_SYSROOT ${CMAKE_CURRENT_LIST_DIR}/sysroot)
if(SENSELOOM_RECORDER)
  set(recorder_headers "-isystem ${CMAKE_CURRENT_LIST_DIR}/sysroot_recorder -isystem ${KERNEL_HEADERS}")
endif()
# The C++ library has a <locale.h> of its own, which refuses to be used without localization.
set(CMAKE_CXX_FLAGS_INIT
    "${recorder_headers} -isystem ${CMAKE_CURRENT_LIST_DIR}/sysroot/first -isystem /usr/include/c++/v1")
# What of the C++ library stands on more of the C library than the sources need.
foreach(feature THREADS LOCALIZATION WIDE_CHARACTERS MONOTONIC_CLOCK)
  string(APPEND CMAKE_CXX_FLAGS_INIT " -D_LIBCPP_HAS_NO_${feature}")
endforeach()
