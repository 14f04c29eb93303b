# SPDX-License-Identifier: Apache-2.0
# Turns the plain comments of the public headers into ones that Doxygen takes, line by line:
#   a comment before declarations belongs to all of them up to the next blank line or comment
#   one behind a declaration belongs to that
#   a heading "---- X ----" begins a group; a comment right below it is the group's
{ lines[NR] = $0 }

# Nothing in a comment is a command; `name` is one for code.
function text_of(line) {
  gsub(/[@\\%#<>&$"]/, "\\\\&", line)
  while (match(line, /`[A-Za-z0-9_]+`/)) {
    line = substr(line, 1, RSTART - 1) "@c " substr(line, RSTART + 1, RLENGTH - 2) substr(line, RSTART + RLENGTH)
  }
  return line
}

# The last line of the block comment that begins here.
function end_of_comment(i) {
  while (i < NR && lines[i] !~ /\*\/[ ]*$/) ++i
  return i
}

function inner_text(line) {
  sub(/ *\*\/ *$/, "", line)
  sub(/^\/?\* ?|^ \* ?|^ +/, "", line)
  return line
}

# Keeps its lines; what is indented as a table stays as it is.
function print_block(i, end,    line, table) {
  for (; i <= end; ++i) {
    line = inner_text(lines[i])
    if (!table && line ~ /^  +%/) printf "@verbatim"
    if (table && line !~ /^  +%/) printf "@endverbatim"
    table = line ~ /^  +%/
    printf "%s%s", table ? line : text_of(line), i < end ? "\n" : ""
  }
}

function trailing_comment(line, opening, closing,    at, rest) {
  at = index(line, opening)
  rest = substr(line, at + length(opening))
  if (closing != "") rest = substr(rest, 1, index(rest, closing) - 1)
  return substr(line, 1, at - 1) opening (closing != "" ? "*< " : "/< ") text_of(rest) (closing != "" ? "*/" : "")
}

function documented_line(line, comment) {
  if (line ~ /[^ ].*\/\* .*\*\/ *$/) line = trailing_comment(line, "/*", "*/")
  if (comment != "" && line ~ /^(extern )?LX_API|^typedef/) {
    return "/** " comment " */ " line
  }
  return line
}

function print_c_header(    i, end, j, comment, grouped) {
  for (i = 1; i <= NR; ++i) {
    if (lines[i] ~ /^\/\* SPDX/) {
      print "/** @file"
    } else if (lines[i] ~ /^\/\* ---- /) {
      heading = lines[i]
      gsub(/^\/\* ---- | ---- \*\/$/, "", heading)
      printf "%s/** @name %s\n", grouped ? "/** @} */ " : "", text_of(heading)
      grouped = 1
      comment = ""
      if (lines[i + 1] ~ /^\/\*/) {
        end = end_of_comment(i + 1)
        print_block(i + 1, end)
        i = end
      } else {
        ++i
      }
      print "*/ /** @{ */"
    } else if (lines[i] ~ /^\/\*/) {
      end = end_of_comment(i)
      if (i < 4) {
        print_block(i, end)
        print " */"
      } else {
        comment = ""
        for (j = i; j <= end; ++j) {
          comment = comment " " text_of(inner_text(lines[j]))
          print ""
        }
      }
      i = end
    } else {
      if (grouped && lines[i] ~ /^#ifdef __cplusplus/) {
        print "/** @} */"
        grouped = 0
      }
      if (lines[i] == "") comment = ""
      print documented_line(lines[i], comment)
    }
  }
}

function print_cpp_header(    i, line, indent) {
  for (i = 1; i <= NR; ++i) {
    line = lines[i]
    if (line ~ /^ *\/\/ (SPDX|----)/) {
      print i == 1 ? "/// @file" : ""
    } else if (line ~ /^ *\/\/( |$)/) {
      indent = line
      sub(/\/\/.*/, "", indent)
      sub(/^ *\/\/ ?/, "", line)
      print indent "/// " text_of(line)
    } else if (line ~ /;  \/\/ /) {
      print trailing_comment(line, "//", "")
    } else {
      print line
    }
  }
}

END {
  if (lines[1] ~ /^\/\//) print_cpp_header()
  else print_c_header()
}
