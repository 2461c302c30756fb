#!/usr/bin/env bash
# `cmake --install` gives a tree that runs from anywhere: installed into a
# temporary prefix and then moved, its hyracli finds its plug-in and libraries
# by itself, run from another directory with no environment but HYRA_SIM_DB.
#
#   InstallTest.sh BUILD-DIRECTORY
set -u
build=$1
failures=0
fail() {
  echo "FAIL: $*"
  failures=$((failures + 1))
}

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cmake --install "$build" --prefix "$work/installed" >"$work/install.log" ||
  { cat "$work/install.log"; exit 1; }
mv "$work/installed" "$work/moved"
prefix=$work/moved

for file in bin/hyracli bin/hyrasim lib/hyracli/plugins/tarn.plugin.so \
  share/man/man1/hyracli.1 share/man/man1/hyracli-storage-internal-tarn-kiroprovider-add.1 \
  share/bash-completion/completions/hyracli share/zsh/vendor-completions/_hyracli \
  share/fish/vendor_completions.d/hyracli.fish; do
  [[ -f $prefix/$file ]] || fail "$file is not installed"
done
# No run path may point into the build tree or anywhere absolute.
while IFS= read -r file; do
  paths=$(readelf -d "$file" | sed -n 's/.*\(RPATH\|RUNPATH\).*\[\(.*\)\]/\2/p')
  for path in ${paths//:/ }; do
    [[ $path == '$ORIGIN'* ]] || fail "${file#"$prefix"/} has the run path $path"
  done
done < <(find "$prefix/bin" "$prefix/lib" -type f)

# Runs an installed tool from the work directory with a clean environment.
run() { (cd "$work" && env -i HYRA_SIM_DB="$work/world.db" "$@"); }

run "$prefix/bin/hyrasim" init --demo >/dev/null || fail "the installed hyrasim does not run"
out=$(run "$prefix/bin/hyracli" storage internal tarn kiroprovider add --vp-name vp3 \
  --vp-url https://vp3.example.test:8443/kiro --arrayid array-c --priority 2 --isactive false 2>&1)
[[ $? == 0 && $out == "Succesfully Added VP with name : vp3" ]] ||
  fail "the installed hyracli does not add a provider: $out"
out=$(run "$prefix/bin/hyracli" --formatter json storage internal tarn storagecontainer load 2>&1)
[[ $? == 0 && $out == *'"silver"'* ]] || fail "the installed hyracli does not load containers: $out"
# The installed tool completes the tree it loads, as the installed script does.
run "$prefix/bin/hyracli" completion bash >"$work/completion" || fail "completion bash fails"
cmp -s "$work/completion" "$prefix/share/bash-completion/completions/hyracli" ||
  fail "the installed bash script differs from what the installed tool prints"

((failures == 0)) || exit 1
echo "install: the moved tree runs"
