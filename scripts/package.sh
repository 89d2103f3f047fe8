#!/usr/bin/env bash
# Makes the Debian package (cpack -G DEB), installs it, and runs the installed
# files: the sample import from the installed vantrel must print what the
# build's prints, and so must a copy of the build's programs moved elsewhere;
# the C example is built against the installed CMake package and, again,
# through pkg-config, and both builds import the sample.
#
#   bash scripts/package.sh           installs into a scratch root (dpkg -x)
#   bash scripts/package.sh --system  installs with apt into this machine (as root)
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
build=${BUILD_DIR:-$root/build}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
spec='DateTimeCol=1;StartRow=5;ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;ExcelSheet=1,2;'
sample="$root/samples/hydrometric.xlsx"

"$root/scripts/build.sh"
rm -f "$build"/vantrel_*.deb
(cd "$build" && cpack -G DEB >/dev/null)
deb=$(ls "$build"/vantrel_*.deb)
echo "made $deb"

if [ "${1:-}" = "--system" ]; then
    apt-get install -y -qq "$deb" >/dev/null
    prefix=/usr
else
    dpkg -x "$deb" "$work/root"
    prefix=$work/root/usr
fi
echo "installed under $prefix"

fail() { echo "package check failed: $*" >&2; exit 1; }

# The installed program, and the build's programs copied to a folder of their own.
"$build/bin/vantrel" import "$sample" --spec "$spec" >"$work/built.csv"
"$prefix/bin/vantrel" import "$sample" --spec "$spec" >"$work/installed.csv"
cmp "$work/built.csv" "$work/installed.csv" || fail "the installed vantrel imports the sample otherwise"
mkdir "$work/copied"
cp "$build/bin/vantrel" "$build"/bin/*.so* "$work/copied/"
"$work/copied/vantrel" import "$sample" --spec "$spec" >"$work/copied.csv"
cmp "$work/built.csv" "$work/copied.csv" ||
    fail "a copied bin/ imports the sample otherwise"

# Registered from the installed tree, the module is found again by its ProgID.
export VANTREL_REGISTRY_ROOT="$work/registry"
"$prefix/bin/vantrel" register >/dev/null
grep -q "$(readlink -f "$prefix/lib/vantrel/GenericExcelVantrel.so")" "$work/registry/classes.reg" ||
    fail "the registered module path is not the installed module"
"$prefix/bin/vantrel" inspect "$sample" --spec "$spec" --progid GenericExcelVantrel.ExcelVantrel >/dev/null ||
    fail "the module registered from the installed tree is not found by its ProgID"

# A headless host needs neither Qt nor X: only the dialogs' plug-in links them.
if ldd "$prefix"/lib/vantrel/GenericExcelVantrel.so | grep -E 'libQt6|libX11|libxcb'; then
    fail "the installed module links Qt or X"
fi

# The C example, through find_package and through pkg-config.
cmake -S "$root/examples" -B "$work/example" -DCMAKE_PREFIX_PATH="$prefix" >/dev/null
cmake --build "$work/example" >/dev/null
"$work/example/vantrel_import_summary" "$sample" "$spec" >"$work/summary.txt"
export PKG_CONFIG_PATH="$prefix/lib/pkgconfig"
module=$(pkg-config --variable=module vantrel)
# A prefix outside the loader's paths is named to the program (-rpath).
# shellcheck disable=SC2046
cc -std=c11 -Wall -Wextra -Wpedantic -Werror -DVANTREL_MODULE="\"$module\"" -o "$work/summary-pc" \
    "$root"/examples/*.c $(pkg-config --cflags --libs vantrel) -ldl -Wl,-rpath,"$(pkg-config --variable=libdir vantrel)"
"$work/summary-pc" "$sample" "$spec" >"$work/summary-pc.txt"
cmp "$work/summary.txt" "$work/summary-pc.txt" || fail "the two builds of the example differ"
cat "$work/summary.txt"
steps=$(($(wc -l <"$work/built.csv") - 5))
grep -qx "time steps: $steps, .*" "$work/summary.txt" || fail "the example imported other than $steps time steps"
echo "package checks passed"
