# orx_minizip: the zip writer over zlib, as archives that become part of the program. From the
# system's packages (on Windows those of vcpkg); for a cross-build, which has no such package,
# compiled from the source package.
set(ZLIB_USE_STATIC_LIBS ON)
find_package(ZLIB REQUIRED)

if(CMAKE_CROSSCOMPILING)
  enable_language(C)
  set(folder ${PROJECT_BINARY_DIR}/minizip-source)
  if(NOT EXISTS ${folder}/minizip/zip.c)
    execute_process(COMMAND ${PROJECT_SOURCE_DIR}/scripts/fetch-minizip.sh ${folder}
      COMMAND_ERROR_IS_FATAL ANY)
  endif()
  set(ORX_MINIZIP_LIBRARY orx_minizip_source)
  set(ORX_MINIZIP_INCLUDE_DIR ${folder})
  add_library(${ORX_MINIZIP_LIBRARY} STATIC ${folder}/minizip/zip.c ${folder}/minizip/ioapi.c
    ${folder}/minizip/unzip.c)
  target_compile_options(${ORX_MINIZIP_LIBRARY} PRIVATE -w)
  set_target_properties(${ORX_MINIZIP_LIBRARY} PROPERTIES UNITY_BUILD OFF)  # its files share names
  target_link_libraries(${ORX_MINIZIP_LIBRARY} PRIVATE ZLIB::ZLIB)
else()
  find_library(ORX_MINIZIP_LIBRARY NAMES libminizip.a minizip REQUIRED)
  find_path(ORX_MINIZIP_INCLUDE_DIR minizip/zip.h REQUIRED)
endif()

add_library(orx_minizip INTERFACE)
target_include_directories(orx_minizip SYSTEM INTERFACE ${ORX_MINIZIP_INCLUDE_DIR})
# A program with the property ORX_SHARES_ZLIB gets the fixes of the system's zlib, as it unpacks what
# others packed. The others, which only pack, have their own and start without loading one.
target_link_libraries(orx_minizip INTERFACE ${ORX_MINIZIP_LIBRARY}
  $<IF:$<BOOL:$<TARGET_PROPERTY:ORX_SHARES_ZLIB>>,z,ZLIB::ZLIB>)
