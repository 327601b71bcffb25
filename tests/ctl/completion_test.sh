#!/usr/bin/env bash
# completion_test.sh PROGRAM: the shell completion and the manual page of tendril-ctl have what --help has, and no more.
set -o pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/../../packaging" || exit
program=$1
failed=0

# same WHAT WANTED FOUND: the same words, in any order.
set -f  # the words are no patterns
same() {
  local wanted found
  wanted=$(printf '%s\n' $2 | sort -u)
  found=$(printf '%s\n' $3 | sort -u)
  [[ $wanted == "$found" ]] && return
  diff <(echo "$wanted") <(echo "$found")
  echo "$1: < is in the help, > is here"
  failed=1
}

# What bash offers for the last one of the words.
source completion/tendril-ctl
offered() {
  COMP_WORDS=(tendril-ctl "$@") COMP_CWORD=$#
  _tendril_ctl
  printf '%s\n' "${COMPREPLY[@]}"
}
# What is declared for zsh after a command, or without one. The file has no syntax that bash does not know.
declared() {
  local command=$1 words=(- "$1")
  source completion/_tendril-ctl | sed 's/\[.*\]\(:\?\).*/\1/'
}
_arguments() {
  if [[ $1 == -C && $command ]]; then state=argument; else printf '%s\n' "$@"; fi
}

help=$("$program" --help)
commands=$(sed -n '/^Commands:/,/^$/s/^  \([a-z-]*\) .*/\1/p' <<<"$help")
exit_codes=$(sed -n '/^Exit codes:/,$s/^  \([0-9]*\) .*/\1/p' <<<"$help")
all_options='--help --version'
all_usages=''
same 'commands in bash' "$commands" "$(offered '')"
same 'commands in zsh' "$commands" "$(declared '' | sed -n 's/^1:command:(\(.*\))/\1/p')"
same 'options in bash' "$all_options" "$(offered --)"
same 'after an option in bash' "$commands" "$(offered --demo '')"
same 'after an option with a value in bash' "$commands" "$(offered --port 1 --output f --backup f '')"
for command in $commands; do
  help=$("$program" "$command" --help)
  # "send FILE ID..."; "--json" and "--port:", which takes a value.
  usages=$(sed -nE 's/^(Usage:|      ) tendril-ctl (.*) \[OPTION\.\.\.\]$/\2/p' <<<"$help")
  options=$(sed -nE 's/^  (--[a-z-]+) [A-Z|]+  .*/\1:/p; s/^  (-h, )?(--[a-z-]+)  .*/\2/p' <<<"$help")
  all_options+=" ${options//:/}"
  all_usages+=" $usages"
  declared=$(declared "$command")
  same "$command in bash" "${options//:/}" "$(offered "$command" -)"
  same "$command in zsh" "$options" "$(grep -e ^-- <<<"$declared")"
  case $usages in
    *' FILE'*) wanted='man completion/tendril-ctl 1:FILE:_files' ;;
    *' FOLDER'*) wanted='man 1:FOLDER:_files -/' ;;
    *) wanted='' ;;
  esac
  same "$command's files" "$wanted" \
    "$(offered "$command" ma; offered "$command" completion/t; grep '^1:F.*_files' <<<"$declared")"
done

page=$(tr -d '\134' <man/tendril-ctl.1)
same 'commands in the page' "$all_usages" "$(sed -n 's/^\.SS //p' <<<"$page")"
same 'options in the page' "$all_options" "$(sed -nE 's/^\.BI? (-[hv], )?(--[a-z-]+).*/\2/p' <<<"$page")"
same 'options in the text of the page' "$all_options" "$(grep -oe '--[a-z][a-z-]*' <<<"$page")"
same 'exit codes in the page' "$exit_codes" "$(sed -nE 's/^\.B ([0-9]+)$/\1/p' <<<"$page")"
exit $failed
