# Warnings, sanitizers and the compiler cache: the same for every target.

add_compile_options(-Wall -Wextra -Wpedantic -Wshadow -Wnon-virtual-dtor -Wsuggest-override -Werror)
# g++ 12 raises these two falsely inside its own <variant> and <string>.
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
  add_compile_options(-Wno-maybe-uninitialized -Wno-restrict)
  # With -O3 it takes neighbouring conversions from double to float and back together, and leaves both out: numbers that
  # were to be rounded stay as they were.
  add_compile_options(-fno-tree-slp-vectorize)
endif()

find_program(CCACHE ccache)
if(CCACHE)
  set(CMAKE_CXX_COMPILER_LAUNCHER ${CCACHE})
endif()

set(CMAKE_CXX_FLAGS_SANITIZE "-O1 -g1 -fno-omit-frame-pointer")
if(TALIX_SANITIZE)
  add_compile_options(-fsanitize=${TALIX_SANITIZE} -fno-sanitize-recover=all)
  add_link_options(-fsanitize=${TALIX_SANITIZE})
endif()
