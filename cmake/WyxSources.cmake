# wyx_layer_sources(var dir): the .cpp files of one folder (not recursive). New
# files are picked up at the next build without editing any CMakeLists.
function(wyx_layer_sources var dir)
    file(GLOB _src CONFIGURE_DEPENDS ${dir}/*.cpp)
    set(${var} ${_src} PARENT_SCOPE)
endfunction()

# wyx_layer(name dir KIND STATIC|SHARED LIBS ...): one library per layer. The
# include root is the repository, so code says #include "data/JobRecord.h".
# A shared layer is installed with the programs that load it.
function(wyx_layer name dir)
    cmake_parse_arguments(L "" "KIND" "LIBS" ${ARGN})
    wyx_layer_sources(_src ${dir})
    if(NOT _src)
        # A layer whose first sources have not been written yet: headers only.
        add_library(${name} INTERFACE)
        target_include_directories(${name} INTERFACE ${PROJECT_SOURCE_DIR})
        target_link_libraries(${name} INTERFACE ${L_LIBS})
        return()
    endif()
    add_library(${name} ${L_KIND} ${_src})
    target_include_directories(${name} PUBLIC ${PROJECT_SOURCE_DIR})
    target_link_libraries(${name} PUBLIC ${L_LIBS})
    if(L_KIND STREQUAL "SHARED")
        wyx_install_library(${name})
    endif()
endfunction()
