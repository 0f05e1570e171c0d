# A quick complete build: the sources of a target are compiled together in a few files, and the standard library's
# headers once (see KestrumFolder). Off for developers: it hides a missing #include, which scripts/alone finds, and
# after a change of one file its neighbours are compiled again.
option(KESTRUM_JOINED "Compile the sources of each target together" OFF)

# GCC takes a joined source for a header, where a local type in a class would be an error.
if(KESTRUM_JOINED AND CMAKE_CXX_COMPILER_ID STREQUAL GNU)
    add_compile_options(-Wno-subobject-linkage)
endif()

set(joined_most 12) # more sources in one file leave one processor idle at the end

# kestrum_join(TARGET SEPARATE SOURCE... OWN NAME...): the named sources, those in the named folders, or all (".") stay
# separate. OWN: names of constants and functions that several sources define; each source gets its own.
function(kestrum_join target)
    cmake_parse_arguments(arg "" "" "SEPARATE;OWN" ${ARGN})
    if(NOT KESTRUM_JOINED OR arg_SEPARATE STREQUAL ".")
        return()
    endif()
    set_target_properties(${target} PROPERTIES UNITY_BUILD ON UNITY_BUILD_BATCH_SIZE ${joined_most})
    if(arg_OWN)
        set(code "#define KESTRUM_PASTED(a, b) a##b\n#define KESTRUM_OWN(a, b) KESTRUM_PASTED(a, b)\n")
        foreach(name IN LISTS arg_OWN)
            string(APPEND code "#undef ${name}\n#define ${name} KESTRUM_OWN(${name}, KESTRUM_SOURCE)\n")
        endforeach()
        set_target_properties(${target} PROPERTIES
            UNITY_BUILD_UNIQUE_ID KESTRUM_SOURCE UNITY_BUILD_CODE_BEFORE_INCLUDE "${code}")
    endif()
    get_target_property(sources ${target} SOURCES)
    foreach(source IN LISTS sources)
        get_filename_component(folder ${source} DIRECTORY)
        if(source IN_LIST arg_SEPARATE OR folder IN_LIST arg_SEPARATE)
            set_source_files_properties(${source} PROPERTIES SKIP_UNITY_BUILD_INCLUSION ON)
        endif()
    endforeach()
endfunction()
