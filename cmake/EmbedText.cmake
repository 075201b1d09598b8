# Run as a script (cmake -P) at build time: writes a C++ source that holds
# text files as constants, so that a program carries them in itself and
# looks nothing up when it runs.
#
#   cmake -DOUTPUT=<file.cpp> -DHEADER=<header to include> -DNAMESPACE=<ns>
#         -DTEXTS=<name>|<file>|<name>|<file>... -P EmbedText.cmake
#
# Each file becomes `std::string_view const <name>` in the namespace, as a
# raw string literal. A file that contains the literal's closing delimiter
# would end the literal early: the script stops with an error instead.
cmake_minimum_required(VERSION 3.25)

set(delimiter "embedded")
string(REPLACE "|" ";" texts "${TEXTS}")
list(LENGTH texts count)
math(EXPR odd "${count} % 2")
if(count EQUAL 0 OR NOT odd EQUAL 0)
  message(FATAL_ERROR "EmbedText: TEXTS needs name|file pairs, got '${TEXTS}'")
endif()

set(source "// Made at build time from the files named below; edit those instead.\n")
string(APPEND source "#include \"${HEADER}\"\n\nnamespace ${NAMESPACE} {\n")
math(EXPR last "${count} - 1")
foreach(at RANGE 0 ${last} 2)
  math(EXPR file_at "${at} + 1")
  list(GET texts ${at} name)
  list(GET texts ${file_at} file)
  file(READ "${file}" text)
  string(FIND "${text}" ")${delimiter}\"" clash)
  if(NOT clash EQUAL -1)
    message(FATAL_ERROR "EmbedText: ${file} contains ')${delimiter}\"', "
      "which would end its C++ raw string early")
  endif()
  string(APPEND source "\n// ${file}\nstd::string_view const ${name} = "
    "R\"${delimiter}(${text})${delimiter}\";\n")
endforeach()
string(APPEND source "\n} // namespace ${NAMESPACE}\n")
file(WRITE "${OUTPUT}" "${source}")
