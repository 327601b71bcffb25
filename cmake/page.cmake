# cmake -DCMARK=... -DTEMPLATE=... -DINPUT=X.md -DOUTPUT=X.html -DLINKS=... -P page.cmake: a document as a page for any
# browser, with the LINKS (page=text) above and below. A heading can be linked to under the name that Markdown's viewers
# give it.
execute_process(COMMAND "${CMARK}" --extension table --to html "${INPUT}"
  OUTPUT_VARIABLE body COMMAND_ERROR_IS_FATAL ANY)
string(REGEX REPLACE "href=\"([a-z./-]+)\\.md" "href=\"\\1.html" body "${body}")
string(REGEX MATCH "<h1>([^<]*)</h1>" title "${body}")
set(title "${CMAKE_MATCH_1}")

# A list must not break at a character such as "&quot;".
string(ASCII 1 semicolon)
string(REPLACE ";" "${semicolon}" body "${body}")
string(REGEX MATCHALL "<h[2-6]>[^\n]*" headings "${body}")
set(names)
foreach(heading IN LISTS headings)
  string(REGEX REPLACE "<[^>]*>|&[a-z]+${semicolon}" "" name "${heading}")
  string(TOLOWER "${name}" name)
  string(REGEX REPLACE "[^a-z0-9 _-]" "" name "${name}")
  string(REPLACE " " "-" name "${name}")
  list(FIND names "${name}" at)
  if(at GREATER_EQUAL 0)
    message(FATAL_ERROR "${INPUT} has two headings with the name \"${name}\": a link would lead to one of them.")
  endif()
  list(APPEND names "${name}")
  string(REGEX REPLACE "^<(h.)>" "<\\1 id=\"${name}\">" named "${heading}")
  string(REPLACE "${heading}" "${named}" body "${body}")
endforeach()
string(REPLACE "${semicolon}" ";" body "${body}")

list(TRANSFORM LINKS REPLACE "^([^=]*)=(.*)$" "<a href=\"\\1.html\">\\2</a>")
list(JOIN LINKS " · " navigation)
if(navigation)
  set(navigation "<nav>${navigation}</nav>\n")
endif()
configure_file("${TEMPLATE}" "${OUTPUT}" @ONLY)
file(TOUCH "${OUTPUT}")  # a page that has not changed is made, too
