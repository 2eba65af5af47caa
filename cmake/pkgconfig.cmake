include(GNUInstallDirs)

# Installs the pkg-config file of a library of the same name. CFLAGS and LIBS are what hosts need
# besides its headers and the library itself.
function(dcm_install_pkgconfig name)
    cmake_parse_arguments(PARSE_ARGV 1 arg "" "DESCRIPTION;CFLAGS;LIBS" "")
    set(prefix ${CMAKE_INSTALL_PREFIX})
    if(NOT prefix STREQUAL "/usr")
        # The prefix is relative to the file, so that the installed tree can be moved.
        file(RELATIVE_PATH prefix ${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig ${CMAKE_INSTALL_PREFIX})
        string(REGEX REPLACE "/$" "" prefix "\${pcfiledir}/${prefix}")
    endif()
    configure_file(${PROJECT_SOURCE_DIR}/cmake/library.pc.in ${PROJECT_BINARY_DIR}/${name}.pc @ONLY)
    install(FILES ${PROJECT_BINARY_DIR}/${name}.pc
        DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT Development)
endfunction()
