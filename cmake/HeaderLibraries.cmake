# orx_header_libraries: nlohmann-json and CLI11, which consist of headers only, for the reader. A
# cross-build uses those of this system, and must not see its other headers.
add_library(orx_header_libraries INTERFACE)

foreach(header IN ITEMS nlohmann/json.hpp CLI/CLI.hpp)
  cmake_path(GET header PARENT_PATH library)
  find_path(ORX_FOLDER_OF_${library} ${header} PATHS /usr/include NO_CMAKE_FIND_ROOT_PATH REQUIRED)
  set(folder ${ORX_FOLDER_OF_${library}})
  if(CMAKE_CROSSCOMPILING)
    set(alone ${PROJECT_BINARY_DIR}/header-libraries)
    file(MAKE_DIRECTORY ${alone})
    file(CREATE_LINK ${folder}/${library} ${alone}/${library} SYMBOLIC)
    set(folder ${alone})
  endif()
  target_include_directories(orx_header_libraries SYSTEM INTERFACE ${folder})
endforeach()
