# Warnings every target of ours compiles with; VORLAN_WARNINGS_AS_ERRORS (on in the presets CI
# builds) makes them errors.
option(VORLAN_WARNINGS_AS_ERRORS "Treat compiler warnings as errors" OFF)

function(vorlan_warnings target)
  target_compile_options(${target} PRIVATE
    $<$<COMPILE_LANGUAGE:CXX>:-Wall -Wextra -Wnon-virtual-dtor -Woverloaded-virtual>
    $<$<COMPILE_LANGUAGE:C>:-Wall -Wextra>
    $<$<BOOL:${VORLAN_WARNINGS_AS_ERRORS}>:-Werror>)
endfunction()
