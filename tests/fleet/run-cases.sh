#!/bin/bash
# Runs differential cases inside one sandbox (tools/sandbox with the simulated
# console, the result folders bound): for each case folder (made by
# generate-cases.py or by hand) first the one-machine survey tool once per
# machine in turn, then the console-wide survey at each job count, each run
# starting from empty result folders. Everything a run leaves is copied into
# the case folder for the caller to compare:
#
#   <case>/<run>/stdout, stderr, exit-status, calls (the console's invocation
#   log), tmp (what is left in /tmp), VPD/ and Trace/ (the result folders)
#
# <run> is "reference" for the one-machine tool, whose one trace is kept per
# machine under the name the console-wide survey gives it, and "j<N>" for the
# console-wide survey with --jobs N.
set -euo pipefail
export LC_ALL=C

usage() {
    echo "usage: $0 ONE_MACHINE_TOOL CONSOLE_WIDE_TOOL JOBS CASE_FOLDER..." >&2
    echo "  JOBS: job counts separated by commas, e.g. 1,4,32" >&2
    exit 64
}

[[ $# -ge 3 ]] || usage
readonly one_machine_tool=$1 console_wide_tool=$2 job_counts=$3
shift 3

readonly vpd=/var/adm/quorvex/VPD trace=/var/adm/quorvex/Trace
readonly trace_name=quorvexPYLON_VPD_Survey_ClientPartition

# The result folders may be missing or read-only: the runs must cope with it.
clear_result_folders() {
    local folder
    for folder in "$vpd" "$trace"; do
        if [[ -d $folder && -w $folder ]]; then
            find "$folder" -mindepth 1 -delete
        fi
    done
}

tmp_entries() {
    find /tmp -mindepth 1 -maxdepth 1 -printf '%f\n' | LC_ALL=C sort
}

keep_results() {
    local out=$1
    mkdir -p "$out/VPD" "$out/Trace"
    if [[ -d $vpd ]]; then cp -a "$vpd/." "$out/VPD/"; fi
    if [[ -d $trace ]]; then cp -a "$trace/." "$out/Trace/"; fi
    comm -13 "$out/../kept-in-tmp" <(tmp_entries) > "$out/tmp"
}

# The identities given on the command line, each once, in order.
distinct_identities() {
    awk '!seen[$0]++' "$1/identities"
}

run_reference() {
    local case=$1 out=$1/reference identity
    mkdir -p "$out/traces"
    clear_result_folders
    : > "$out/stdout"
    : > "$out/stderr"
    export PYLON_SIM_LOG=$out/calls
    : > "$PYLON_SIM_LOG"
    while IFS= read -r identity; do
        rm -f "$trace/$trace_name.Trace"
        "$one_machine_tool" -c "$identity" >> "$out/stdout" 2>> "$out/stderr" || true
        if [[ -e $trace/$trace_name.Trace ]]; then
            mv "$trace/$trace_name.Trace" "$out/traces/${trace_name}_$identity.Trace"
        fi
    done < <(distinct_identities "$case")
    keep_results "$out"
    rmdir "$out/Trace"
    mv "$out/traces" "$out/Trace"
}

run_console_wide() {
    local case=$1 jobs=$2 out=$1/j$2 status=0
    local -a arguments
    mkdir -p "$out"
    clear_result_folders
    export PYLON_SIM_LOG=$out/calls
    : > "$PYLON_SIM_LOG"
    if [[ $(cat "$case/mode") == all ]]; then
        arguments=(--all)
    else
        mapfile -t arguments < "$case/identities"
    fi
    "$console_wide_tool" -j "$jobs" "${arguments[@]}" > "$out/stdout" 2> "$out/stderr" || status=$?
    echo "$status" > "$out/exit-status"
    keep_results "$out"
}

# A case holds its console (console.scn) or names a shipped one by its path.
console_of() {
    if [[ -e $1/console.scn ]]; then
        echo "$1/console.scn"
    else
        cat "$1/shipped-console"
    fi
}

for case in "$@"; do
    PYLON_SIM_SCENARIO=$(console_of "$case")
    export PYLON_SIM_SCENARIO
    tmp_entries > "$case/kept-in-tmp"
    run_reference "$case"
    IFS=, read -r -a jobs_list <<< "$job_counts"
    for jobs in "${jobs_list[@]}"; do
        run_console_wide "$case" "$jobs"
    done
done
