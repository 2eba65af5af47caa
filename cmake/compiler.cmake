# What a compiler is told in its own words. Another compiler builds with its defaults.
if(CMAKE_CXX_COMPILER_ID MATCHES "^(GNU|Clang)$")
    set(dcm_warnings -Wall -Wextra -Wpedantic -Wconversion -Wshadow)
    if(DCM_WERROR)
        list(APPEND dcm_warnings -Werror)
    endif()
    # At -O3 g++ 12 warns wrongly of overlapping copies in its own std::string.
    if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
        set(dcm_no_wrong_warnings -Wno-restrict)
    endif()
    # A call of the library's own functions never reaches a function of that name in a host.
    set(dcm_call_own_functions -fno-semantic-interposition)
    # The C++ runtime becomes a part of the program or DLL.
    set(dcm_contain_runtime -static)
    if(BUILD_SHARED_LIBS AND MINGW AND CMAKE_SIZEOF_VOID_P EQUAL 4)
        # There an exception reaches a host only if it and the DLL share the DLLs of the runtime.
        foreach(name libgcc_s_dw2-1.dll libgcc_s_sjlj-1.dll libstdc++-6.dll libwinpthread-1.dll)
            execute_process(COMMAND ${CMAKE_CXX_COMPILER} -print-file-name=${name}
                OUTPUT_VARIABLE path OUTPUT_STRIP_TRAILING_WHITESPACE)
            # A compiler has one of the first two.
            if(EXISTS ${path})
                list(APPEND dcm_runtime_dlls ${path})
            endif()
        endforeach()
    else()
        set(dcm_contain_runtime_of_hosts ${dcm_contain_runtime})
    endif()
    # A Windows program begins at wmain.
    set(dcm_wide_entry -municode)
else()
    message(STATUS "dcm: ${CMAKE_CXX_COMPILER_ID} was not tried, it compiles with its defaults")
endif()
