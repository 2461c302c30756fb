#!/usr/bin/env bash
# hyracli's manual pages: mandoc finds nothing to warn about, and every
# command the tool's help lists has a page that shows what its --help shows.
#
#   ManPageTest.sh MAN1-DIRECTORY HYRACLI
set -u
pages=$1
hyracli=$2
failures=0
fail() {
  echo "FAIL: $*"
  failures=$((failures + 1))
}

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export HYRA_SIM_DB=$work/world.db

lint=$(mandoc -Tlint "$pages"/*.1 2>&1) || fail "mandoc -Tlint exits with an error"
[[ -z $lint ]] || fail "mandoc -Tlint warns: $lint"

# The rendered page as plain text, with the hyphenation at line ends undone.
render() { MANWIDTH=200 mandoc -Tascii -O width=200 "$1" | col -b; }

# Checks the page of the command reached by the words, against its --help.
check_command() {
  local page
  page="$pages/hyracli-$(IFS=-; echo "$*").1"
  if [[ ! -f $page ]]; then
    fail "no page for '$*'"
    return
  fi
  local text help
  text=$(render "$page")
  help=$("$hyracli" "$@" --help)
  local option
  while read -r option; do
    [[ $text == *"$option"* ]] || fail "the page of '$*' lacks $option"
  done < <(sed -n 's/^  \(--[^ ,]*\(, -.\)\{0,1\}\)  .*/\1/p' <<<"$help")
  local description
  description=$(sed -n '3p' <<<"$help")
  [[ $text == *"$description"* ]] || fail "the page of '$*' lacks its description '$description'"
  checked=$((checked + 1))
}

# Walks the tree through the help of each namespace.
walk() {
  local listing section name
  listing=$("$hyracli" "$@")
  section=
  while IFS= read -r line; do
    case $line in
      Namespaces:) section=ns ;;
      Commands:) section=cmd ;;
      "  "*)
        name=${line#  }
        name=${name%% *}
        [[ $section == ns ]] && walk "$@" "$name"
        [[ $section == cmd ]] && check_command "$@" "$name"
        ;;
      *) section= ;;
    esac
  done <<<"$listing"
}

checked=0
walk storage
((checked > 0)) || fail "no command was found through the help"
tool=$(render "$pages/hyracli.1")
for section in "EXIT STATUS" ENVIRONMENT HYRA_SIM_DB HYRACLI_PLUGIN_DIR --formatter; do
  [[ $tool == *"$section"* ]] || fail "hyracli(1) lacks $section"
done
# One page per command and the tool's own, none left over.
count=$(find "$pages" -name '*.1' | wc -l)
((count == checked + 1)) || fail "$count pages for $checked commands"

((failures == 0)) || exit 1
echo "manual pages: $checked commands checked"
