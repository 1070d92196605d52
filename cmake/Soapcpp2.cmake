# zv_soapcpp2(CONTRACT OUTPUT IMPORT OPTION...): runs SOAPCPP2 on a contract file, with the folders of IMPORT before ":".
# It writes its files and ends with 0 even after some errors: what it says decides as well.
function(zv_soapcpp2 contract output import)
    execute_process(
        COMMAND ${SOAPCPP2} -1 -i -C -L -x ${ARGN} -I${import} -d${output} ${contract}
        RESULT_VARIABLE result OUTPUT_VARIABLE said ERROR_VARIABLE said)
    if(result OR NOT said MATCHES "Compilation successful" OR said MATCHES "\\*(WARNING|ERROR)\\*|[Ee]rror:")
        message(FATAL_ERROR "soapcpp2 does not accept the contract:\n${said}")
    endif()
endfunction()
