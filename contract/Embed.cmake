# Writes OUTPUT, the source text that defines ContractFiles() with the content of FILES.
set(rows "")
foreach(file ${FILES})
    get_filename_component(name ${file} NAME)
    file(READ ${file} text)
    string(APPEND rows "        {\"${name}\", R\"~~~(${text})~~~\"},\n")
endforeach()
file(WRITE ${OUTPUT} "#include \"ContractFiles.h\"

const std::map<std::string, std::string>& ContractFiles()
{
    static const std::map<std::string, std::string> files = {
${rows}    };
    return files;
}
")
