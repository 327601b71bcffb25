# cmake -DCMARK=... -DTEMPLATE=... -DCONTENTS=... -DINPUT=X.md -DOUTPUT=X.html -P page.cmake: a document as a page for any
# browser. A heading can be linked to under the name that Markdown's viewers give it. A chapter, which is one that the file
# with the CONTENTS links to, leads to the next one.
execute_process(COMMAND "${CMARK}" --extension table --to html "${INPUT}"
  OUTPUT_VARIABLE body COMMAND_ERROR_IS_FATAL ANY)
string(REGEX REPLACE "href=\"([a-z./-]+)\\.md" "href=\"\\1.html" body "${body}")
string(REGEX MATCH "<h1>([^<]*)</h1>" title "${body}")
set(title "${CMAKE_MATCH_1}")

# A list must not break at a character such as "&quot;".
string(ASCII 1 semicolon)
string(REPLACE ";" "${semicolon}" body "${body}")
string(REGEX MATCHALL "<h[2-6]>[^\n]*" headings "${body}")
foreach(heading IN LISTS headings)
  string(REGEX REPLACE "<[^>]*>|&[a-z]+${semicolon}" "" name "${heading}")
  string(TOLOWER "${name}" name)
  string(REGEX REPLACE "[^a-z0-9 _-]" "" name "${name}")
  string(REPLACE " " "-" name "${name}")
  string(REGEX REPLACE "^<(h.)>" "<\\1 id=\"${name}\">" named "${heading}")
  string(REPLACE "${heading}" "${named}" body "${body}")
endforeach()
string(REPLACE "${semicolon}" ";" body "${body}")

set(navigation "")
cmake_path(GET INPUT FILENAME chapter)
file(STRINGS "${CONTENTS}" entries REGEX "^[0-9]+\\. \\[[^]]*\\]\\([a-z-]*\\.md\\)")
list(TRANSFORM entries REPLACE "^[0-9]+\\. .([^]]*)\\]\\(([a-z-]*\\.md)\\).*" "\\2=\\1")
list(FIND entries "${chapter}=${title}" at)
if(at GREATER_EQUAL 0)
  string(APPEND navigation "<a href=\"index.html\">Contents</a>")
  math(EXPR at "${at} + 1")
  list(LENGTH entries count)
  if(at LESS count)
    list(GET entries ${at} next)
    string(REGEX REPLACE "^(.*)\\.md=(.*)" "<a href=\"\\1.html\">Next: \\2</a>" next "${next}")
    string(APPEND navigation " · ${next}")
  endif()
elseif(INPUT MATCHES "/manual/" AND NOT INPUT STREQUAL CONTENTS)
  message(FATAL_ERROR "${CONTENTS} has no entry \"[${title}](${chapter})\".")
endif()
configure_file("${TEMPLATE}" "${OUTPUT}" @ONLY)
file(TOUCH "${OUTPUT}")  # a page that has not changed is made, too
