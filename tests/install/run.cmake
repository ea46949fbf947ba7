# Runs a command; what it prints is in ${output}. Ends the test when it fails.
function(run)
    execute_process(COMMAND ${ARGV} RESULT_VARIABLE result OUTPUT_VARIABLE output
                    ERROR_VARIABLE output)
    if(NOT result EQUAL 0)
        message(FATAL_ERROR "${ARGV} failed:\n${output}")
    endif()
    set(output "${output}" PARENT_SCOPE)
endfunction()
