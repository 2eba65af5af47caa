# The system that is built for. Another one is a new case here and wherever these two are asked about.
# CMake before 3.25 does not set LINUX itself.
if(CMAKE_SYSTEM_NAME STREQUAL "Linux")
    set(LINUX TRUE)
endif()
if(NOT LINUX AND NOT WIN32)
    message(FATAL_ERROR "dcm is for Linux and Windows, not for ${CMAKE_SYSTEM_NAME}.")
endif()
if(LINUX AND CMAKE_SIZEOF_VOID_P EQUAL 4)
    # There too a file may be too large to be read, and must be refused as such.
    add_compile_definitions(_FILE_OFFSET_BITS=64)
endif()
