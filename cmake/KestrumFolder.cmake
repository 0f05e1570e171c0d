# A folder of the source tree as a static library. It sees its own headers and those of the folders that it names, and
# no others.
#
#   kestrum_folder(core USES LogGenerator platform SOURCES KestrumModel.cpp)
#
# FOLDER gives the include prefix where it differs from the target's name (target platform_propertylist, headers
# <platform/propertylist/...>). HEADERS names this target's headers where another target has the rest of the folder.
# SEPARATE and OWN are for the joined build: see KestrumJoin.
find_package(Threads REQUIRED)
include(KestrumJoin)

set(standard_headers <algorithm> <array> <chrono> <cmath> <cstdint> <filesystem> <functional> <map> <memory> <optional>
    <span> <string> <string_view> <variant> <vector>)

function(kestrum_folder name)
    cmake_parse_arguments(arg "" "FOLDER" "USES;SOURCES;HEADERS;LIBRARIES;SEPARATE;OWN" ${ARGN})
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
    # The fuzzer follows paths through the product's code, not through a fuzz target or a test.
    if(KESTRUM_FUZZ)
        target_compile_options(${name} PRIVATE -fsanitize=fuzzer-no-link)
    endif()
    # Adapters to Qt wait more than they compute, and the sanitizers' code takes long to optimise.
    if(KESTRUM_SANITIZE AND arg_LIBRARIES MATCHES Qt6)
        target_compile_options(${name} PRIVATE -O0)
    endif()
    foreach(lower IN LISTS arg_USES)
        if(NOT TARGET ${lower})
            message(FATAL_ERROR "${name} uses ${lower}, which does not stand below it")
        endif()
        target_link_libraries(${name} PUBLIC ${lower})
    endforeach()
    # Libraries of the adapters are private: users of the folder do not see their headers.
    target_link_libraries(${name} PRIVATE ${arg_LIBRARIES})
    kestrum_join(${name} SEPARATE ${arg_SEPARATE} OWN ${arg_OWN})
    # A precompiled header needs equal options everywhere, and adapters are compiled with their libraries' options.
    if(KESTRUM_JOINED AND name STREQUAL support)
        target_precompile_headers(support PRIVATE ${standard_headers})
    elseif(KESTRUM_JOINED AND NOT arg_LIBRARIES)
        target_precompile_headers(${name} REUSE_FROM support)
    endif()
endfunction()
