# What every target of ours is compiled with.
add_library(orx_options INTERFACE)

option(ORX_SANITIZE "Address and undefined-behaviour sanitizers" OFF)
option(ORX_FUZZ "Fuzz targets; needs clang" OFF)

if(NOT MSVC)
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
  elseif(NOT WIN32)
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

# The compiler's libraries go into the program, without what it does not use of them: it starts
# faster and needs none of them installed.
add_library(orx_static_runtime INTERFACE)
if(WIN32 AND NOT MSVC)
  target_link_options(orx_static_runtime INTERFACE -static)
elseif(NOT MSVC AND NOT ORX_SANITIZE)
  target_link_options(orx_static_runtime INTERFACE -static-libstdc++ -static-libgcc
    -Wl,--gc-sections)
endif()
