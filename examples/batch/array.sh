#!/bin/bash
# Plans one part of a batch: a task of a job array of a batch system.
#
#     array.sh REQUESTS FOLDER PARTS
#
# The batch system says in a variable of the environment which task of the array this is, from 1 to
# PARTS; this script knows those of three. To hand it in:
#
#     sbatch --array=1-100 array.sh requests.jsonl answers 100
#     qsub -J 1-100 -- array.sh requests.jsonl answers 100
#     qsub -t 1-100 array.sh requests.jsonl answers 100
#
# A task that was killed can be handed in again, and goes on where it was. When all are done:
#
#     LC_ALL=C sort --merge --field-separator=: --key=2,2n answers/*.jsonl >answers.jsonl
#
# VORKEL names the program.
set -euo pipefail

if (($# != 3)) || ! [[ $3 =~ ^[1-9][0-9]{0,5}$ ]]; then
  printf '%s\n' "usage: array.sh REQUESTS FOLDER PARTS, in a task of a job array" >&2
  exit 2
fi
requests=$1 folder=$2 parts=$3
index=${SLURM_ARRAY_TASK_ID:-${PBS_ARRAY_INDEX:-${SGE_TASK_ID:?is set in a job array only}}}
mkdir -p -- "$folder"
file=$folder/$index.jsonl

# The task is done when its file is there; the status also tells of requests that are off.
"${VORKEL:-vorkel}" batch "$requests" --shard "$index/$parts" -o "$file" --resume || [[ -e $file ]]
