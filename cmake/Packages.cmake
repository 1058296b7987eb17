# What an installation has, and the packages of it that "cpack --preset release" and
# "cpack --preset windows" write to build/packages.
set(ORX_VERSION_DATE 2026-11-25)  # of the version in project()
set(ORX_PACKAGE_CONTACT "ORXInstallEventLog maintainers <maintainers@orxinstalleventlog.invalid>"
  CACHE STRING "Whom the package names as its maintainer")

# Adds the copyright files of the Debian packages whose code the linker puts into the programs.
function(orx_install_notices)
  foreach(package IN LISTS ARGN)
    set(notice /usr/share/doc/${package}/copyright)
    if(EXISTS ${notice})
      file(REAL_PATH ${notice} notice)
      install(FILES ${notice} DESTINATION ${CMAKE_INSTALL_DOCDIR}/linked-libraries RENAME ${package})
    endif()
  endforeach()
endfunction()

# Installs a file as FOLDER/NAME.gz, after filling in the version.
function(orx_install_compressed source folder name)
  set(filled ${PROJECT_BINARY_DIR}/packages/${name})
  configure_file(${source} ${filled} @ONLY)
  execute_process(COMMAND gzip -9nc ${filled} OUTPUT_FILE ${filled}.gz COMMAND_ERROR_IS_FATAL ANY)
  install(FILES ${filled}.gz DESTINATION ${folder})
endfunction()

install(TARGETS ${ORX_PROGRAMS} RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
install(FILES README.md CHANGELOG.md cmake/copyright DESTINATION ${CMAKE_INSTALL_DOCDIR})
install(DIRECTORY docs DESTINATION ${CMAKE_INSTALL_DOCDIR}
  FILES_MATCHING PATTERN "*.md" PATTERN "*.svg")

if(WIN32)
  orx_install_notices(gcc-mingw-w64-base libcli11-dev libminizip-dev libz-mingw-w64-dev
    mingw-w64-common nlohmann-json3-dev)
else()
  orx_install_notices(gcc-12-base libcli11-dev libminizip-dev nlohmann-json3-dev zlib1g-dev)
  install(DIRECTORY scripts/sample-machine/ DESTINATION ${CMAKE_INSTALL_DOCDIR}/examples
    USE_SOURCE_PERMISSIONS)
  execute_process(COMMAND date -u -R -d ${ORX_VERSION_DATE} OUTPUT_VARIABLE ORX_CHANGELOG_DATE
    OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
  orx_install_compressed(cmake/debian-changelog.in ${CMAKE_INSTALL_DOCDIR} changelog)
  foreach(program IN LISTS ORX_PROGRAMS)
    orx_install_compressed(docs/${program}.1.in ${CMAKE_INSTALL_MANDIR}/man1 ${program}.1)
  endforeach()
endif()

set(CPACK_PACKAGE_CONTACT ${ORX_PACKAGE_CONTACT})
set(CPACK_PACKAGE_VENDOR ${PROJECT_NAME})
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "installation history of a product family")
set(CPACK_PACKAGE_DESCRIPTION
"ORXInstallEventLog records what an installer does: when it began and ended,
its messages and its result, and the machine before and after. orxhistory
reads such a history, from the machine or from an archive of it.")
set(CPACK_STRIP_FILES ON)
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS OWNER_READ OWNER_WRITE OWNER_EXECUTE
  GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)
if(WIN32)
  set(CPACK_GENERATOR ZIP)
  set(CPACK_PACKAGE_FILE_NAME ${PROJECT_NAME}-${PROJECT_VERSION}-windows)
else()
  set(CPACK_GENERATOR DEB)
  set(CPACK_PACKAGE_NAME orxinstalleventlog)
  set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
  set(CPACK_DEBIAN_PACKAGE_SECTION admin)
  set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
  set(CPACK_DEBIAN_PACKAGE_RECOMMENDS libsystemd0)  # looked up at run time, for the services
endif()
include(CPack)
