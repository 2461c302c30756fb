#!/usr/bin/env bash
# Makes this machine run 32-bit x86 programs, for the i386 build's tests (run
# as root, after install-deps.sh has installed g++-multilib). A kernel that
# runs them itself needs nothing; one built or booted without IA-32 emulation
# (as some virtual machines are) gets qemu's user-mode emulator registered for
# i386 ELF programs, so the tests and the tools they start run unchanged.
set -euo pipefail
probe_dir=$(mktemp -d)
trap 'rm -rf "$probe_dir"' EXIT
echo 'int main(void) { return 0; }' >"$probe_dir/probe.c"
gcc -m32 "$probe_dir/probe.c" -o "$probe_dir/probe"
"$probe_dir/probe" 2>/dev/null && exit 0

binfmt=/proc/sys/fs/binfmt_misc
if [[ ! -e $binfmt/qemu-i386 ]]; then
  if ! dpkg-query -W -f='${Status}' qemu-user-static 2>/dev/null | grep -q "install ok installed"; then
    export DEBIAN_FRONTEND=noninteractive
    apt-get update -qq
    apt-get install -y -qq --no-install-recommends qemu-user-static
  fi
  [[ -e $binfmt/register ]] || mount -t binfmt_misc binfmt_misc "$binfmt"
  # ELF, 32-bit, little-endian, executable or position-independent, i386; F
  # opens the emulator now, so it serves in every mount namespace.
  printf '%s' ':qemu-i386:M::\x7fELF\x01\x01\x01\x00\x00\x00\x00\x00\x00\x00\x00\x00\x02\x00\x03\x00:\xff\xff\xff\xff\xff\xfe\xfe\x00\xff\xff\xff\xff\xff\xff\xff\xff\xfe\xff\xff\xff:/usr/bin/qemu-i386-static:F' \
    >"$binfmt/register"
fi
"$probe_dir/probe" || { echo "enable-i386: 32-bit x86 programs still cannot run here" >&2; exit 1; }
