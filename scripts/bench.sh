#!/usr/bin/env bash
# Installs what is missing, builds, runs the benchmarks and prints how each compares with its rival.
#
#   scripts/bench.sh                        release build, every benchmark
#   scripts/bench.sh --build FOLDER         programs of a build folder that stands already
#   scripts/bench.sh --only REGEX           only benchmarks (rival included) whose name matches
#   scripts/bench.sh --server NAME=PORT     another CIM server of this machine as a rival, too; may
#                                           be given more than once (docs/performance.md)
#
# Exits with 0 when every ratio and counter keeps its limit.
. "$(dirname "$0")/common.sh"

folder=
only=.
servers=()
while [ $# -gt 0 ]; do
    case $1 in
        --build) folder=${2:?--build needs a build folder}; shift 2 ;;
        --only) only=${2:?--only needs a regular expression}; shift 2 ;;
        --server) servers+=("${2:?--server needs a name and a port}"); shift 2 ;;
        -h | --help) sed -n '2,/^\./{/^\./d;s/^# \{0,1\}//;p}' "$0"; exit 0 ;;
        *) die "unknown argument '$1'; see $0 --help" ;;
    esac
done

if [ -z "$folder" ]; then
    install_missing $packages_build $packages_bench
    build release -DZEM_BUILD_TESTS=OFF -DZEM_BUILD_BENCH=ON
    folder=$top/build/release
fi

results=$(mktemp -d)
trap 'rm -rf "$results"' EXIT
for program in "$folder"/bench/*; do
    [ -f "$program" ] && [ -x "$program" ] || continue
    name=$(basename "$program")
    say "$name"
    rivals=()
    [ "$name" != ServeBench ] || rivals=(${servers[@]+"${servers[@]}"})
    # Rivals take turns, so that what else the machine does weighs on both.
    "$program" --benchmark_filter="$only" --benchmark_repetitions=5 \
        --benchmark_enable_random_interleaving=true \
        --benchmark_out="$results/$name.json" --benchmark_out_format=json \
        ${rivals[@]+"${rivals[@]}"} >/dev/null
done

# The rows: benchmark, rival, how many times the rival's time it may take, milliseconds on top.
python3 - "$results" ${servers[@]+"${servers[@]%%=*}"} <<'PY'
import glob, json, statistics, sys

ROWS = [
    ("ParseRecords/100000", "LibcsvRecords/100000", 1.0, 0),
    ("ParseRecords/100000", "LibcsvKeyed/100000", 1.0, 0),
    ("ParseRecords/100000", "LibcsvRows/100000", None, 0),
    ("ParseRecords/1000000", "ParseRecords/100000", 20.0, 0),
    ("Broker_EnumInstances/100", "Plain_EnumInstances/100", None, 0),
    ("Broker_EnumInstances/10000", "Broker_EnumInstances/100", 125.0, 0),
    ("Broker_GetInstance/10000", "Broker_GetInstance/100", 125.0, 0),
    ("Frame_EnumInstanceNames", "Worker_EnumInstanceNames", None, 0),
    ("TimingOff_OneOperation", "Frame_EnumInstanceNames", 0.05, 0),
    ("HashJoin_EnumNames/100", "CrossProduct_EnumNames/100", None, 0),
    ("HashJoin_EnumNames/1000", "CrossProduct_EnumNames/1000", 0.02, 0),
    ("HashJoin_EnumNames/4000", "HashJoin_EnumNames/1000", 6.0, 0),
    ("HashJoin_AssociatorNames/1000", "Plain_AssociatorNames/1000", None, 0),
    ("HashJoin_AssociatorNames/10000", "HashJoin_AssociatorNames/1000", 15.0, 0),
    ("NtoN_AssociatorNames/1000", "Plain_AssociatorNames/1000", None, 0),
    ("NtoN_AssociatorNames/10000", "NtoN_AssociatorNames/1000", 15.0, 0),
    ("MultiNtoN_EnumNames", "Rows_EnumNames", None, 0),
    ("ExecuteCommand/real_time", "SpawnReadWait/real_time", 1.5, 0),
    ("ExecuteCommandInServerAsUser/real_time", "ExecuteCommandInServer/real_time", 2.0, 0),
    ("Qyalloc/1000/manual_time", "QyallocSpawn/1000/manual_time", 1.35, 0),
    ("GetAllLpars/1000", "SqliteWalkLpars/1000", 10.0, 0),
    ("GetAllLpars/10000", "SqliteWalkLpars/10000", 10.0, 0),
    ("GetAllLpars/10000", "GetAllLpars/1000", 15.0, 0),
    ("WalkLpars/1000", "WalkLpars/100", 20.0, 0),
    ("LookUp/10", "LookUpInVector/10", 3.0, 0),
    ("LookUp/100", "LookUpInVector/100", 2.0, 0),
    ("LookUp/1000", "LookUpInVector/1000", 2.0, 0),
    ("LookUp/1", "LookUpInMap/1", None, 0),
    ("LookUp/10", "LookUpInMap/10", None, 0),
    ("LookUp/100", "LookUpInMap/100", None, 0),
    ("LookUp/1000", "LookUpInMap/1000", None, 0),
    ("Adapters", "PlainFields", 3.0, 0),
    ("EventDelay/iterations:30/manual_time", "JournalDelay/iterations:30/manual_time", 2.0, 0),
    ("IndicationDelay/iterations:30/manual_time", "EventDelay/iterations:30/manual_time", 1.5, 0),
    ("IndicationDelay/iterations:30/manual_time", "AskATool/real_time", None, 0),
    ("Settings/10000/iterations:1/repeats:1/manual_time",
     "Settings/100/iterations:1/repeats:1/manual_time", 120.0, 0),
    ("Pools/64/1000/iterations:1/repeats:1/manual_time",
     "Pools/8/125/iterations:1/repeats:1/manual_time", 12.0, 0),
    ("PoolTies/64/1000/iterations:1/repeats:1/manual_time",
     "PoolTies/8/125/iterations:1/repeats:1/manual_time", 12.0, 0),
    ("Served/enumerate/1/real_time", "Direct/enumerate/1/real_time", None, 0),
    ("Served/enumerate/100/real_time", "Direct/enumerate/100/real_time", None, 0),
    ("Served/enumerate/1000/real_time", "Direct/enumerate/1000/real_time", None, 0),
    ("Served/enumerate/10000/real_time", "Direct/enumerate/10000/real_time", None, 0),
    ("Served/enumerate/100000/real_time", "Served/enumerate/10000/real_time", 20.0, 0),
    ("Served/connect/1/manual_time", "Served/get/1/manual_time", None, 0),
    ("Served/connect/8/manual_time", "Served/get/8/manual_time", None, 0),
]
# Each of these against every other server.
SERVED = (["enumerate/%d/real_time" % count for count in (1, 100, 1000, 10000)] +
          ["%s/%d/manual_time" % (how, clients) for how in ("get", "connect") for clients in (1, 8)])
ROWS += [("Served/" + row, server + "/" + row, 1.0, 0) for server in sys.argv[2:] for row in SERVED]
# Counters: benchmark, counter, the most that it may be: of memory in the worst repetition, of
# shares and times in the middle one.
COUNTERS = [
    ("Served/enumerate/100000/real_time", "grown_KB", 5000),
    ("GetAllLpars/1000", "resident_MB", 100),
    ("QyallocSplit/1000/manual_time", "ours_percent", 10),
    ("Initialize/1000/iterations:1/repeats:1/manual_time", "ours_percent", 10),
    ("Settings/1000/iterations:1/repeats:1/manual_time", "ours_percent", 38),
    ("SettingsSplit/1000/iterations:1/repeats:1/manual_time", "model_percent", 22),
    ("SettingsSplit/1000/iterations:1/repeats:1/manual_time", "broker_percent", 12),
    ("EventDelay/iterations:30/manual_time", "median_ms", 25),
    ("IndicationDelay/iterations:30/manual_time", "median_ms", 25),
    ("JournalDelay/iterations:30/manual_time", "median_ms", 25),
    ("Settings/10000/iterations:1/repeats:1/manual_time", "resident_KB", 5),
]
TO_MS = {"ns": 1e-6, "us": 1e-3, "ms": 1.0, "s": 1e3}

runs = {}
for path in glob.glob(sys.argv[1] + "/*.json"):
    with open(path) as file:
        text = file.read()
    for run in json.loads(text)["benchmarks"] if text.strip() else []:
        if run["run_type"] == "iteration":
            runs.setdefault(run["run_name"], []).append(run)

def median(name):
    # Programs that sleep are timed by the clock, the others by the processor.
    key = "real_time" if name.endswith(("/real_time", "/manual_time")) else "cpu_time"
    return statistics.median(run[key] * TO_MS[run["time_unit"]] for run in runs[name])

paired = set()
failed = False
print("%-28s %12s   %-28s %12s %8s  %s" % ("benchmark", "ms", "rival", "ms", "ratio", "limit"))
for name, rival, factor, slack in ROWS:
    if name not in runs or rival not in runs:
        continue
    paired |= {name, rival}
    mine, theirs = median(name), median(rival)
    limit = "none"
    if factor is not None:
        kept = mine <= theirs * factor + slack
        failed = failed or not kept
        limit = "%.4g x%s %s" % (factor, " + %g ms" % slack if slack else "",
                                 "kept" if kept else "BROKEN")
    print("%-28s %12.4g   %-28s %12.4g %8.2f  %s" % (name, mine, rival, theirs, mine / theirs, limit))
for name, counter, most in COUNTERS:
    if name not in runs:
        continue
    judged = max if counter.endswith("B") else statistics.median
    value = judged(run[counter] for run in runs[name])
    failed = failed or value > most
    print("%-28s %12.4g   %-50s  at most %g %s"
          % (name, value, counter, most, "kept" if value <= most else "BROKEN"))
for name in sorted(name for name in runs if "median_us" in runs[name][0]):
    print("%-34s %10.0f requests a second, %.0f us for one" % (
        name, *(statistics.median(run[counter] for run in runs[name])
                for counter in ("items_per_second", "median_us"))))
for name in sorted(set(runs) - paired):
    print("%-28s %12.4g" % (name, median(name)))
sys.exit(failed)
PY
