#!/bin/bash
# Plans a batch with GNU parallel, a part on each processor.
#
#     parallel.sh REQUESTS RESULT [PARTS [OPTION OF parallel...]]
#
# Each part is a shard of the requests, 16 by default, with a file of its own below RESULT.parts.
# Interrupted and started again, parts that are done are left as they are, and the others go on where
# they were. With `--sshloginfile hosts`, parallel spreads the parts over other machines, which need
# the program and the same folder. VORKEL names the program.
set -euo pipefail

if (($# < 2)) || ! [[ ${3:-16} =~ ^[1-9][0-9]{0,5}$ ]]; then
  printf '%s\n' "usage: parallel.sh REQUESTS RESULT [PARTS [OPTION OF parallel...]]" >&2
  exit 2
fi
requests=$1 result=$2 parts=${3:-16}
shift $(($# < 3 ? $# : 3))
export VORKEL=${VORKEL:-vorkel} REQUESTS=$requests FOLDER=$result.parts PARTS=$parts
mkdir -p -- "$FOLDER"

# A part is done when its file is there; its status also tells of requests that are off.
part() {
  local file=$FOLDER/$1.jsonl
  "$VORKEL" batch "$REQUESTS" --shard "$1/$PARTS" -o "$file" --resume --quiet || [[ -e $file ]]
}
export -f part

seq "$parts" | SHELL=/bin/bash parallel "$@" \
  --env part --env VORKEL --env REQUESTS --env FOLDER --env PARTS part '{}'

# Each line begins with its number, {"line":17,...: all parts together in the order of the requests.
files=()
for ((index = 1; index <= parts; ++index)); do
  files+=("$FOLDER/$index.jsonl")
done
LC_ALL=C sort --merge --field-separator=: --key=2,2n -- "${files[@]}" >"$result.new"
mv -- "$result.new" "$result"
