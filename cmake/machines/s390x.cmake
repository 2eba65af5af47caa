set(CMAKE_SYSTEM_PROCESSOR s390x)
set(triplet s390x-linux-gnu)
include(${CMAKE_CURRENT_LIST_DIR}/debian_cross.cmake)
set(CMAKE_CROSSCOMPILING_EMULATOR qemu-s390x;-L;/usr/${triplet})
# The emulator has the locales of a little-endian machine.
set(DCM_TEST_NO_LOCALES TRUE)
