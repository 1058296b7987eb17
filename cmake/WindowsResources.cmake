# Adds a program's manifest (the systems that it knows, and that it runs with its caller's rights)
# and the resource with its version. The description is one line, which the system shows.
enable_language(RC)

function(orx_add_windows_resources target)
  set(folder ${CMAKE_CURRENT_BINARY_DIR}/resources/${target})
  configure_file(platform/windows/program.manifest.in ${folder}/program.manifest @ONLY)
  configure_file(platform/windows/program.rc.in ${folder}/program.rc @ONLY)
  target_sources(${target} PRIVATE ${folder}/program.rc)
  set_source_files_properties(${folder}/program.rc PROPERTIES
    OBJECT_DEPENDS ${folder}/program.manifest INCLUDE_DIRECTORIES ${folder})
  if(MSVC)
    target_link_options(${target} PRIVATE /MANIFEST:NO)  # else the linker adds a second one
  endif()
endfunction()
