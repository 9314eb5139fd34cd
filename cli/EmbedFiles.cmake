# Writes a source file that holds FILES as text constants, so that the tool carries them: it defines the function
# FUNCTION, declared in HEADER, which gives their texts by name.
#
#   cmake -DOUTPUT=Demonstration.cpp -DHEADER=Demonstration.h -DFUNCTION=demonstrationFiles
#         "-DFILES=a.acd;b.acd" -P EmbedFiles.cmake
#
# A file is cut into short constants, since compilers limit the length of one; every byte is written as an
# escape, since a file may hold any.
set(PIECE_DIGITS 8192)

set(source "// Made by the build.\n")
string(APPEND source "#include \"${HEADER}\"\n\nusing namespace std::string_view_literals;\n\n")
string(APPEND source "std::map<std::string, std::string> ${FUNCTION}() {\n")
string(APPEND source "    std::map<std::string, std::string> files;\n")

foreach(file IN LISTS FILES)
  get_filename_component(name "${file}" NAME)
  string(APPEND source "    {\n        std::string& text = files[\"${name}\"];\n")
  file(READ "${file}" digits HEX)
  string(LENGTH "${digits}" length)
  set(position 0)
  while(position LESS length)
    string(SUBSTRING "${digits}" ${position} ${PIECE_DIGITS} piece)
    string(REGEX REPLACE "(..)" "\\\\x\\1" piece "${piece}")
    string(APPEND source "        text += \"${piece}\"sv;\n")
    math(EXPR position "${position} + ${PIECE_DIGITS}")
  endwhile()
  string(APPEND source "    }\n")
endforeach()

string(APPEND source "    return files;\n}\n")
file(WRITE "${OUTPUT}" "${source}")
