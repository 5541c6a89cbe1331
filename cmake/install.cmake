# Installation, and what other projects find the library by. Debian packages are made of the components: see packaging/.

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
# Every function that the page names has a page that leads to it.
file(STRINGS docs/man/libsenseloom.3 synopses REGEX "^[a-z_0-9]+ \\*?[A-Za-z_]+\\(")
foreach(synopsis IN LISTS synopses)
  string(REGEX REPLACE "^[a-z_0-9]+ \\*?([A-Za-z_]+)\\(.*" "\\1" function "${synopsis}")
  file(CONFIGURE OUTPUT man3/${function}.3 CONTENT ".so man3/libsenseloom.3\n")
  install(
    FILES ${PROJECT_BINARY_DIR}/man3/${function}.3
    DESTINATION ${CMAKE_INSTALL_MANDIR}/man3
    COMPONENT development)
endforeach()
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
install(TARGETS senseloom_recorder senseloom_audit LIBRARY DESTINATION ${platform_dir} COMPONENT recorder)
install(FILES docs/man/senseloom.1 DESTINATION ${CMAKE_INSTALL_MANDIR}/man1 COMPONENT tool)
function(install_completion file folder name)
  install(
    FILES tools/senseloom/completion/${file}
    DESTINATION ${CMAKE_INSTALL_DATADIR}/${folder}
    RENAME ${name}
    COMPONENT tool)
endfunction()
install_completion(senseloom.bash bash-completion/completions senseloom)
install_completion(senseloom.zsh zsh/vendor-completions _senseloom)
install_completion(senseloom.fish fish/vendor_completions.d senseloom.fish)
# The pages and what they lead to, laid out as here.
install(FILES README.md CHANGELOG.md CONTRIBUTING.md SECURITY.md TYPE DOC COMPONENT tool)
install(
  DIRECTORY docs examples
  TYPE DOC
  COMPONENT tool
  PATTERN docs/man EXCLUDE
  PATTERN Doxyfile EXCLUDE)
foreach(file platform/README.md data/README.md data/activity/decisions.csv bench/README.md bench/count/counts.txt)
  get_filename_component(folder ${file} DIRECTORY)
  install(
    FILES ${file}
    DESTINATION ${CMAKE_INSTALL_DOCDIR}/${folder}
    COMPONENT tool)
endforeach()
