# Compiler settings that every target of the tree shares.
set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_CXX_VISIBILITY_PRESET hidden)
set(CMAKE_VISIBILITY_INLINES_HIDDEN ON)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR}/bin)
set(CMAKE_LIBRARY_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR}/${CMAKE_INSTALL_LIBDIR})

# Programs at random addresses too, where the compiler does not make them so by itself.
include(CheckPIESupported)
check_pie_supported(LANGUAGES CXX)

add_library(fileio_settings INTERFACE)
target_compile_options(fileio_settings INTERFACE -Wall -Wextra -Wconversion -Wshadow -Werror)
target_compile_definitions(fileio_settings INTERFACE
    _GNU_SOURCE
    $<$<BOOL:${FILEIO_FAST_PATHS}>:FILEIO_FAST_PATHS>
    $<$<BOOL:${FILEIO_SMALL_CONSTANTS}>:FILEIO_SMALL_CONSTANTS>)
if(FILEIO_SANITIZE)
  target_compile_options(fileio_settings INTERFACE
      -fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer
      # What the sanitizers insert makes g++ see unset values in the standard library's own code.
      $<$<CXX_COMPILER_ID:GNU>:-Wno-maybe-uninitialized>)
  target_link_options(fileio_settings INTERFACE -fsanitize=address,undefined)
elseif(FILEIO_COVERAGE)
  # clang++'s own: counts what stands in the source, not the branches that compilers add.
  target_compile_options(fileio_settings INTERFACE -fprofile-instr-generate -fcoverage-mapping)
  target_link_options(fileio_settings INTERFACE -fprofile-instr-generate)
else()
  # Stack and buffers are checked, and symbols bound once and then write-protected.
  target_compile_options(fileio_settings INTERFACE -fstack-protector-strong
      $<$<NOT:$<CONFIG:Debug>>:-U_FORTIFY_SOURCE -D_FORTIFY_SOURCE=2>)
  target_link_options(fileio_settings INTERFACE LINKER:-z,relro,-z,now,-z,noexecstack)
endif()
if(FILEIO_FUZZ)
  target_compile_options(fileio_settings INTERFACE
      -fsanitize=fuzzer-no-link,address,undefined -fno-sanitize-recover=all)
  target_link_options(fileio_settings INTERFACE -fsanitize=address,undefined)
endif()
