# SPDX-License-Identifier: Apache-2.0
# Fills the source of a manual page with what the headers say, so that it is written down once.
#   awk -f expand.awk include/lexaro/*.h PAGE.md
#
#   @prototypes NAME...   declarations without their comments, for the synopsis; may go on in the next lines
#   @functions            the comments of all functions named so far, in the order of the headers
#   @notes HEADING        the comment below a heading "---- HEADING ----"
#   @constants NAME...    names, values and comments of #defines; NAME* takes all that begin so
#   @types NAME...        type definitions as they stand
FILENAME ~ /\.md$/ { in_page = 1 }

# ---- The headers ----

!in_page && collecting == "comment" { add_comment_line($0); next }
!in_page && collecting == "type" { add_type_line($0); next }
!in_page && collecting == "declaration" { add_declaration_line($0); next }
!in_page && collecting == "define" { add_define_line($0); next }
!in_page && /^\/\* ---- .* ---- \*\/$/ { heading = $0; gsub(/^\/\* ---- | ---- \*\/$/, "", heading); below_heading = 1; next }
!in_page && /^\/\*/ { comment = ""; collecting = "comment"; add_comment_line($0); next }
!in_page && /^$/ {
  if (comment != "" && below_heading) {
    notes[heading] = comment
    below_heading = 0
  }
  comment = ""
  ++group
  next
}
!in_page && /^#define (LX|NLS1|TRC1)_/ { text = ""; add_define_line($0); next }
!in_page && /^typedef/ { text = ""; add_type_line($0); next }
!in_page && /^(extern )?LX_API/ { text = ""; add_declaration_line($0); next }
!in_page { next }

# Paragraphs become lines; what is indented stays as it is, behind a tab.
function add_comment_line(line,    starred) {
  collecting = line ~ /\*\// ? "" : "comment"
  starred = line ~ /^ \*/
  sub(/^(\/\*| \*\/| \*)/, "", line)
  sub(/ *\*\/$/, "", line)
  if (starred && line ~ /^   /) {
    comment = comment (comment ~ /\n$/ || comment == "" ? "" : "\n") "\t" line "\n"
  } else if (line ~ /^ *$/) {
    if (starred && comment !~ /\n$/) comment = comment "\n"
  } else {
    gsub(/^ +| +$/, "", line)
    comment = comment (comment == "" || comment ~ /\n$/ ? "" : " ") line
  }
  if (collecting == "") ++group
}

function add_type_line(line) {
  text = text line "\n"
  collecting = text ~ /\{/ ? (line ~ /^\}/ ? "" : "type") : (line ~ /;/ ? "" : "type")
  if (collecting != "") return
  name = text
  if (text !~ /\{/ && match(name, /\(\*[A-Za-z0-9_]+\)/)) {
    name = substr(name, RSTART + 2, RLENGTH - 3)
  } else {
    sub(/;[^;]*$/, "", name)
    sub(/.*[ *]/, "", name)
  }
  types[name] = text
}

function add_declaration_line(line) {
  text = text " " line
  collecting = line ~ /;/ ? "" : "declaration"
  below_heading = 0
  if (collecting != "") return
  remark = ""
  if (match(text, /\/\*.*\*\//)) {
    remark = substr(text, RSTART + 3, RLENGTH - 6)
    text = substr(text, 1, RSTART - 1)
  }
  gsub(/LX_API |LX_NOEXCEPT|LX_PRINTF\([0-9, ]*\)/, "", text)
  gsub(/[ \t]+/, " ", text)
  gsub(/^ | ?; ?$/, "", text)
  name = text
  sub(/[(\[].*/, "", name)
  sub(/.*[ *]/, "", name)
  names[++name_count] = name
  prototypes[name] = text ";"
  remarks[name] = remark
  groups[name] = group
  comments[group] = comment
}

function add_define_line(line) {
  collecting = line ~ /\\$/ || (text line ~ /\/\*/ && text line !~ /\*\//) ? "define" : ""
  sub(/ *\\$/, "", line)
  text = text " " line
  if (collecting != "") return
  gsub(/[ \t]+/, " ", text)
  split(text, words, " ")
  constants[++constant_count] = words[2]
  values[words[2]] = words[3]
  sub(/u$/, "", values[words[2]])
  remarks[words[2]] = ""
  if (match(text, /\/\*.*\*\//)) remarks[words[2]] = substr(text, RSTART + 3, RLENGTH - 6)
}

# ---- The page ----

function escaped(line) {
  gsub(/[\\`*_{}\[\]<>#|~^$@]/, "\\\\&", line)
  gsub(/\\`/, "*", line)  # `name` of a parameter
  if (line ~ /^[0-9]+[.)]/) sub(/[.)]/, "\\\\&", line)
  return line
}

function print_text(body, indent, first,    lines, count, i, verbatim) {
  count = split(body, lines, "\n")
  verbatim = 0
  for (i = 1; i <= count; ++i) {
    if (lines[i] == "") continue
    if (lines[i] ~ /^\t/) {
      if (!verbatim) print ""
      print indent "    " substr(lines[i], 4)
    } else {
      if (i > 1) print ""
      print (i == 1 ? first : indent) escaped(lines[i])
    }
    verbatim = lines[i] ~ /^\t/
  }
  print ""
}

# At most 68 columns; parameters go on behind four blanks.
function print_wrapped(line,    at, part) {
  while (length(line) > 68) {
    part = substr(line, 1, 69)
    if (!match(part, /.*[,(]/)) break
    at = RLENGTH
    if (substr(line, at, 1) == "(" && index(substr(line, at), ",") == 0) break
    print substr(line, 1, at)
    line = substr(line, at + 1)
    sub(/^ /, "", line)
    line = "    " line
  }
  print line
}

function print_prototypes(list,    wanted, count, i) {
  count = split(list, wanted, " ")
  print "```"
  for (i = 1; i <= count; ++i) {
    if (!(wanted[i] in prototypes)) fail("no header declares " wanted[i])
    if (i > 1 && prototypes[wanted[i]] ~ /\(/ && groups[wanted[i]] != groups[wanted[i - 1]]) print ""
    print_wrapped(prototypes[wanted[i]])
    on_page[wanted[i]] = 1
  }
  print "```"
}

function print_functions(    i, j, name, head, body) {
  for (i = 1; i <= name_count; i = j) {
    head = body = ""
    for (j = i; j <= name_count && groups[names[j]] == groups[names[i]]; ++j) {
      name = names[j]
      if (!(name in on_page)) continue
      head = head (head == "" ? "" : ", ") "**" name "**" (prototypes[name] ~ /\(/ ? "()" : "")
      if (remarks[name] != "") body = body (body == "" ? "" : "\n") name ": " remarks[name] "."
    }
    if (comments[groups[names[i]]] != "") body = comments[groups[names[i]]] "\n" body
    if (head == "" || body == "") continue
    print head "\n"
    print_text(body, "    ", ":   ")
  }
}

function names_constant(pattern, name) {
  if (pattern !~ /\*$/) return pattern == name
  return index(name, substr(pattern, 1, length(pattern) - 1)) == 1
}

function print_constants(list,    wanted, count, i, j, found, plain) {
  count = split(list, wanted, " ")
  plain = ""
  for (i = 1; i <= count; ++i) {
    found = 0
    for (j = 1; j <= constant_count; ++j) {
      if (!names_constant(wanted[i], constants[j])) continue
      found = 1
      head = "**" constants[j] "** (" values[constants[j]] ")"
      if (remarks[constants[j]] == "") {
        plain = plain (plain == "" ? "" : ", ") head
      } else {
        print head "\n"
        print_text(remarks[constants[j]], "    ", ":   ")
      }
    }
    if (!found) fail("no header defines " wanted[i])
  }
  if (plain != "") print plain "\n"
}

function print_types(list,    wanted, count, i) {
  count = split(list, wanted, " ")
  print "```"
  for (i = 1; i <= count; ++i) {
    if (!(wanted[i] in types)) fail("no header defines the type " wanted[i])
    printf "%s", types[wanted[i]]
  }
  print "```"
}

function fail(message) {
  print FILENAME ": " message > "/dev/stderr"
  failed = 1
  exit 1
}

function finish_list() {
  if (list_kind == "@prototypes") print_prototypes(list)
  if (list_kind == "@constants") print_constants(list)
  if (list_kind == "@types") print_types(list)
  list_kind = ""
}

list_kind != "" && NF > 0 { list = list " " $0; next }
list_kind != "" { finish_list() }
/^@(prototypes|constants|types) / { list_kind = $1; list = $0; sub(/^@[a-z]+ /, "", list); next }
/^@functions$/ { print_functions(); next }
/^@notes / {
  wanted_heading = substr($0, 8)
  if (!(wanted_heading in notes)) fail("no header has notes on \"" wanted_heading "\"")
  print_text(notes[wanted_heading], "", "")
  next
}
/^@[a-z]/ { fail("unknown directive " $1) }
{ print }
END { if (!failed) finish_list() }
