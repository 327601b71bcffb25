#!/usr/bin/env bash
# completion_test.sh CTL BENCH: the shell completions and the manual pages of the two have what --help has, and no more.
set -o pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/../../packaging" || exit
program=$1
bench=$2
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
source completion/tendril-bench
completed=ctl  # or bench
offered() {
  COMP_WORDS=("tendril-$completed" "$@") COMP_CWORD=$#
  "_tendril_$completed"
  printf '%s\n' "${COMPREPLY[@]}"
}
# What is declared for zsh after a command, or without one. The files have no syntax that bash does not know.
declared() {
  local command=$1 words=(- "$1")
  source "completion/_tendril-$completed" | sed 's/\[.*\]\(:\?\).*/\1/'
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
    "$(offered "$command" ma; offered "$command" completion/tendril-c; grep '^1:F.*_files' <<<"$declared")"
done

page=$(tr -d '\134' <man/tendril-ctl.1)
same 'commands in the page' "$all_usages" "$(sed -n 's/^\.SS //p' <<<"$page")"
same 'options in the page' "$all_options" "$(sed -nE 's/^\.BI? (-[hv], )?(--[a-z-]+).*/\2/p' <<<"$page")"
same 'options in the text of the page' "$all_options" "$(grep -oe '--[a-z][a-z-]*' <<<"$page")"
same 'exit codes in the page' "$exit_codes" "$(sed -nE 's/^\.B ([0-9]+)$/\1/p' <<<"$page")"

completed=bench
help=$("$bench" --help | grep -v -e --help-all)
options=$(sed -nE 's/^  (-[hv], )?(--[a-z-]+) <.*>.*/\2:/p; s/^  (-[hv], )?(--[a-z-]+)  .*/\2/p' <<<"$help")
faults=$(sed -n '/^Faults:/,/^$/s/^  \([a-z-]*\) .*/\1/p' <<<"$help")
behaviours=$(sed -n '/^Behaviours/,/^$/s/^  \([a-z-]*\) .*/\1/p' <<<"$help")
same 'options of the bench in bash' "${options//:/}" "$(offered -)"
same 'options of the bench in zsh' "$options" "$(declared '' | tr -d '*')"
same 'options in the page of the bench' "${options//:/}" \
  "$(tr -d '\134' <man/tendril-bench.1 | sed -nE 's/^\.BI? (-[hv], )?(--[a-z-]+).*/\2/p')"
same 'faults in bash' "$faults" "$(offered --fault '')"
same 'behaviours in bash' "$behaviours" "$(offered --panel-behaviour '')"
same 'faults and behaviours in zsh' "$faults $behaviours" "$(sed -nE '/^(faults|behaviours)=/,/\)$/p' completion/_tendril-bench |
  tr '()' '\n\n' | grep -v =)"
exit $failed
