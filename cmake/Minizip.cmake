# orx_minizip: the zip writer over zlib. From the system's packages, as archives that become part
# of the program.
set(ZLIB_USE_STATIC_LIBS ON)
find_package(ZLIB REQUIRED)
find_library(ORX_MINIZIP_LIBRARY NAMES libminizip.a minizip REQUIRED)
find_path(ORX_MINIZIP_INCLUDE_DIR minizip/zip.h REQUIRED)

add_library(orx_minizip INTERFACE)
target_include_directories(orx_minizip SYSTEM INTERFACE ${ORX_MINIZIP_INCLUDE_DIR})
target_link_libraries(orx_minizip INTERFACE ${ORX_MINIZIP_LIBRARY} ZLIB::ZLIB)
