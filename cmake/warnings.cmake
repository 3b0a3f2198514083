# Every target of ours gets the same warning set; warnings are errors so that every preset stays clean.
add_library(kestrune_warnings INTERFACE)
target_compile_options(kestrune_warnings INTERFACE
  -Wall -Wextra -Wpedantic -Wshadow -Wconversion -Wsign-conversion
  -Wnon-virtual-dtor -Woverloaded-virtual -Wimplicit-fallthrough
  -Werror)
# GCC 12 reports impossible overlaps in inlined std::basic_string concatenation at -O2 and above
# (GCC bug 105651); the warning says nothing about our code there.
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
  target_compile_options(kestrune_warnings INTERFACE -Wno-restrict)
endif()
if(WIN32)
  # Windows programs take their strings as wchar_t; keep the API in its wide form.
  target_compile_definitions(kestrune_warnings INTERFACE UNICODE _UNICODE WIN32_LEAN_AND_MEAN NOMINMAX _WIN32_WINNT=0x0601)
endif()
