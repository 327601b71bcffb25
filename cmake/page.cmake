# cmake -DCMARK=... -DTEMPLATE=... -DINPUT=X.md -DOUTPUT=X.html -P page.cmake: a document as a page for any browser.
execute_process(COMMAND "${CMARK}" --extension table --to html "${INPUT}"
  OUTPUT_VARIABLE body COMMAND_ERROR_IS_FATAL ANY)
string(REGEX REPLACE "href=\"([a-z-]+)\\.md" "href=\"\\1.html" body "${body}")
string(REGEX MATCH "<h1>([^<]*)</h1>" title "${body}")
set(title "${CMAKE_MATCH_1}")
configure_file("${TEMPLATE}" "${OUTPUT}" @ONLY)
file(TOUCH "${OUTPUT}")  # a page that has not changed is made, too
