#!/usr/bin/env bash
# run_document.sh DOCUMENT: runs each command that the document shows after "$ ", in the working directory, and fails unless
# it prints what the document shows below it. The caller plays tendril-ctl: a command's arguments, with tabs between them,
# go to it as a line on standard error; it writes the files "out" and "error", and the exit code as a line on standard input.
set -u
export HOME=$PWD
unset XDG_CONFIG_HOME XDG_STATE_HOME
scratch=$(dirname "$PWD")
exec 8>&2 7<&0

tendril-ctl() {
  local code IFS=$'\t'
  echo "$*" >&8
  read -r code <&7
  cat "$scratch/out"
  cat "$scratch/error" >&2
  return "$code"
}

shown=$(sed -n '/^    \$ /,/^$/{/./p}' "$1")
printed=$(while IFS= read -r line; do
  [[ $line == '    $ '* ]] || continue
  echo "$line"
  eval "${line#    $ }" </dev/null >"$scratch/printed" 2>&1
  sed 's/^./    &/' "$scratch/printed"
done <<<"$shown")
[[ $shown && $printed == "$shown" ]] && exit
diff <(echo "$shown") <(echo "$printed")
echo "$1: < is shown, > is what the commands print"
exit 1
