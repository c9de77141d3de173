#!/bin/sh
# check_install.sh CMAKE BUILD_DIR VERSION: installs BUILD_DIR into a fresh prefix and
# checks the layout, that nothing of the tests or the build comes along, and that the
# installed host runs from there and finds its servers beside it.
set -u
cmake=$1 build=$2 version=$3
prefix=$(mktemp -d "${TMPDIR:-/tmp}/dv-install.XXXXXX")
trap 'rm -rf "$prefix"' EXIT
failures=0
fail() { echo "FAIL: $*"; failures=$((failures + 1)); }

"$cmake" --install "$build" --prefix "$prefix" >"$prefix.log" 2>&1 || {
  cat "$prefix.log"; rm -f "$prefix.log"; echo "FAIL: cmake --install"; exit 1; }
rm -f "$prefix.log"

for f in bin/dorvantos bin/poc-dorvantos; do
  [ -x "$prefix/$f" ] || fail "$f missing or not executable"
done
for lib in dv_vb dv_registry dv_automation dv_forms dv_ado dv_qt poc_dorvantos ravelport recordfinder; do
  [ -f "$prefix/lib/lib$lib.so" ] || fail "lib/lib$lib.so missing"
done
for f in share/poc-dorvantos/db/sqlite/schema.sql share/poc-dorvantos/db/sqlserver/schema.sql \
         share/poc-dorvantos/db/demo/01_chart_of_accounts.sql \
         share/applications/poc-dorvantos.desktop \
         share/icons/hicolor/scalable/apps/poc-dorvantos.svg; do
  [ -s "$prefix/$f" ] || fail "$f missing or empty"
done
demo_count=$(ls "$prefix/share/poc-dorvantos/db/demo" 2>/dev/null | grep -c '\.sql$')
[ "$demo_count" -eq "$(ls "$(dirname "$0")/../../db/demo" | grep -c '\.sql$')" ] ||
  fail "share/poc-dorvantos/db/demo has $demo_count SQL files, not all of db/demo"

# Only our programs and shared libraries: no test or benchmark binaries, no archives.
unexpected=$(cd "$prefix" && find . -type f \( -name '*.a' -o -name 'test_*' -o -name 'bench_*' \
             -o -name '*dvtest*' -o -name 'dv_qt_demo' -o -name '*.o' \) | sort)
[ -z "$unexpected" ] || fail "not to be installed: $unexpected"
strays=$(cd "$prefix" && find . -type f ! -path './bin/*' ! -path './lib/*' ! -path './share/*' | sort)
[ -z "$strays" ] || fail "outside bin/, lib/ and share/: $strays"

grep -q '^Exec=poc-dorvantos' "$prefix/share/applications/poc-dorvantos.desktop" ||
  fail "the desktop entry does not start the installed launcher"
grep -q '^Icon=poc-dorvantos$' "$prefix/share/applications/poc-dorvantos.desktop" ||
  fail "the desktop entry does not name the installed icon"

# The installed host must resolve every library from the prefix, none from the build.
if command -v ldd >/dev/null; then
  from_build=$(env -u LD_LIBRARY_PATH ldd "$prefix/bin/dorvantos" "$prefix/lib/libpoc_dorvantos.so" | grep -F "$build" || true)
  [ -z "$from_build" ] || fail "installed binaries load libraries of the build tree: $from_build"
  missing=$(env -u LD_LIBRARY_PATH ldd "$prefix/bin/dorvantos" "$prefix"/lib/*.so | grep 'not found' || true)
  [ -z "$missing" ] || fail "unresolved libraries: $missing"
fi

out=$(env -u LD_LIBRARY_PATH "$prefix/bin/dorvantos" --version 2>&1) || fail "dorvantos --version failed: $out"
case "$out" in
  *"$version"*) ;;
  *) fail "dorvantos --version printed '$out', not version $version" ;;
esac

# Registration from the installed tree names the installed libraries.
reg="$prefix/registry.reg"
out=$(env -u LD_LIBRARY_PATH "$prefix/bin/dorvantos" --registry "$reg" register 2>&1) ||
  fail "dorvantos register failed: $out"
grep -qF -e "$prefix/bin/../lib/libpoc_dorvantos.so" -e "$prefix/lib/libpoc_dorvantos.so" "$reg" 2>/dev/null ||
  fail "the registered component is not the installed library: $(cat "$reg" 2>/dev/null)"

[ "$failures" -eq 0 ] || exit 1
echo "install layout ok in $prefix"
