# Flags for code of the project; generated code of others is compiled without them.
add_library(quorl_flags INTERFACE)
target_compile_options(quorl_flags INTERFACE -Wall -Wextra -Wpedantic -Wconversion -Wsign-conversion -Wshadow
                                             -Wnon-virtual-dtor -Woverloaded-virtual -Wold-style-cast
                                             -Wimplicit-fallthrough -Werror)

if(CMAKE_UNITY_BUILD AND CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  # GCC takes what a joined file includes for a header, whose classes may hold no type of an unnamed namespace.
  target_compile_options(quorl_flags INTERFACE -Wno-subobject-linkage)
endif()

if(QUORL_SANITIZE)
  # Reports need no more than line numbers; the rest of the debug information takes a third of the time.
  add_compile_options(-fsanitize=${QUORL_SANITIZE} -fno-sanitize-recover=all -fno-omit-frame-pointer -O1 -g1)
  add_link_options(-fsanitize=${QUORL_SANITIZE})
endif()
if(QUORL_SANITIZE MATCHES "thread")
  # GCC warns that the thread sanitizer does not see std::atomic_thread_fence, which Asio uses.
  add_compile_options(-Wno-tsan)
endif()
if(QUORL_FUZZ)
  # Coverage in everything that a target reaches is what steers the fuzzer.
  add_compile_options(-fsanitize=fuzzer-no-link -gline-tables-only)
endif()
