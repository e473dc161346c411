#!/usr/bin/env bash
# Lets mixed clients loose on `cimom serve` with an appliance of its own, by HTTPS with passwords:
# they enumerate, get, associate, pull, leave pulls open, rename, change partitions by jobs and back,
# ask wrongly, sign in wrongly, and go away in the middle. Prints once a minute the most that the
# server had of memory, threads, descriptors and children.
#
#   scripts/load.sh                         an hour of eight clients on a release build
#   scripts/load.sh --minutes N             shorter or longer; 2 at the least
#   scripts/load.sh --clients N --percent N
#                                           so many, and all of it at most so much of a core (25)
#   scripts/load.sh --build FOLDER          programs of a build folder that stands already
#
# Exits with 0 when all answers were as expected, and the server at rest has no more at the end than
# after the first minute.
. "$(dirname "$0")/common.sh"

folder=
minutes=60
clients=8
percent=25
while [ $# -gt 0 ]; do
    case $1 in
        --build) folder=${2:?--build needs a build folder}; shift 2 ;;
        --minutes) minutes=${2:?--minutes needs a number}; shift 2 ;;
        --clients) clients=${2:?--clients needs a number}; shift 2 ;;
        --percent) percent=${2:?--percent needs a number}; shift 2 ;;
        -h | --help) sed -n '2,/^\./{/^\./d;s/^# \{0,1\}//;p}' "$0"; exit 0 ;;
        *) die "unknown argument '$1'; see $0 --help" ;;
    esac
done

if [ -z "$folder" ]; then
    install_missing $packages_build openssl python3
    build release -DZEM_BUILD_TESTS=OFF -DZEM_BUILD_BENCH=OFF
    folder=$top/build/release
fi
folder=$(cd "$folder" && pwd)
state=$(mktemp -d)
server=
trap '[ -z "$server" ] || kill "$server" 2>/dev/null || :; wait; rm -rf "$state"' EXIT

export PATH="$folder/bin:$PATH" APPLIANCE_HOME="$state/appliance"
export CIMOM_REGISTRATION="$folder/lib/zemproviders.json" CIMOM_SCHEMA="$top/providers/mof/zem.mof"
cd "$state"
appliance init
umask 077
name=$(id -un)
password=$(openssl rand -hex 8)
printf '%s:%s\n' "$name" "$(openssl passwd -6 "$password")" >passwords
openssl req -x509 -newkey ec -pkeyopt ec_paramgen_curve:P-256 -nodes -keyout key -out certificate \
    -days 2 -subj /CN=localhost 2>/dev/null
cimom serve --port 0 --certificate certificate --key key --passwords passwords >said &
server=$!
until port=$(sed -n 's/^serving .*:\([0-9]*\)$/\1/p' said) && [ -n "$port" ]; do
    kill -0 "$server" 2>/dev/null || die "the server does not start"
    sleep 0.1
done
status=0
nice -n 19 python3 "$top/scripts/load.py" \
    "$port" "$server" "$name" "$password" "$minutes" "$clients" "$percent" || status=$?
kill "$server"
wait "$server" || die "the server ended with $?"
server=
exit $status
