# Writes OUTPUT, a source file with the bytes of FILES in FOLDER: one array each, named after the file.
set(source "// Made from the built page.\n#include \"StandaloneHost/Page/Content.h\"\n\nnamespace Page\n{\n\n")
foreach(file IN LISTS FILES)
  file(READ ${FOLDER}/${file} bytes HEX)
  string(LENGTH "${bytes}" digits)
  math(EXPR size "${digits} / 2")
  string(REGEX REPLACE "(................................................................)" "\\1\n" bytes "${bytes}")
  string(REGEX REPLACE "([0-9a-f][0-9a-f])" "'\\\\x\\1'," bytes "${bytes}")
  string(MAKE_C_IDENTIFIER ${file} name)
  string(APPEND source "static constexpr char bytes_${name}[] = {\n${bytes}};\n"
                       "const std::string_view ${name}(bytes_${name}, ${size});\n\n")
endforeach()
file(WRITE ${OUTPUT} "${source}}\n")
