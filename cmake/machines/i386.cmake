# Its programs run on x86-64 as they are, with the libraries of the cross compiler.
set(CMAKE_SYSTEM_PROCESSOR i686)
set(triplet i686-linux-gnu)
include(${CMAKE_CURRENT_LIST_DIR}/debian_cross.cmake)
set(CMAKE_EXE_LINKER_FLAGS_INIT
    "-Wl,--dynamic-linker=/usr/${triplet}/lib/ld-linux.so.2 -Wl,-rpath,/usr/${triplet}/lib")
