# How hand-written code is compiled: link zv_compile (PRIVATE) to every target of this project.
set(ZV_SANITIZE "" CACHE STRING "Sanitizers for the whole build, as -fsanitize= takes them")

add_library(zv_compile INTERFACE)
target_compile_options(zv_compile INTERFACE -Wall -Wextra)
if(CMAKE_CXX_COMPILER_ID STREQUAL "Clang")
    target_compile_options(zv_compile INTERFACE -Wthread-safety -Werror=thread-safety)
endif()

# __FILE__ reads relative to the repository root ("./Private/CacheMgr.cpp"), in assertions too.
add_compile_options(-ffile-prefix-map=${PROJECT_SOURCE_DIR}/=./)

if(ZV_SANITIZE)
    add_compile_options(-fsanitize=${ZV_SANITIZE} -fno-omit-frame-pointer -fno-sanitize-recover=all)
    add_link_options(-fsanitize=${ZV_SANITIZE})
    add_compile_definitions(ZV_SANITIZED)  # for tests that measure: sanitizers keep what is freed
endif()
# Assertions stay in every build type.
string(REPLACE "-DNDEBUG" "" CMAKE_CXX_FLAGS_RELWITHDEBINFO "${CMAKE_CXX_FLAGS_RELWITHDEBINFO}")
string(REPLACE "-DNDEBUG" "" CMAKE_CXX_FLAGS_RELEASE "${CMAKE_CXX_FLAGS_RELEASE}")
