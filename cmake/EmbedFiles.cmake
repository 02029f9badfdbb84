# cmake -DOUT=file.cpp -DFILES="a|b|c" -P EmbedFiles.cmake
# Writes a C++ source that holds the bytes of each file, by its file name, in the array
# formkit::detail::EmbeddedFiles (ended by an entry without a name).
string(REPLACE "|" ";" FILES "${FILES}")
set(body "")
foreach(file IN LISTS FILES)
  get_filename_component(name "${file}" NAME)
  file(READ "${file}" hex HEX)
  string(LENGTH "${hex}" hex_length)
  math(EXPR size "${hex_length} / 2")
  # Lines of 32 bytes, each byte as a hexadecimal escape.
  string(REGEX REPLACE "([0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f][0-9a-f])" "\\1\"\n    \"" hex "${hex}")
  string(REGEX REPLACE "([0-9a-f][0-9a-f])" "\\\\x\\1" escaped "${hex}")
  string(APPEND body "    {\"${name}\",\n    \"${escaped}\",\n    ${size}},\n")
endforeach()
file(WRITE "${OUT}.tmp" "// Made by cmake/EmbedFiles.cmake from the files it names; do not edit.
#include <cstddef>

namespace formkit::detail {
struct TEmbeddedFile {
  const char* Name;
  const char* Bytes;
  std::size_t Size;
};
extern const TEmbeddedFile EmbeddedFiles[];
const TEmbeddedFile EmbeddedFiles[] = {
${body}    {nullptr, nullptr, 0}};
} // namespace formkit::detail
")
execute_process(COMMAND ${CMAKE_COMMAND} -E copy_if_different "${OUT}.tmp" "${OUT}")
file(REMOVE "${OUT}.tmp")
