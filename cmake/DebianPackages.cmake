# Debian packages of the four components, for CPack. scripts/package configures such a build, and makes them.
set(QORVIO_MAINTAINER "The QorVIO authors <authors@qorvio.invalid>" CACHE STRING "Who answers for the packages")
set(release 1)
set(about "A debug core inside an FPGA has inputs and outputs for a host program:
inputs whose values and activity it can watch, outputs that it can drive,
over JTAG.")

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME qorvio)
set(CPACK_PACKAGE_CONTACT ${QORVIO_MAINTAINER})
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS
    OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)
set(CPACK_COMPONENTS_ALL libqorvio libqorvio-dev qorvio python3-qorvio)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_RELEASE ${release})
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)

set(CPACK_DEBIAN_LIBQORVIO_PACKAGE_NAME libqorvio)
set(CPACK_DEBIAN_LIBQORVIO_PACKAGE_SECTION libs)
set(CPACK_DEBIAN_LIBQORVIO_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${CMAKE_LIBRARY_OUTPUT_DIRECTORY})
set(CPACK_DEBIAN_LIBQORVIO_PACKAGE_CONTROL_EXTRA ${PROJECT_BINARY_DIR}/triggers ${PROJECT_BINARY_DIR}/shlibs)
set(CPACK_COMPONENT_LIBQORVIO_DESCRIPTION "${about}

This package contains the shared libraries, a simulated board among them.")

set(CPACK_DEBIAN_LIBQORVIO-DEV_PACKAGE_NAME libqorvio-dev)
set(CPACK_DEBIAN_LIBQORVIO-DEV_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_LIBQORVIO-DEV_PACKAGE_DEPENDS "libqorvio (= ${PROJECT_VERSION}-${release})")
set(CPACK_COMPONENT_LIBQORVIO-DEV_DESCRIPTION "${about}

This package contains the headers, and what CMake and pkg-config need.")

set(CPACK_DEBIAN_QORVIO_PACKAGE_NAME qorvio)
set(CPACK_DEBIAN_QORVIO_PACKAGE_SECTION electronics)
set(CPACK_DEBIAN_QORVIO_PACKAGE_SHLIBDEPS ON)
# A cable starts or reaches one, when its URL says so.
set(CPACK_DEBIAN_LIBQORVIO_PACKAGE_SUGGESTS "openocd")
set(CPACK_DEBIAN_QORVIO_PACKAGE_DEPENDS "libqorvio (= ${PROJECT_VERSION}-${release})")
set(CPACK_COMPONENT_QORVIO_DESCRIPTION "${about}

This package contains the command line.")

set(CPACK_DEBIAN_PYTHON3-QORVIO_PACKAGE_NAME python3-qorvio)
set(CPACK_DEBIAN_PYTHON3-QORVIO_PACKAGE_SECTION python)
set(CPACK_DEBIAN_PYTHON3-QORVIO_PACKAGE_SHLIBDEPS ON)
math(EXPR next_python "${Python_VERSION_MINOR} + 1")
set(CPACK_DEBIAN_PYTHON3-QORVIO_PACKAGE_DEPENDS "libqorvio (= ${PROJECT_VERSION}-${release}), python3 (>= 3.${Python_VERSION_MINOR}), \
python3 (<< 3.${next_python}), python3-numpy")
set(CPACK_DEBIAN_PYTHON3-QORVIO_PACKAGE_RECOMMENDS "qorvio")
set(CPACK_DEBIAN_PYTHON3-QORVIO_PACKAGE_SUGGESTS "python3-pandas, python3-matplotlib, python3-pytest, labgrid")
set(CPACK_DEBIAN_PYTHON3-QORVIO_PACKAGE_CONTROL_EXTRA ${PROJECT_BINARY_DIR}/python/postinst ${PROJECT_BINARY_DIR}/python/prerm)
set(CPACK_COMPONENT_PYTHON3-QORVIO_DESCRIPTION "${about}

This package holds the module for Python 3, a plugin for pytest, and resources
and drivers for labgrid.")
set(script_permissions FILE_PERMISSIONS OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)
file(WRITE ${PROJECT_BINARY_DIR}/python/postinst "#!/bin/sh\nset -e\nif [ \"$1\" = configure ]; then py3compile -p python3-qorvio; fi\n")
file(WRITE ${PROJECT_BINARY_DIR}/python/prerm "#!/bin/sh\nset -e\npy3clean -p python3-qorvio\n")
file(CHMOD ${PROJECT_BINARY_DIR}/python/postinst ${PROJECT_BINARY_DIR}/python/prerm ${script_permissions})

file(WRITE ${PROJECT_BINARY_DIR}/triggers "activate-noawait ldconfig\n")
set(shlibs "")
foreach(library QorBoard QorCore QorJtag QorUtil QorVIO)
  string(APPEND shlibs "lib${library} ${PROJECT_VERSION_MAJOR} libqorvio (>= ${PROJECT_VERSION})\n")
endforeach()
file(WRITE ${PROJECT_BINARY_DIR}/shlibs "${shlibs}")

# What every Debian package brings: its licence, and two changelogs.
string(TIMESTAMP date "%a, %d %b %Y %H:%M:%S +0000" UTC)
file(WRITE ${PROJECT_BINARY_DIR}/changelog.Debian "qorvio (${PROJECT_VERSION}-${release}) unstable; urgency=medium

  * Release ${PROJECT_VERSION}.

 -- ${QORVIO_MAINTAINER}  ${date}
")
file(COPY_FILE ${PROJECT_SOURCE_DIR}/CHANGELOG.md ${PROJECT_BINARY_DIR}/changelog)
execute_process(COMMAND gzip -9nfk changelog changelog.Debian
                WORKING_DIRECTORY ${PROJECT_BINARY_DIR} COMMAND_ERROR_IS_FATAL ANY)
foreach(component ${CPACK_COMPONENTS_ALL})
  set(documents DESTINATION ${CMAKE_INSTALL_DATAROOTDIR}/doc/${component} COMPONENT ${component})
  install(FILES ${PROJECT_SOURCE_DIR}/LICENSE RENAME copyright ${documents})
  install(FILES ${PROJECT_BINARY_DIR}/changelog.gz ${PROJECT_BINARY_DIR}/changelog.Debian.gz ${documents})
endforeach()

include(CPack)
