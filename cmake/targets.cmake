# What all targets of the project have in common.
function(dcm_set_up target)
    target_compile_features(${target} PUBLIC cxx_std_20)
    set_target_properties(${target} PROPERTIES CXX_EXTENSIONS OFF)
    target_compile_options(${target} PRIVATE -Wall -Wextra -Wpedantic -Wconversion -Wshadow
                           $<$<BOOL:${DCM_WERROR}>:-Werror>)
    # At -O3 g++ 12 takes moves within its own std::string for overlapping copies.
    if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
        target_compile_options(${target} PRIVATE -Wno-restrict)
    endif()
endfunction()

# Keeps of the listed files those that exist, and names the others.
function(dcm_keep_existing list)
    set(kept)
    set(missing)
    foreach(file IN LISTS ${list})
        if(EXISTS "${CMAKE_CURRENT_SOURCE_DIR}/${file}")
            list(APPEND kept "${file}")
        else()
            list(APPEND missing "${file}")
        endif()
    endforeach()
    if(missing)
        message(STATUS "dcm: not there yet: ${missing}")
    endif()
    set(${list} "${kept}" PARENT_SCOPE)
endfunction()
