# What every target is compiled and linked with.

add_compile_options(-Wall -Wextra -Wpedantic -Wshadow -Wnon-virtual-dtor -Woverloaded-virtual -Wconversion
                    -Wno-sign-conversion -Werror)

if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  # False alarms of GCC 12 inside the standard library's and Boost's inlined code.
  add_compile_options(-Wno-maybe-uninitialized -Wno-restrict -Wno-stringop-overflow -Wno-array-bounds
                      -Wno-dangling-pointer)
  if(SUBJECT_STORE_SANITIZE MATCHES "thread")
    # Boost.Asio fences where its own atomics already order; the sanitizer does not model fences.
    add_compile_options(-Wno-tsan)
  endif()
endif()

if(CMAKE_CXX_COMPILER_ID MATCHES "Clang")
  # The standard library's stable sort uses a function that it deprecates itself.
  add_compile_options(-Wno-deprecated-declarations)
endif()

if(SUBJECT_STORE_SANITIZE)
  add_compile_options(-fsanitize=${SUBJECT_STORE_SANITIZE} -fno-omit-frame-pointer -fno-sanitize-recover=all)
  add_link_options(-fsanitize=${SUBJECT_STORE_SANITIZE})
endif()

find_program(CCACHE ccache)
if(CCACHE)
  # Paths are made relative to the tree, so that another clone of it finds what this one has compiled.
  set(CMAKE_CXX_COMPILER_LAUNCHER ${CMAKE_COMMAND} -E env CCACHE_BASEDIR=${PROJECT_SOURCE_DIR} CCACHE_NOHASHDIR=1
                                  ${CCACHE})
endif()

find_program(MOLD mold)
if(MOLD AND NOT SUBJECT_STORE_SANITIZE MATCHES "fuzzer")
  add_link_options(-fuse-ld=mold)
endif()

# One folder, one target. A folder of the plugin or of the host is a static library; callers see it by the
# folder's path from the root of the tree.
function(subject_store_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES;PUBLIC;PRIVATE" ${ARGN})
  add_library(${name} STATIC ${ARG_SOURCES})
  target_include_directories(${name} PUBLIC ${PROJECT_SOURCE_DIR})
  target_link_libraries(${name} PUBLIC ${ARG_PUBLIC} PRIVATE ${ARG_PRIVATE})
endfunction()
