# Warnings and sanitizers for every target of the project.
add_compile_options(-Wall -Wextra -Wpedantic -Wshadow -Wnon-virtual-dtor)
# GCC 12 warns falsely about overlapping copies inside std::string's operator+
# when optimising (GCC bug 105329); the warning finds nothing real here.
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
    add_compile_options(-Wno-restrict)
endif()
if(CV_WERROR)
    add_compile_options(-Werror)
endif()
if(CV_SANITIZE)
    add_compile_options(-fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer)
    add_link_options(-fsanitize=address,undefined)
endif()
if(CV_BUILD_FUZZ)
    # Every library reports its coverage to libFuzzer, not only the target's own file.
    add_compile_options(-fsanitize=fuzzer-no-link)
endif()
