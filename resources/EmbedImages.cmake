# cmake -DOUTPUT=<file.inc> -DIMAGES=<png;png;...> -P EmbedImages.cmake
# Writes each PNG as a byte array named after its file: busy_00.png -> busy_00_png.
file(WRITE ${OUTPUT}.tmp "// Generated from resources/images at build time; do not edit.\n")
foreach(_png IN LISTS IMAGES)
    get_filename_component(_name ${_png} NAME)
    string(MAKE_C_IDENTIFIER ${_name} _symbol)
    file(READ ${_png} _hex HEX)
    string(REGEX REPLACE "([0-9a-f][0-9a-f])" "0x\\1," _bytes "${_hex}")
    file(APPEND ${OUTPUT}.tmp "const unsigned char ${_symbol}[] = {\n    ${_bytes}\n};\n")
endforeach()
file(COPY_FILE ${OUTPUT}.tmp ${OUTPUT} ONLY_IF_DIFFERENT)
file(REMOVE ${OUTPUT}.tmp)
