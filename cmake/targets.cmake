# Warnings and sanitizers, as targets that every target of ours links.
add_library(tallowfen_warnings INTERFACE)
target_compile_options(tallowfen_warnings INTERFACE
    -Wall -Wextra -Wshadow -Wconversion -Wsign-conversion -Wsuggest-override -Wnon-virtual-dtor
    $<$<BOOL:${TALLOWFEN_WERROR}>:-Werror>)

add_library(tallowfen_sanitizers INTERFACE)
if(TALLOWFEN_SANITIZE)
    target_compile_options(tallowfen_sanitizers INTERFACE
        -fsanitize=${TALLOWFEN_SANITIZE} -fno-omit-frame-pointer -fno-sanitize-recover=all)
    target_link_options(tallowfen_sanitizers INTERFACE -fsanitize=${TALLOWFEN_SANITIZE})
endif()
if(TALLOWFEN_COVERAGE)
    target_compile_options(tallowfen_sanitizers INTERFACE --coverage)
    target_link_options(tallowfen_sanitizers INTERFACE --coverage)
endif()

# What every target above the engine is built with.
add_library(tallowfen_qt INTERFACE)
target_compile_definitions(tallowfen_qt INTERFACE
    QT_NO_CAST_FROM_ASCII QT_NO_CAST_TO_ASCII QT_NO_URL_CAST_FROM_STRING QT_NO_FOREACH)

add_library(tallowfen_common INTERFACE)
target_link_libraries(tallowfen_common INTERFACE tallowfen_warnings tallowfen_sanitizers)

# tallowfen_share_headers(TARGETS... HEADERS headers...): with TALLOWFEN_PCH the first target compiles the headers ahead,
# and the others take them from it. All must be built with the same options.
function(tallowfen_share_headers)
    cmake_parse_arguments(S "" "" "HEADERS" ${ARGN})
    if(NOT TALLOWFEN_PCH)
        return()
    endif()
    list(POP_FRONT S_UNPARSED_ARGUMENTS first)
    target_precompile_headers(${first} PRIVATE ${S_HEADERS})
    foreach(target IN LISTS S_UNPARSED_ARGUMENTS)
        target_precompile_headers(${target} REUSE_FROM ${first})
    endforeach()
endfunction()
