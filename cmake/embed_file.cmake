# Run by embed_file: writes the source OUTPUT, where FUNCTION gives the bytes of INPUT. Numbers instead of a literal,
# whose length compilers limit.
file(READ ${INPUT} bytes HEX)
string(REGEX REPLACE "(..)" "0x\\1," bytes "${bytes}")
file(WRITE ${OUTPUT}
"#include \"${HEADER}\"

std::string_view ${FUNCTION}()
{
  static constexpr unsigned char kBytes[] = {${bytes}};
  return {reinterpret_cast<const char*>(kBytes), sizeof kBytes};
}
")
