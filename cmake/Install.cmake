# What `cmake --install` puts where. The tree can be moved: nothing in it contains an absolute path. Two components:
# libqorvio to run a host program, libqorvio-dev to build one.
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)

set(qor_headers ${CMAKE_INSTALL_INCLUDEDIR}/qorvio)
set(qor_config ${CMAKE_INSTALL_LIBDIR}/cmake/QorVIO)
file(RELATIVE_PATH to_headers ${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig ${CMAKE_INSTALL_FULL_INCLUDEDIR}/qorvio)

# qor_install(TARGET DESCRIPTION [REQUIRES TARGET...] [FOLDER NAME] HEADERS FILE...): with a folder, headers keep their
# paths, in that folder.
function(qor_install target description)
  cmake_parse_arguments(arg "" "FOLDER" "REQUIRES;HEADERS" ${ARGN})
  set_target_properties(${target} PROPERTIES INSTALL_RPATH "$ORIGIN")
  target_include_directories(${target} INTERFACE $<INSTALL_INTERFACE:${qor_headers}>)
  install(TARGETS ${target} EXPORT QorVIO LIBRARY
          DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT libqorvio NAMELINK_COMPONENT libqorvio-dev)
  foreach(header ${arg_HEADERS})
    set(folder "")
    if(arg_FOLDER)
      get_filename_component(folder ${arg_FOLDER}/${header} DIRECTORY)
    endif()
    install(FILES ${header} DESTINATION ${qor_headers}/${folder} COMPONENT libqorvio-dev)
  endforeach()

  string(TOLOWER "${arg_REQUIRES}" requires)
  list(JOIN requires ", " requires)
  string(TOLOWER ${target} package)
  configure_file(${PROJECT_SOURCE_DIR}/cmake/package.pc.in ${PROJECT_BINARY_DIR}/pkgconfig/${package}.pc @ONLY)
  install(FILES ${PROJECT_BINARY_DIR}/pkgconfig/${package}.pc
          DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT libqorvio-dev)
endfunction()

# The CMake package, once every target is there.
function(qor_install_config)
  set(version_file ${PROJECT_BINARY_DIR}/QorVIOConfigVersion.cmake)
  write_basic_package_version_file(${version_file} COMPATIBILITY SameMinorVersion)
  install(FILES ${version_file} DESTINATION ${qor_config} COMPONENT libqorvio-dev)
  install(EXPORT QorVIO FILE QorVIOConfig.cmake NAMESPACE QorVIO::
          DESTINATION ${qor_config} COMPONENT libqorvio-dev)
endfunction()
