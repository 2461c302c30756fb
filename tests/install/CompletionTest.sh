#!/usr/bin/env bash
# hyracli's completion scripts in real shells. bash: the script is sourced
# with bash-completion and its function driven through COMP_WORDS and
# COMP_CWORD, as bash does on a Tab; fish: through its own `complete -C`;
# zsh: syntax only.
#
#   CompletionTest.sh SHARE-DIRECTORY
set -u
share=$1
failures=0

fail() {
  echo "FAIL: $*"
  failures=$((failures + 1))
}

if [[ -r /usr/share/bash-completion/bash_completion ]]; then
  # shellcheck disable=SC1091
  source /usr/share/bash-completion/bash_completion
else
  fail "bash-completion is not installed"
fi
# shellcheck disable=SC1091
source "$share/bash-completion/completions/hyracli" || fail "the bash script does not load"

# Completes the last of the words as bash would, and prints the candidates.
candidates() {
  COMP_WORDS=("$@")
  COMP_CWORD=$((${#COMP_WORDS[@]} - 1))
  COMP_LINE="$*"
  COMP_POINT=${#COMP_LINE}
  COMPREPLY=()
  _hyracli hyracli "${COMP_WORDS[COMP_CWORD]}" "${COMP_WORDS[COMP_CWORD - 1]}"
  echo "${COMPREPLY[*]}"
}

# expect WANT WORDS...: the candidates for the last word are exactly WANT.
expect() {
  local want=$1 got
  shift
  got=$(candidates "$@")
  [[ $got == "$want" ]] || fail "bash: '$*' gives '$got', not '$want'"
}

tarn=(hyracli storage internal tarn)
add=("${tarn[@]}" kiroprovider add)

# Namespaces and commands, at every depth.
expect "storage" hyracli sto
expect "kiroprovider kirocontext" "${tarn[@]}" kiro
expect "add activate" "${tarn[@]}" kiroprovider a
expect "rule" "${tarn[@]}" faultInjection r
expect "list" "${tarn[@]}" virtualvolume metadata ""
# Options of the command, long and short, and only the command's.
expect "--vp-name --vp-url" "${add[@]}" --vp-
expect "--isactive" "${add[@]}" --vp-name vp3 -v vp3 --is
expect "--log-level" "${tarn[@]}" daemon set --dump-objects --log
# A Bool option's values, after it or behind an equals sign.
expect "true false" "${add[@]}" --isactive ""
expect "false" "${add[@]}" -v vp3 -i f
expect "--isactive=true" "${add[@]}" --isactive=t
# Nothing for a free value, a word after a command, or an unknown word.
expect "" "${add[@]}" --vp-name ""
expect "" "${add[@]}" stray ""
expect "" hyracli storage bogus ""
# Global options, formatter names from the tool, and the words after them.
expect "--formatter" hyracli --form
formatters=$(candidates hyracli --formatter "")
for name in simple table json; do
  [[ " $formatters " == *" $name "* ]] || fail "bash: formatter $name is not offered ($formatters)"
done
expect "storage" hyracli --formatter json sto
expect "storage" hyracli --plugin-dir /tmp sto
expect "bash" hyracli completion b

if command -v fish >/dev/null; then
  fish -n "$share/fish/vendor_completions.d/hyracli.fish" || fail "fish: the script does not parse"
  # fish prints "candidate<TAB>description" lines; only the candidates are compared.
  fish_expect() {
    local want=$1 got
    got=$(fish --no-config -c "source $share/fish/vendor_completions.d/hyracli.fish; complete -C '$2'" |
      cut -f1 | tr '\n' ' ' | sed 's/ $//')
    [[ $got == "$want" ]] || fail "fish: '$2' gives '$got', not '$want'"
  }
  fish_expect "storage" "hyracli sto"
  fish_expect "activate add" "${tarn[*]} kiroprovider a"
  fish_expect "--vp-name --vp-url" "${add[*]} --vp-"
  fish_expect "false true" "${add[*]} --isactive "
  fish_expect "storage" "hyracli --formatter json sto"
else
  echo "fish is not installed: its script is not checked"
fi

if command -v zsh >/dev/null; then
  zsh_script=$share/zsh/vendor-completions/_hyracli
  zsh -n "$zsh_script" || fail "zsh: the script does not parse"
  # zsh's completion builtins exist only inside its completion system; these
  # stand-ins print every candidate offered (zsh itself filters by prefix).
  zsh_expect() {
    local want=$1 got
    shift
    got=$(zsh -f -c '
      script=$1; shift
      compdef() { : }
      compset() { : }
      _describe() { local -a l; l=("${(@P)4}"); print -r -- ${(j: :)${l%%:*}} }
      compadd() { [[ $1 == -a ]] && print -r -- ${(j: :)${(P)2}} }
      _directories() { print -r -- "(directories)" }
      source $script
      words=("$@")
      CURRENT=$#
      _hyracli' zsh-test "$zsh_script" "$@")
    [[ $got == "$want" ]] || fail "zsh: '$*' gives '$got', not '$want'"
  }
  zsh_expect "storage completion" hyracli sto
  zsh_expect "add set remove activate deactivate injectfault" "${tarn[@]}" kiroprovider ""
  zsh_expect "--vp-name -v --vp-url -U --arrayid -a --priority -p --isactive -i --help -h" \
    "${add[@]}" -v vp3 -
  zsh_expect "true false" "${add[@]}" --isactive ""
  zsh_expect "true false" "${add[@]}" --isactive=
  zsh_expect "(directories)" hyracli --plugin-dir ""
  zsh_expect "" hyracli storage bogus ""
else
  echo "zsh is not installed: its script is not checked"
fi

((failures == 0)) || exit 1
echo "completion: all cases pass"
