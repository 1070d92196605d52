# Runs soapcpp2, which writes its files and ends with 0 even after some errors: its output decides as well.
execute_process(
    COMMAND ${SOAPCPP2} -1 -i -C -L -x -w -I${IMPORT} -d${OUTPUT} ${CONTRACT}
    RESULT_VARIABLE result OUTPUT_VARIABLE output ERROR_VARIABLE output)
if(result OR NOT output MATCHES "Compilation successful" OR output MATCHES "\\*(WARNING|ERROR)\\*|[Ee]rror:")
    message(FATAL_ERROR "soapcpp2 does not accept the contract:\n${output}")
endif()
