# Compiler settings that every target of the tree shares.
set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_CXX_VISIBILITY_PRESET hidden)
set(CMAKE_VISIBILITY_INLINES_HIDDEN ON)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR}/bin)
set(CMAKE_LIBRARY_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR}/lib)

add_library(fileio_settings INTERFACE)
target_compile_options(fileio_settings INTERFACE -Wall -Wextra -Wconversion -Wshadow -Werror)
target_compile_definitions(fileio_settings INTERFACE
    _GNU_SOURCE
    $<$<BOOL:${FILEIO_FAST_PATHS}>:FILEIO_FAST_PATHS>
    $<$<BOOL:${FILEIO_SMALL_CONSTANTS}>:FILEIO_SMALL_CONSTANTS>)
if(FILEIO_SANITIZE)
  target_compile_options(fileio_settings INTERFACE
      -fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer)
  target_link_options(fileio_settings INTERFACE -fsanitize=address,undefined)
endif()
