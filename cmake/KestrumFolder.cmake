# A folder of the source tree as a static library. It sees its own headers and those of the folders that it names, and
# no others.
#
#   kestrum_folder(core USES LogGenerator platform SOURCES KestrumModel.cpp)
#
# FOLDER gives the include prefix where it differs from the target's name (target platform_propertylist, headers
# <platform/propertylist/...>). HEADERS names this target's headers where another target has the rest of the folder.
find_package(Threads REQUIRED)

# Off for developers: a precompiled header hides a missing #include.
option(KESTRUM_PRECOMPILED "Compile the standard library's headers once" OFF)
set(standard_headers <algorithm> <array> <chrono> <cmath> <cstdint> <filesystem> <functional> <map> <memory> <optional>
    <span> <string> <string_view> <variant> <vector>)

function(kestrum_folder name)
    cmake_parse_arguments(arg "" "FOLDER" "USES;SOURCES;HEADERS;LIBRARIES" ${ARGN})
    if(NOT arg_FOLDER)
        set(arg_FOLDER ${name})
    endif()
    add_library(${name} STATIC ${arg_SOURCES})
    # An include root with only this folder's headers: <core/...> is found only by users of core, and
    # <platform/posix/...> not by users of platform.
    set(root ${CMAKE_BINARY_DIR}/roots/${name})
    file(REMOVE_RECURSE ${root})
    file(MAKE_DIRECTORY ${root}/${arg_FOLDER})
    set(headers ${arg_HEADERS})
    if(NOT headers)
        file(GLOB headers CONFIGURE_DEPENDS RELATIVE ${CMAKE_CURRENT_SOURCE_DIR} ${CMAKE_CURRENT_SOURCE_DIR}/*.h)
    endif()
    foreach(header IN LISTS headers)
        file(CREATE_LINK ${CMAKE_CURRENT_SOURCE_DIR}/${header} ${root}/${arg_FOLDER}/${header} SYMBOLIC)
    endforeach()
    target_include_directories(${name} PUBLIC ${root})
    # Libraries of the adapters are private: users of the folder do not see their headers.
    set(libraries PRIVATE ${arg_LIBRARIES})
    if(KESTRUM_VERIFY_HEADERS)
        list(TRANSFORM headers PREPEND ${root}/${arg_FOLDER}/)
        set_source_files_properties(${headers} PROPERTIES SKIP_AUTOMOC ON) # the originals have their own moc files
        target_sources(${name} PUBLIC FILE_SET HEADERS BASE_DIRS ${root} FILES ${headers})
        set_target_properties(${name} PROPERTIES VERIFY_INTERFACE_HEADER_SETS ON)
        set(libraries PUBLIC ${arg_LIBRARIES}) # headers are compiled with the libraries that the folder's users see
    endif()
    # The fuzzer follows paths through the product's code, not through a fuzz target or a test.
    if(KESTRUM_FUZZ)
        target_compile_options(${name} PRIVATE -fsanitize=fuzzer-no-link)
    endif()
    foreach(lower IN LISTS arg_USES)
        if(NOT TARGET ${lower})
            message(FATAL_ERROR "${name} uses ${lower}, which does not stand below it")
        endif()
        target_link_libraries(${name} PUBLIC ${lower})
    endforeach()
    # A precompiled header needs equal options everywhere, and adapters are compiled with their libraries' options.
    if(KESTRUM_PRECOMPILED AND name STREQUAL support)
        target_precompile_headers(support PRIVATE ${standard_headers})
    elseif(KESTRUM_PRECOMPILED AND NOT arg_LIBRARIES)
        target_precompile_headers(${name} REUSE_FROM support)
    endif()
    target_link_libraries(${name} ${libraries})
endfunction()
