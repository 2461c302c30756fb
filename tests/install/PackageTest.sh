#!/usr/bin/env bash
# `cpack -G DEB` gives a package with the files and Depends it needs. Where
# the machine allows it (root, apt-get, the package not installed already) it
# is installed with apt-get, runs a command against the demo world from
# another directory, and is removed again; otherwise that part is skipped
# (exit 77) after saying why.
#
#   PackageTest.sh BUILD-DIRECTORY
set -u
build=$1
failures=0
fail() {
  echo "FAIL: $*"
  failures=$((failures + 1))
}

work=$(mktemp -d)
package=hyra-tarn
installed_here=
cleanup() {
  if [[ -n $installed_here ]]; then
    DEBIAN_FRONTEND=noninteractive apt-get purge -y -qq -o DPkg::Lock::Timeout=300 \
      "$package" >/dev/null || echo "FAIL: $package could not be removed"
  fi
  rm -rf "$work"
}
trap cleanup EXIT

(cd "$work" && cpack --config "$build/CPackConfig.cmake" -G DEB -B "$work") >"$work/cpack.log" 2>&1 ||
  { cat "$work/cpack.log"; exit 1; }
deb=$(find "$work" -maxdepth 1 -name "${package}_*.deb")
[[ -f $deb ]] || { echo "FAIL: no package was made"; exit 1; }

depends=$(dpkg-deb -f "$deb" Depends)
for library in libc6 libstdc++6 libsqlite3-0; do
  [[ $depends == *"$library"* ]] || fail "Depends lacks $library: $depends"
done
contents=$(dpkg-deb -c "$deb")
for file in ./usr/bin/hyracli ./usr/bin/hyrasim ./usr/lib/hyracli/plugins/tarn.plugin.so \
  ./usr/lib/hyracli/libfendle.so ./usr/share/man/man1/hyracli.1 \
  ./usr/share/bash-completion/completions/hyracli; do
  [[ $contents == *" $file"* ]] || fail "the package lacks $file"
done
((failures == 0)) || exit 1

skip() {
  echo "package built and checked; not installed: $*"
  exit 77
}
[[ $(id -u) == 0 ]] || skip "not root"
command -v apt-get >/dev/null || skip "no apt-get"
dpkg-query -W -f='${Status}' "$package" 2>/dev/null | grep -q "install ok installed" &&
  skip "$package is installed already and is left alone"

installed_here=yes
DEBIAN_FRONTEND=noninteractive apt-get install -y -qq -o DPkg::Lock::Timeout=300 "$deb" \
  >"$work/apt.log" 2>&1 || { cat "$work/apt.log"; exit 1; }
run() { (cd "$work" && env -i HYRA_SIM_DB="$work/world.db" "$@"); }
run /usr/bin/hyrasim init --demo >/dev/null || fail "the packaged hyrasim does not run"
out=$(run /usr/bin/hyracli storage internal tarn kiroprovider set -v vp1 -a array-a -p 1 -i true 2>&1)
[[ $? == 0 && $out == "Successfully Updated VP with name : vp1" ]] ||
  fail "the packaged hyracli does not update a provider: $out"
[[ $(man -w hyracli 2>/dev/null) == /usr/share/man/man1/hyracli.1* ]] || fail "man does not find hyracli(1)"

((failures == 0)) || exit 1
echo "package: installed, ran and removed"
