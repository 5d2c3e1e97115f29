# Gates over what is shipped: the libraries, the manual pages, the packages; scripts/check runs them.
# shellcheck shell=bash
# shellcheck disable=SC2154 # scripts/check sets them

# The names that a library exports, each with its version node, and those that it takes from its host.
symbols_of() { # LIBRARY
  nm -D "$1" | awk '
    $(NF-1) == "U" && $NF ~ /^(TRC1|SYS1)_/ { print "U", $NF }
    $(NF-1) !~ /^[UwA]$/ { nodes = split($NF, part, "@+"); print $(NF-1), part[1], (nodes > 1 ? part[2] : "Base") }' | sort
}

needs_only() { # LIBRARY PATTERN
  local extra
  extra=$(readelf -d "$1" | sed -n 's/.*(NEEDED).*\[\(.*\)\]/\1/p' | grep -vE "^($2)\$")
  [[ -z $extra ]] || { echo "$1 also needs: $extra"; return 1; }
}

# What cmake/libraries.cmake asks the compiler and the linker for.
hardened() { # FILE [FEATURE]
  local facts feature result=0
  facts=$(readelf -hldW "$1" && nm -D "$1")
  local features=('Type: +DYN' GNU_RELRO BIND_NOW 'U __stack_chk_fail' "${@:2}")
  # The start files bring two of these.
  if [[ $(uname -m) == x86_64 ]]; then
    features+=('[3-9] branch targets|[1-9][0-9]+ branch targets')
    facts+=$'\n'$(objdump -d "$1" | grep -c endbr64)' branch targets'
  fi
  for feature in "${features[@]}"; do
    grep -qE "$feature" <<<"$facts" || { echo "$1 is not hardened: no '$feature'"; result=1; }
  done
  return $result
}

gate_symbols() {
  need nm objdump readelf
  build release || return
  local release=build/release own='libc\.so\.6|libicu(uc|i18n|io)\.so\..*' result=0 list library kind name
  for list in */lib*.symbols; do
    library=$release/${list%.symbols}.so
    diff <(cut -d' ' -f1-3 "$list") <(symbols_of "$library") && hardened "$library" || result=1
  done
  hardened $release/tools/nls2/nls2 'U __[a-z]+_chk@' || result=1 # and libc functions that check sizes
  needs_only $release/host/libzelhost.so 'libc\.so\.6' || result=1
  needs_only $release/src/libzelnls2.so "$own|libzelhost\.so\..*" || result=1
  needs_only $release/fields/libzelfields.so "$own|libzelnls2\.so\..*|libstdc\+\+\.so\.6|libgcc_s\.so\.1" || result=1
  while read -r kind name _; do
    [[ $kind == U ]] || grep -qw "$name" tests/interface/*.c ||
      { echo "$name is not used from C in tests/interface"; result=1; }
  done <src/libzelnls2.symbols
  return $result
}

# The types behind the exported names are those of abi/, which holds them for one architecture.
gate_abi() {
  [[ $(uname -m) == x86_64 ]] || { echo "abi/ describes x86-64"; return; }
  need abidw abidiff g++ cmake ninja
  scripts/abi check
}

# The manual pages are sound, and leave out no command or option that the built tool's help lists. Each
# function that a library exports has a page.
gate_manuals() {
  need mandoc g++ cmake ninja
  cmake --preset release >/dev/null && cmake --build --preset release --target nls2 manual_pages || return
  local nls2=build/release/tools/nls2/nls2 pages=build/release/manual_pages commands options name missing result=0
  mandoc -T lint -W warning docs/*.[0-9] $pages/*/*.3 || result=1
  commands=$($nls2 --help | sed -nE 's/^  ([a-z]+) .*/\1/p' | grep -vx help)
  [[ -n $commands ]] || { echo "nls2 --help lists no command"; return 1; }
  options=$({ $nls2 --help; for name in $commands; do $nls2 "$name" --help; done; } |
    sed -nE 's/^  (-[^ ]*(, --[^ ]*)?).*/\1/p' | grep -oE -- '--?[a-z-]+' | sort -u)
  [[ -n $options ]] || { echo "nls2 COMMAND --help lists no option"; return 1; }
  for name in $commands; do
    grep -q "^\.Ss $name\$" docs/nls2.1 || { echo "nls2.1 does not mention $name"; result=1; }
  done
  for name in $options; do
    grep -wE Fl docs/nls2.1 | grep -qE -- " ${name#-}( |\$)" ||
      { echo "nls2.1 does not mention $name"; result=1; }
  done
  missing=$(comm -23 <(awk '$1 == "T" && $2 ~ /^NLS2/ { print $2 ".3" }' ./*/lib*.symbols | sort) \
    <(find $pages -name '*.3' -printf '%f\n' | sort))
  [[ -z $missing ]] || { echo "functions without a page: $missing"; result=1; }
  return $result
}

# The installed tree, moved, serves callers and hosts through CMake and through pkg-config.
gate_install() {
  need pkg-config
  local tree=$PWD/$work/install
  rm -rf "$tree" && build release &&
    cmake --install build/release --prefix "$tree/first" && mv "$tree/first" "$tree/moved" &&
    CMAKE_GENERATOR=Ninja CMAKE_PREFIX_PATH=$tree/moved \
      PKG_CONFIG_PATH=$(dirname "$(find "$tree/moved" -name zelnls2.pc)") \
      examples/consumer/try "$tree/consumer" && "$tree/moved/bin/nls2" codepages >/dev/null
}

# The packages, in a bare Debian, run the command and serve callers.
gate_packages() {
  need dpkg-deb dpkg-shlibdeps debootstrap unshare
  if ! unshare --mount --pid --fork mount -t tmpfs probe "$work"; then
    echo "only root can set up a bare Debian, where it may mount"
    exit "$skipped"
  fi
  rm -f build/packages/*.deb
  cmake --preset packages >/dev/null && cmake --build --preset packages --target package &&
    scripts/try-packages
}

# Two builds in two places: the same libraries, and no host in the stamp. The stamp's options are those of
# the library's compile commands, without its warnings.
gate_stamp() {
  need g++ cmake ninja
  local place=$PWD/$work/stamp/another/place library=build/release/src/libzelnls2.so file stamp options
  rm -rf "$place" build/release/src/stamp/*/*.inc && mkdir -p "$place" && build release || return
  stamp=$(stamp_of $library)
  if [[ $stamp != *" built on $(hostname) at $(date -u +%Y-%m-%dT)"* ]]; then
    echo "the stamp does not name the build's host and day: $stamp"
    return 1
  fi

  export SOURCE_DATE_EPOCH=1000000000
  rm build/release/src/stamp/*/*.inc && build release &&
    cp -r CMakeLists.txt cmake docs fields host include src "$place" &&
    cmake -S "$place" -B "$place/build" -G Ninja -DCMAKE_EXPORT_COMPILE_COMMANDS=ON \
      -DCMAKE_BUILD_TYPE=Release -DZELNLS2_BUILD_TOOL=OFF -DZELNLS2_BUILD_TESTS=OFF &&
    cmake --build "$place/build" || return
  for file in */lib*.symbols; do
    cmp {build/release,"$place/build"}/"${file%.symbols}.so" || return
  done
  stamp=$(stamp_of $library)
  options=$(sed -n 's/.*"command": "\(.*registry[.]cpp\)",/\1/p' "$place/build/compile_commands.json" |
    tr ' ' '\n' | grep '^-[^IWo]' | grep -vxE -e '-c|-include' | paste -sd' ')
  if [[ $stamp != *", options $options, built at 2001-09-09T01:46:40Z" ]]; then
    echo "the stamp names a host, another date or other options: $stamp"
    return 1
  fi
}

stamp_of() { # LIBRARY
  grep -aoE 'zelnls2 [0-9.]+, [[:print:]]*' "$1"
}
