# SPDX-License-Identifier: Apache-2.0
# Writes a C program that prints the layout of every record that the given headers define: one line for the record with
# size and alignment, one for each field with place and size.
BEGIN {
  print "#include <stddef.h>\n#include <stdio.h>\n#include \"lexaro/host.h\"\n#include \"lexaro/nls1.h\""
  print "#define RECORD(t) struct t##_ { char c; t r; }; printf(#t \" %zu %zu\\n\", sizeof(t), offsetof(struct t##_, r))"
  print "#define FIELD(t, f) printf(\"  \" #f \" %zu %zu\\n\", offsetof(t, f), sizeof(((t*)0)->f))"
  print "int main(void) {"
}
{ gsub(/\/\*[^*]*\*\//, "") }
/^typedef struct [A-Za-z0-9_]+ \{/ { record = $3; print "RECORD(" record ");"; next }
record != "" && /^}/ { record = ""; next }
record != "" && /;/ {
  name = $0
  sub(/;.*/, "", name)
  if (name ~ /\(\*/) { sub(/.*\(\*/, "", name); sub(/\).*/, "", name) }  # a pointer to a function
  sub(/\[.*/, "", name)
  sub(/.*[ *]/, "", name)
  print "FIELD(" record ", " name ");"
}
END { print "return 0; }" }
