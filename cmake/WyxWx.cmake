# wxWidgets from the distribution, through wx-config. All our code is compiled
# with the same GUI-enabled flags so that no class is seen with two layouts;
# each target links only the wx libraries it really uses.
find_program(WX_CONFIG wx-config REQUIRED)

execute_process(COMMAND ${WX_CONFIG} --cxxflags core,base,xml
                OUTPUT_VARIABLE _wx_cxxflags OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
separate_arguments(_wx_cxxflags UNIX_COMMAND "${_wx_cxxflags}")

function(_wyx_wx_target name libs)
    execute_process(COMMAND ${WX_CONFIG} --libs ${libs}
                    OUTPUT_VARIABLE _libs OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
    separate_arguments(_libs UNIX_COMMAND "${_libs}")
    add_library(${name} INTERFACE IMPORTED GLOBAL)
    target_compile_options(${name} INTERFACE ${_wx_cxxflags})
    # As link items, not link options: they must follow the objects that use them.
    target_link_libraries(${name} INTERFACE ${_libs})
endfunction()

_wyx_wx_target(wx::base "base")
_wyx_wx_target(wx::xml "base,xml")
_wyx_wx_target(wx::core "core,base")
