# Debian packages by CPack: libdcm1 to run hosts, libdcm-dev to build them, dcm-tools with the program,
# python3-dcm with the Python module. scripts/package builds and checks them.
set(DCM_DEBIAN_REVISION 1 CACHE STRING "Revision of the Debian packages")
set(DCM_DEBIAN_MAINTAINER "The dcm project <dcm@dcm.invalid>" CACHE STRING
    "Maintainer of the Debian packages")

include(GNUInstallDirs)

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME dcm)
set(CPACK_PACKAGE_VERSION ${PROJECT_VERSION})
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_COMPONENTS_ALL Runtime Development Tools Python)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_STRIP_FILES ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_RELEASE ${DCM_DEBIAN_REVISION})
set(CPACK_DEBIAN_PACKAGE_MAINTAINER ${DCM_DEBIAN_MAINTAINER})
set(CPACK_DEBIAN_COMPRESSION_TYPE xz)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)

set(runtime libdcm${PROJECT_VERSION_MAJOR})
set(text "This library reads and writes calibration data files in the DCM text
format: single values, texts, value blocks, axis point distributions,
curves and maps of control units.

This package contains")

set(CPACK_DEBIAN_RUNTIME_PACKAGE_NAME ${runtime})
set(CPACK_DEBIAN_RUNTIME_PACKAGE_SECTION libs)
set(CPACK_COMPONENT_RUNTIME_DESCRIPTION "${text} the shared library.")
set(CPACK_DEBIAN_RUNTIME_PACKAGE_SHLIBDEPS ON)
file(WRITE ${PROJECT_BINARY_DIR}/debian/shlibs
    "libdcm ${PROJECT_VERSION_MAJOR} ${runtime} (>= ${PROJECT_VERSION})\n")
file(WRITE ${PROJECT_BINARY_DIR}/debian/triggers "activate-noawait ldconfig\n")
set(CPACK_DEBIAN_RUNTIME_PACKAGE_CONTROL_EXTRA
    ${PROJECT_BINARY_DIR}/debian/shlibs ${PROJECT_BINARY_DIR}/debian/triggers)

set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME libdcm-dev)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_COMPONENT_DEVELOPMENT_DESCRIPTION "${text} what hosts are built with: the headers, the
CMake package and the pkg-config file.")
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_DEPENDS
    "${runtime} (= ${PROJECT_VERSION}-${DCM_DEBIAN_REVISION})")

set(CPACK_DEBIAN_TOOLS_PACKAGE_NAME dcm-tools)
set(CPACK_DEBIAN_TOOLS_PACKAGE_SECTION utils)
set(CPACK_COMPONENT_TOOLS_DESCRIPTION "${text} the program dcm, which shows, checks, compares,
merges and converts such files.")
# The library is found where it was built, which tells nothing of its package.
set(CPACK_DEBIAN_TOOLS_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${PROJECT_BINARY_DIR}/dcm)
set(CPACK_DEBIAN_TOOLS_PACKAGE_DEPENDS "${runtime} (>= ${PROJECT_VERSION})")

set(CPACK_DEBIAN_PYTHON_PACKAGE_NAME python3-dcm)
set(CPACK_DEBIAN_PYTHON_PACKAGE_SECTION python)
set(CPACK_COMPONENT_PYTHON_DESCRIPTION "${text} the Python module dcm, with values as numpy
arrays.")
set(CPACK_DEBIAN_PYTHON_PACKAGE_SHLIBDEPS ON)
# The compiled part is that of one version of Python.
set(CPACK_DEBIAN_PYTHON_PACKAGE_DEPENDS "${runtime} (>= ${PROJECT_VERSION}), python3-numpy, \
python3 (>= ${DCM_PYTHON_VERSION}), python3 (<< ${DCM_PYTHON_NEXT_VERSION})")
set(CPACK_DEBIAN_PYTHON_PACKAGE_SUGGESTS "python3-pandas, python3-matplotlib, python3-distributed")

# The documents that every Debian package has.
string(TIMESTAMP DCM_DEBIAN_DATE "%a, %d %b %Y %H:%M:%S +0000" UTC)
set(documents ${PROJECT_BINARY_DIR}/debian)
configure_file(cmake/debian/changelog.in ${documents}/changelog.Debian @ONLY)
execute_process(COMMAND gzip -9nc ${documents}/changelog.Debian
    OUTPUT_FILE ${documents}/changelog.Debian.gz COMMAND_ERROR_IS_FATAL ANY)
execute_process(COMMAND gzip -9nc ${PROJECT_SOURCE_DIR}/CHANGELOG.md
    OUTPUT_FILE ${documents}/changelog.gz COMMAND_ERROR_IS_FATAL ANY)
# The licence, without its title and its line of copyright, as a field of the copyright file.
file(READ LICENSE license)
string(REGEX REPLACE "^.*\n(Permission is .*)\n$" "\\1" license "${license}")
string(REPLACE "\n\n" "\n.\n" license "${license}")
string(REPLACE "\n" "\n " license " ${license}")
configure_file(cmake/debian/copyright.in ${documents}/copyright @ONLY)
foreach(component Runtime Development Tools Python)
    string(TOUPPER ${component} name)
    install(FILES ${documents}/changelog.gz ${documents}/changelog.Debian.gz
            ${documents}/copyright
        DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/${CPACK_DEBIAN_${name}_PACKAGE_NAME}
        COMPONENT ${component})
endforeach()

include(CPack)
