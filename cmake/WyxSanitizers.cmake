# WYX_SANITIZE: "" (none), "thread" or "address" (AddressSanitizer + UBSan).
set(WYX_SANITIZE "" CACHE STRING "Sanitizer build: empty, thread or address")

if(WYX_SANITIZE STREQUAL "thread")
    add_compile_options(-fsanitize=thread -fno-omit-frame-pointer -g -O1)
    add_link_options(-fsanitize=thread)
elseif(WYX_SANITIZE STREQUAL "address")
    add_compile_options(-fsanitize=address,undefined -fno-sanitize-recover=undefined
                        -fno-omit-frame-pointer -g -O1)
    add_link_options(-fsanitize=address,undefined)
elseif(NOT WYX_SANITIZE STREQUAL "")
    message(FATAL_ERROR "WYX_SANITIZE must be empty, thread or address")
endif()
