# The settings that all targets of the project share.
include(${CMAKE_CURRENT_LIST_DIR}/compiler.cmake)

function(dcm_set_up target)
    target_compile_features(${target} PUBLIC cxx_std_20)
    set_target_properties(${target} PROPERTIES CXX_EXTENSIONS OFF)
    target_compile_options(${target} PRIVATE ${dcm_warnings} ${dcm_no_wrong_warnings})
endfunction()
