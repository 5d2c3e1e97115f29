# Writes a manual page for each function of a header, from the comments there:
#   awk -f manual_pages.awk -v overview=docs/zelnls2.3 -v library=libzelnls2.so -v folder=DIR include/nls2.h
# A page holds the function's comment, the comments that its banner's functions share (an empty line
# follows these), and the types and options that the function mentions or that mention it. Indented
# lines stay as they are. The overview is the page that all others refer to.

BEGIN {
  while ((getline line < overview) > 0)
    if (line ~ /^\.Dd /) date = line
  gsub(/.*\/|[.].*/, "", overview)
}

FNR == 1 { header = FILENAME; sub(/.*\//, "", header) }

/^\/\* ---- .* -+ \*\/$/ { banner = $0; common = comment = ""; next }
/^#|^extern "C"|^}$/ { next }
/^\/\*/ { comment = ""; in_comment = 1 }
in_comment {
  in_comment = !/\*\/$/
  gsub(/^\/\* ?|^ \* ?| ?\*\/$/, "")
  comment = comment $0 "\n"
  next
}
declaration != "" || /^(extern )?NLS2_API |^static inline |^enum |^typedef / {
  declaration = declaration $0 "\n"
  if (declaration ~ /^(enum|typedef)[^(]*[{]/ ? !/}.*;/ : !/[;{]$/) next
  if (declaration ~ /^(NLS2_API|static inline) [^(]*\(/) write_page()
  else if (declaration ~ /}/) keep_definition()
  declared = 1
  declaration = ""
}
/^$/ {
  if (banner != "" && comment != "" && !declared) common = common comment "\n"
  comment = declared = ""
}

function keep_definition() {
  definitions[++count] = declaration
  about[count] = comment
  type_name[count] = "-"
  if (declaration ~ /^typedef/ && match(declaration, /[A-Za-z0-9_]+;\n$/))
    type_name[count] = substr(declaration, RSTART, RLENGTH - 2)
}

function has_word(text, word) { return (" " text " ") ~ ("[^A-Za-z0-9_]" word "[^A-Za-z0-9_]") }

function has_constant(text, definition,    words, n) {
  for (n = split(definition, words, /[^A-Za-z0-9_]+/); n > 0; --n)
    if (words[n] ~ /^NLS2F?_[A-Z_0-9]+$/ && words[n] !~ /_ERR_/ && has_word(text, words[n])) return 1
}

function write_page(    name, page, i) {
  sub(/^NLS2_API |^static inline /, "", declaration)
  sub(/ ?[{]\n$/, ";\n", declaration)
  gsub(/\n         /, "\n", declaration)
  match(declaration, /[A-Za-z0-9_]+\(/)
  name = substr(declaration, RSTART, RLENGTH - 1)
  page = folder "/" name ".3"
  print ".\\\" " name ".3 - made from " header > page
  print date "\n.Dt " toupper(name) " 3\n.Os zelnls2\n.Sh NAME\n.Nm " name "\n.Nd " summary(comment) > page
  print ".Sh LIBRARY\n.Pa " library "\n.Sh SYNOPSIS\n.In " header "\n.Bd -literal\n" \
    escaped(declaration) ".Ed\n.Sh DESCRIPTION" > page
  printf "%s%s%s", formatted(comment), common ? ".Ss Shared with related functions\n" : "",
    formatted(common) > page
  for (i = 1; i <= count; ++i)
    if (has_word(declaration, type_name[i]) || has_word(definitions[i] about[i], name) ||
        has_constant(comment, definitions[i]))
      printf ".Ss %s\n%s.Bd -literal\n%s.Ed\n", type_name[i] == "-" ? "Options" : type_name[i],
        formatted(about[i]), escaped(definitions[i]) > page
  print ".Pp\nThe conventions at the beginning of\n.In " header "\nhold for every function." > page
  print ".Sh SEE ALSO\n" references(comment common, name) ".Xr " overview " 3" > page
  close(page)
}

# The functions that a text mentions, sorted as mdoc asks for.
function references(text, name,    words, n, i, j, found, sorted, last, out) {
  n = split(text, words, /[^A-Za-z0-9_]+/)
  for (i = 1; i <= n; ++i) {
    if (words[i] !~ /^NLS2F?_[A-Z]?[a-z]/ || words[i] == name || (words[i] in found)) continue
    found[words[i]]
    for (j = ++last; j > 1 && tolower(sorted[j - 1]) > tolower(words[i]); --j) sorted[j] = sorted[j - 1]
    sorted[j] = words[i]
  }
  for (i = 1; i in sorted; ++i) out = out ".Xr " sorted[i] " 3 ,\n"
  return out
}

# The comment's first clause.
function summary(text) {
  gsub(/\n/, " ", text)
  gsub(/`/, "", text)
  if (match(text, /[.:;]( |$)| \(/)) text = substr(text, 1, RSTART - 1)
  if (length(text) > 72 && match(text, /( and)?, /)) text = substr(text, 1, RSTART - 1)
  if (text ~ /^[A-Z][a-z ]/) text = tolower(substr(text, 1, 1)) substr(text, 2)
  return escaped(text)
}

function escaped(text) {
  gsub(/\\/, "\\e", text)
  gsub(/\n[.']/, "\n\\\\\\&&", text)
  return text
}

# Paragraphs as mdoc's, indented lines as they are.
function formatted(text,    lines, n, i, out, literal, gap) {
  n = split(escaped(text), lines, "\n")
  for (i = 1; i <= n; ++i) {
    if (lines[i] == "") { gap = out != ""; continue }
    if (lines[i] ~ /^  /) {
      out = out (literal ? (gap ? "\n" : "") : ".Bd -literal\n")
    } else {
      out = out (literal ? ".Ed\n" : "") (gap ? ".Pp\n" : "")
      gsub(/[.] /, ".\n", lines[i])
    }
    literal = lines[i] ~ /^  /
    gap = 0
    out = out lines[i] "\n"
  }
  return out (literal ? ".Ed\n" : "")
}
