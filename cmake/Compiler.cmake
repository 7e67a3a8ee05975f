# Flags that every target of this project is compiled and linked with.

add_library(qelo_compiler INTERFACE)
target_compile_options(qelo_compiler INTERFACE
  -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror
  -fstack-protector-strong
  -ffile-prefix-map=${PROJECT_SOURCE_DIR}=.)
target_link_options(qelo_compiler INTERFACE
  LINKER:--enable-new-dtags LINKER:-z,relro LINKER:-z,now)

if(QELO_SANITIZE)
  # The checks that sanitizers insert keep GCC from seeing that a std::variant is initialised
  # (it says so itself); the optimised build keeps the warning.
  target_compile_options(qelo_compiler INTERFACE
    $<$<CXX_COMPILER_ID:GNU>:-Wno-maybe-uninitialized>
    -fsanitize=${QELO_SANITIZE} -fno-sanitize-recover=all -fno-omit-frame-pointer)
  target_link_options(qelo_compiler INTERFACE -fsanitize=${QELO_SANITIZE})
else()
  target_compile_definitions(qelo_compiler INTERFACE
    $<$<NOT:$<CONFIG:Debug>>:_FORTIFY_SOURCE=2>)
  target_link_options(qelo_compiler INTERFACE LINKER:--no-undefined)
endif()
