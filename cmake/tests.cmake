# tallowfen_add_test(NAME name LABEL label... [TIMEOUT seconds] [COST seconds] COMMAND ...): one CTest entry with the
# environment that every test gets, which is no user's language. COST is for one that takes long: it starts ahead of the
# others, which run beside it. The target tests_LABEL builds what the tests of that label start.
function(tallowfen_add_test)
    cmake_parse_arguments(T "" "NAME;TIMEOUT;COST" "LABEL;COMMAND" ${ARGN})
    add_test(NAME ${T_NAME} COMMAND ${T_COMMAND})
    if(NOT T_TIMEOUT)
        set(T_TIMEOUT 300)
    endif()
    set_tests_properties(${T_NAME} PROPERTIES
        LABELS "${T_LABEL}" TIMEOUT ${T_TIMEOUT}
        ENVIRONMENT "TALLOWFEN_HIVES=${TALLOWFEN_HIVES};QT_QPA_PLATFORM=offscreen;LANGUAGE=;LC_ALL=C.UTF-8;TSAN_OPTIONS=ignore_noninstrumented_modules=1 halt_on_error=1;ASAN_OPTIONS=detect_leaks=1:exitcode=99")
    if(T_COST)
        set_tests_properties(${T_NAME} PROPERTIES COST ${T_COST})
    endif()
    foreach(label IN LISTS T_LABEL)
        if(NOT TARGET tests_${label})
            add_custom_target(tests_${label})
        endif()
        foreach(word IN LISTS T_COMMAND)
            string(REGEX REPLACE "^\\$<TARGET_FILE:(.*)>$" "\\1" word "${word}")
            if(TARGET ${word})
                add_dependencies(tests_${label} ${word})
            endif()
        endforeach()
    endforeach()
endfunction()

# tallowfen_add_moc(TARGET): makes the file TARGET.moc that TARGET.cpp includes at its end. CMake's own way costs each
# program three steps more of the build.
function(tallowfen_add_moc target)
    qt6_generate_moc(${target}.cpp ${target}.moc TARGET ${target})
    target_sources(${target} PRIVATE ${CMAKE_CURRENT_BINARY_DIR}/${target}.moc)
    target_include_directories(${target} PRIVATE ${CMAKE_CURRENT_BINARY_DIR})
endfunction()
