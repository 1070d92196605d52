# How hand-written code is compiled: link zv_compile (PRIVATE) to every target of this project.
set(ZV_SANITIZE "" CACHE STRING "Sanitizers for the whole build, as -fsanitize= takes them")

add_library(zv_compile INTERFACE)
target_compile_options(zv_compile INTERFACE -Wall -Wextra)
if(CMAKE_CXX_COMPILER_ID STREQUAL "Clang")
    target_compile_options(zv_compile INTERFACE -Wthread-safety -Werror=thread-safety)
endif()

# The rooms of the client's two halves, each importing only from those before it.
set(ZV_PRIVATE_ROOMS foundation transport records services cache settings calls)
set(ZV_SAMPLE_ROOMS glue bridge host)

# __FILE__ reads relative to the repository root, without the room ("./Private/CacheMgr.cpp"), in assertions too. The last
# map that fits counts. Debuggers see where files are.
add_compile_options(-fdebug-prefix-map=${PROJECT_SOURCE_DIR}/=./ -fmacro-prefix-map=${PROJECT_SOURCE_DIR}/=./)
foreach(room ${ZV_PRIVATE_ROOMS})
    add_compile_options(-fmacro-prefix-map=${PROJECT_SOURCE_DIR}/Private/${room}/=./Private/)
endforeach()
set(sample Sample/ZVStagecraft/Private)
foreach(room ${ZV_SAMPLE_ROOMS})
    add_compile_options(-fmacro-prefix-map=${PROJECT_SOURCE_DIR}/${sample}/${room}/=./${sample}/)
endforeach()

if(ZV_SANITIZE)
    add_compile_options(-fsanitize=${ZV_SANITIZE} -fno-omit-frame-pointer -fno-sanitize-recover=all)
    add_link_options(-fsanitize=${ZV_SANITIZE})
    add_compile_definitions(ZV_SANITIZED)  # for tests that measure: sanitizers keep what is freed
endif()
# Assertions stay in every build type.
string(REPLACE "-DNDEBUG" "" CMAKE_CXX_FLAGS_RELWITHDEBINFO "${CMAKE_CXX_FLAGS_RELWITHDEBINFO}")
string(REPLACE "-DNDEBUG" "" CMAKE_CXX_FLAGS_RELEASE "${CMAKE_CXX_FLAGS_RELEASE}")

# A time, in seconds, that is certainly over on every device. The same sources build the same library.
set(ZV_BUILD_TIME "$ENV{SOURCE_DATE_EPOCH}")
if(NOT ZV_BUILD_TIME)
    execute_process(COMMAND git log -1 --format=%ct WORKING_DIRECTORY ${PROJECT_SOURCE_DIR}
        OUTPUT_VARIABLE ZV_BUILD_TIME OUTPUT_STRIP_TRAILING_WHITESPACE ERROR_QUIET)
endif()
if(NOT ZV_BUILD_TIME MATCHES "^[0-9]+$")
    string(TIMESTAMP ZV_BUILD_TIME "%s" UTC)
endif()
