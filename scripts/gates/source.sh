# Gates over the source text and its history; scripts/check runs them.
# shellcheck shell=bash
# shellcheck disable=SC2154 # scripts/check sets them

gate_format() {
  need clang-format-14
  sources c cpp h hpp | xargs clang-format-14 --dry-run -Werror
}

gate_shellcheck() {
  need shellcheck
  { grep -rlE '^#!.*\bbash$' scripts .ci examples && ls scripts/gates/*.sh; } | xargs shellcheck
}

lines_of() { # FOLDER...
  git ls-files -z -- "$@" | xargs -0r cat | wc -l
}

# Tests are at most 26 % of the product and themselves, and with properties/ and proof/ at most 34 % of
# all of these. Every line of every file counts. No line of a case file has more than 120 columns.
gate_share() {
  need git
  local product tests beside result=0
  product=$(($(lines_of include host src fields tools python) - $(lines_of python/tests)))
  tests=$(lines_of tests python/tests)
  beside=$(lines_of properties proof)
  echo "the product has $product lines, tests/ $tests, properties/ and proof/ $beside"
  ((100 * tests <= 26 * (product + tests))) || { echo "tests/ is over 26 %"; result=1; }
  ((100 * (tests + beside) <= 34 * (product + tests + beside))) ||
    { echo "tests/, properties/ and proof/ are over 34 %"; result=1; }
  ! git ls-files -z '*.cases' | xargs -0 grep -nE '^.{121}' || { echo "over 120 columns"; result=1; }
  return $result
}

# Files have at most 350 lines, and open with what they are for. An interface may be longer.
gate_files() {
  need git
  local file result=0
  while read -r file; do
    [[ $file =~ ^include/(nls2|nls2_fields)\.h$ ]] ||
      (($(wc -l <"$file") <= 350)) || { echo "$file has more than 350 lines"; result=1; }
    sed '/^#!/d; q' "$file" | grep -qE '^((//|/\*|#) [^ ]|""")' ||
      { echo "$file does not open with a line that says what it is for"; result=1; }
  done < <(git ls-files '*.c' '*.cpp' '*.h' '*.hpp' '*.awk' '*.cmake' '*CMakeLists.txt' '*.py' '*.sh' '*.bash' \
    scripts .ci)
  return $result
}

# Since this gate came: no merges, and subjects of at most 72 columns that name a room.
gate_commits() {
  need git
  local first wrong
  first=$(git log --reverse --format=%H -S'gate_commits()' -- scripts | sed -n 1p)
  [[ -n $first ]] || { echo "the history does not reach back to this gate"; return 0; }
  wrong=$(git log --format='%h %s' "$first.." | grep -vE '^[0-9a-f]+ [a-zA-Z0-9_., /-]+: .+$'
    git log --format='%h %s' "$first.." | grep -E '^[0-9a-f]+ .{73}'
    git log --merges --format='%h merges: %s' "$first..")
  [[ -z $wrong ]] || { echo "$wrong"; return 1; }
}

gate_layers() {
  need python3
  scripts/layers
}

# The example in the README is the program that the tests run.
gate_readme() {
  awk '/^```c$/ { inside = 1; next } /^```$/ { inside = 0 } inside' README.md |
    diff - examples/translate_field.c || return
  local excerpt
  excerpt=$(awk '/^```cpp$/ { inside = 1; next } /^```$/ { inside = 0 } inside' README.md)
  [[ -n $excerpt && $(<examples/greet.cpp) == *"$excerpt"* ]]
}

# Each public header alone, in each language that it is for.
gate_header() {
  need gcc g++ clang-14 clang++-14
  local header compiler result=0
  for header in nls2.h nls2_fields.h trc1.h sys1.h; do
    for compiler in 'gcc -xc -std=c99' 'gcc -xc -std=c11' 'g++ -xc++ -std=c++20' \
      'clang-14 -xc -std=c99' 'clang-14 -xc -std=c11' 'clang++-14 -xc++ -std=c++20'; do
      compiles_alone "$header" "$compiler" || result=1
    done
  done
  for header in nls2.hpp $(cd include && echo nls2/*.hpp); do
    for compiler in 'g++ -xc++ -std=c++20' 'clang++-14 -xc++ -std=c++20'; do
      compiles_alone "$header" "$compiler" && compiles_alone "$header" "$compiler -fno-exceptions" ||
        result=1
    done
  done
  return $result
}

compiles_alone() { # HEADER COMPILER
  # shellcheck disable=SC2086 # a command and its first arguments
  echo "#include \"$1\"" |
    $2 -fsyntax-only -pedantic -Wall -Wextra -Werror -Iinclude -Ihost - && return
  echo "$1 does not compile alone: $2"
  return 1
}

# What clang-tidy finds, and what Clang warns of as it parses.
gate_tidy() {
  need clang++-14 clang-tidy-14 cmake ninja
  cmake --preset clang >/dev/null && mkdir -p "$work/tidy" || return
  export -f tidy
  export work
  # build_stamp.cpp includes a file that the build writes.
  # shellcheck disable=SC2016 # expanded by the shell that it starts
  sources c cpp | grep -vE '^examples/consumer/|/build_stamp\.cpp$' |
    xargs -P "$(nproc)" -I '{}' bash -c 'tidy "$1"' _ '{}' 2> >(grep -v ' warnings\? generated' >&2)
}

# Leaves a file out if it, the headers it includes and the rules are as when it last passed. CI leaves
# none out.
tidy() { # FILE
  local passed=$work/tidy/${1//\//_} now
  now=$(clang++-14 -xc++ -MM -MG -I. -Iinclude -Ihost -Isrc -Ifields -Itests -Itools/nls2 "$1" |
    sed 's/^[^ ]*://; s/\\$//' | xargs cat .clang-tidy include/nls2/.clang-tidy tests/.clang-tidy 2>/dev/null | sha256sum)
  [[ ${CI:-} != true && -f $passed && $(<"$passed") == "$now" ]] && return
  clang-tidy-14 --quiet -p build/clang "$1" && echo "$now" >"$passed"
}
