# Installation, what other projects find the library by, and Debian packages.

# A folder for each word size, as Debian has it: both can be installed side by side.
if(CMAKE_LIBRARY_ARCHITECTURE)
  set(CMAKE_INSTALL_LIBDIR lib/${CMAKE_LIBRARY_ARCHITECTURE} CACHE PATH "Libraries, below the prefix")
endif()
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)

# The folder of the libraries that stand in for the platform on a Linux host. libsenseloom finds them there by its run
# path, so that they are nobody else's; on a device it finds the platform's own.
set(platform_dir ${CMAKE_INSTALL_LIBDIR}/senseloom)
file(RELATIVE_PATH libdir_of_tool ${CMAKE_INSTALL_FULL_BINDIR} ${CMAKE_INSTALL_FULL_LIBDIR})

set_target_properties(
  senseloom
  PROPERTIES VERSION ${PROJECT_VERSION}
             SOVERSION ${PROJECT_VERSION_MAJOR}
             INSTALL_RPATH "$ORIGIN/senseloom")
set_target_properties(senseloom_cli PROPERTIES INSTALL_RPATH "$ORIGIN/${libdir_of_tool}")
# The folder of liblog is no standard one.
set_target_properties(senseloom senseloom_cli hardware aware_primary
                      PROPERTIES INSTALL_RPATH_USE_LINK_PATH ON)

install(TARGETS senseloom LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT library NAMELINK_COMPONENT development)
install(TARGETS hardware aware_primary gesture LIBRARY DESTINATION ${platform_dir} COMPONENT library)
install(FILES LICENSE data/NOTICE TYPE DOC COMPONENT library) # the latter: what the gesture engine learned from

install(FILES include/senseloom.h include/senseloom.hpp TYPE INCLUDE COMPONENT development)
install(FILES docs/man/libsenseloom.3 DESTINATION ${CMAKE_INSTALL_MANDIR}/man3 COMPONENT development)
install(FILES docs/man/senseloom-options.7 DESTINATION ${CMAKE_INSTALL_MANDIR}/man7 COMPONENT development)
# What CMake and pkg-config find the library by. Both tell where it is from where they are, so an installed tree can be
# moved.
set(package_dir ${CMAKE_INSTALL_LIBDIR}/cmake/senseloom)
configure_package_config_file(
  cmake/senseloomConfig.cmake.in cmake/senseloomConfig.cmake
  INSTALL_DESTINATION ${package_dir}
  PATH_VARS CMAKE_INSTALL_INCLUDEDIR CMAKE_INSTALL_LIBDIR)
write_basic_package_version_file(cmake/senseloomConfigVersion.cmake COMPATIBILITY SameMajorVersion)
install(
  FILES ${PROJECT_BINARY_DIR}/cmake/senseloomConfig.cmake ${PROJECT_BINARY_DIR}/cmake/senseloomConfigVersion.cmake
  DESTINATION ${package_dir}
  COMPONENT development)
file(RELATIVE_PATH prefix_of_pc ${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig ${CMAKE_INSTALL_PREFIX})
configure_file(cmake/senseloom.pc.in cmake/senseloom.pc @ONLY)
install(
  FILES ${PROJECT_BINARY_DIR}/cmake/senseloom.pc
  DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig
  COMPONENT development)

install(TARGETS senseloom_cli RUNTIME COMPONENT tool)
install(TARGETS senseloom_recorder senseloom_audit LIBRARY DESTINATION ${platform_dir} COMPONENT tool)
install(FILES docs/man/senseloom.1 DESTINATION ${CMAKE_INSTALL_MANDIR}/man1 COMPONENT tool)
install(
  FILES tools/senseloom/completion.bash
  DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions
  RENAME senseloom
  COMPONENT tool)
install(FILES README.md CHANGELOG.md TYPE DOC COMPONENT tool)
install(
  DIRECTORY docs examples
  TYPE DOC
  COMPONENT tool
  PATTERN docs/man EXCLUDE)

# Debian packages, one a component, for the word size of the build: `cpack` in the build's folder.
set(CPACK_GENERATOR DEB)
set(CPACK_VERBATIM_VARIABLES ON)
set(CPACK_PACKAGE_VENDOR senseloom)
set(CPACK_PACKAGE_CONTACT "senseloom maintainers <maintainers@senseloom.example>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "context sensors shared by many clients")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_COMPONENTS_ALL library development tool)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
if(CMAKE_LIBRARY_ARCHITECTURE MATCHES "^i[3-6]86-")
  set(CPACK_DEBIAN_PACKAGE_ARCHITECTURE i386) # else the host's
endif()
# Dependencies are read off the programs: on each other exactly, on Debian's libraries from the version that has the
# symbols.
set(CPACK_DEBIAN_ENABLE_COMPONENT_DEPENDS ON)
set(CPACK_COMPONENT_DEVELOPMENT_DEPENDS library)
set(CPACK_COMPONENT_TOOL_DEPENDS library)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${CMAKE_LIBRARY_OUTPUT_DIRECTORY})
set(CPACK_DEBIAN_LIBRARY_PACKAGE_NAME libsenseloom${PROJECT_VERSION_MAJOR})
set(CPACK_DEBIAN_LIBRARY_PACKAGE_SECTION libs)
set(CPACK_COMPONENT_LIBRARY_DESCRIPTION "The shared library, and what stands in for the platform on a host.")
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME libsenseloom-dev)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_COMPONENT_DEVELOPMENT_DESCRIPTION "Headers for C and C++, and what pkg-config and CMake find them by.")
set(CPACK_DEBIAN_TOOL_PACKAGE_NAME senseloom)
set(CPACK_DEBIAN_TOOL_PACKAGE_SECTION utils)
set(CPACK_COMPONENT_TOOL_DESCRIPTION "The tool that replays, records and explains traces of the library's calls.")
include(CPack)
