# The options that every target of this project is compiled with.
add_library(orx_options INTERFACE)

option(ORX_SANITIZE "Address and undefined-behaviour sanitizers" OFF)
option(ORX_FUZZ "Fuzz targets; needs clang" OFF)

if(WIN32)
  # The oldest Windows that the program starts on: Vista and Server 2008.
  target_compile_definitions(orx_options INTERFACE _WIN32_WINNT=0x0600)
endif()

if(MSVC)
  set(CMAKE_MSVC_RUNTIME_LIBRARY "MultiThreaded$<$<CONFIG:Debug>:Debug>")
  # The standard C functions that the compiler warns of are used within their limits.
  target_compile_definitions(orx_options INTERFACE _CRT_SECURE_NO_WARNINGS)
  target_compile_options(orx_options INTERFACE /W4 /WX /utf-8 /guard:cf)
  # 0x800 limits the search for imported libraries to the system folder, from Windows 10 on.
  target_link_options(orx_options INTERFACE /guard:cf /DEPENDENTLOADFLAG:0x800
    /SUBSYSTEM:CONSOLE,6.00)
else()
  target_compile_options(orx_options INTERFACE -Wall -Wextra -Wpedantic -Wshadow -Wconversion
    -Wnon-virtual-dtor -Wold-style-cast -Werror)
  if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
    # GCC 12 sees overlapping copies in plain string concatenation.
    target_compile_options(orx_options INTERFACE -Wno-restrict)
  endif()
  if(ORX_SANITIZE)
    target_compile_options(orx_options INTERFACE
      -fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer)
    target_link_options(orx_options INTERFACE -fsanitize=address,undefined)
  else()
    target_compile_options(orx_options INTERFACE
      -fstack-protector-strong -U_FORTIFY_SOURCE $<$<CONFIG:Release>:-D_FORTIFY_SOURCE=2>)
  endif()
  if(ORX_FUZZ)
    target_compile_options(orx_options INTERFACE -fsanitize=fuzzer-no-link)
  endif()
  if(NOT WIN32)
    set(CMAKE_POSITION_INDEPENDENT_CODE ON)
    target_link_options(orx_options INTERFACE -pie -Wl,-z,relro -Wl,-z,now)
  endif()
endif()

# The compiler's libraries become part of the program, which then starts faster and needs none of
# them installed. The linker drops what the program does not use of them.
add_library(orx_static_runtime INTERFACE)
if(WIN32 AND NOT MSVC)
  target_link_options(orx_static_runtime INTERFACE -static -fstack-protector-strong
    -Wl,--subsystem,console:6.0 -Wl,--major-os-version,6 -Wl,--minor-os-version,0
    $<$<CONFIG:Release>:-s>)
elseif(NOT MSVC AND NOT ORX_SANITIZE)
  target_link_options(orx_static_runtime INTERFACE -static-libstdc++ -static-libgcc
    -Wl,--gc-sections)
endif()
