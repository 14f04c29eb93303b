# SPDX-License-Identifier: Apache-2.0
# Prints the names of all functions and data that public headers declare, one a line.
#   awk -f declared-names.awk include/lexaro/*.h
{ text = text $0 "\n" }

END {
  gsub(/\/\*[^*]*\*+([^\/*][^*]*\*+)*\//, " ", text)  # comments
  gsub(/\n[ \t]*#[^\n]*/, "\n", text)                 # directives
  gsub(/[ \t\n]+/, " ", text)
  count = split(text, statements, ";")
  for (i = 1; i <= count; ++i) {
    statement = statements[i]
    start = index(statement, "LX_API ")
    if (start == 0) continue
    statement = substr(statement, start + 7)
    sub(/[(\[].*/, "", statement)  # the parameters of a function, the bound of an array
    sub(/ +$/, "", statement)
    sub(/.*[ *]/, "", statement)   # the type
    print statement
  }
}
