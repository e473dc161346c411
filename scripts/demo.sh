#!/usr/bin/env bash
# Installs what is missing, builds, and shows a CIM request from end to end: an appliance, its
# tool asked by hand, the same asked through CIM, the pools of a host, what a partition runs with
# beside what its profile says, a partition defined, its profile changed, started, changed by a job,
# moved to another host while a client watches, stopped and destroyed, what a client reads when
# a thing is not there, and where the time goes when a stock client of CIM-XML asks.
#
#   scripts/demo.sh
#
# Leaves nothing behind but the build, with a picture in it. Exits with 0 when everything shown was as it should be.
. "$(dirname "$0")/common.sh"

case ${1:-} in
    '') ;;
    -h | --help) sed -n '2,/^\./{/^\./d;s/^# \{0,1\}//;p}' "$0"; exit 0 ;;
    *) die "unknown argument '$1'; see $0 --help" ;;
esac

install_missing $packages_build sblim-wbemcli
build release -DZEM_BUILD_TESTS=OFF -DZEM_BUILD_BENCH=OFF

folder=$(mktemp -d)
server=
trap '[ -z "$server" ] || kill $server; rm -rf "$folder"' EXIT
# quoted <word>...: the words as one would type them.
quoted() {
    local line= word
    for word in "$@"; do
        case $word in
            *[!A-Za-z0-9_.,/:=-]*) line+="'$word' " ;;
            *) line+="$word " ;;
        esac
    done
    printf '%s' "${line% }"
}

# show <expected exit status> <command>...: prints the command, runs it, holds it to its status.
# What it prints on standard output is in $said, too, until the next.
said=$folder/said
show() {
    local expected=$1 status=0
    shift
    printf '\n$ %s\n' "$(quoted "$@")"
    "$@" | tee "$said" || status=$?
    [ "$status" -eq 0 ] || printf '(exit status %d)\n' "$status"
    [ "$status" -eq "$expected" ] || die "expected exit status $expected"
}

# beside <class> <InstanceID> <InstanceID>: shows two of a class next to each other.
beside() {
    local side line=
    for side in 2 3; do
        cimom gi "$1.InstanceID=\"${!side}\"" >"$folder/side$side" || die "no ${!side}"
        line+=" <($(quoted cimom gi "$1.InstanceID=\"${!side}\""))"
    done
    printf '\n$ pr -mt -w 130%s\n' "$line"
    pr -mt -w 130 "$folder/side2" "$folder/side3"
}

# set_up <variable> <value>: exports it, and prints how.
set_up() {
    printf '$ export %s=%s\n' "$1" "$(quoted "$2")"
    export "$1=$2"
}

say "where things are"
printf '$ export PATH=%s:$PATH\n' "$(quoted "$top/build/release/bin")"
export PATH="$top/build/release/bin:$PATH"
set_up APPLIANCE_HOME "$folder/appliance"
set_up CIMOM_REGISTRATION "$top/build/release/lib/zemproviders.json"
set_up CIMOM_SCHEMA "$top/providers/mof/zem.mof"
set_up CLASSPATH "$top/build/release/lib/appliance-events.jar"     # for indications

host='ORXC_CEC_CS.CreationClassName="ORXC_CEC_CS",Name='

say "an appliance with hosts and partitions"
show 0 appliance init
show 0 appliance show

say "its tool, asked by hand"
show 0 qyplat -r sys -F type_model,serial_num,name,state
mtms=$(head -1 "$said" | cut -d, -f1,2 | tr ',' '*')
show 0 qyplat -r lpar -m "$mtms" -F lpar_id,name,lpar_env,state

say "the same through CIM: broker, provider, frame, tool"
show 0 cimom ein ORXC_CEC_CS
hosts=$(wc -l <"$said")
show 0 cimom ein ORXC_LPAR_CS
partitions=$(wc -l <"$said")
show 0 cimom ei ORXC_CEC_CS
show 0 cimom ei ORXC_LPAR_CS --properties ElementName,State,LparEnvironment

say "one object by its path"
show 0 cimom gi "$host\"$mtms\""

say "its partitions, by way of an association"
show 0 cimom ain "$host\"$mtms\"" --assoc-class ORXC_HostedPartition

say "its pools; who has processors from one of them, and how much may be asked for"
show 0 cimom ain "$host\"$mtms\"" --assoc-class ORXC_HostedResourcePool
pools=$(wc -l <"$said")
pool="ORXC_ProcessorPool.InstanceID=\"ORX:3-1*$mtms\""
show 0 cimom gi "$pool"
show 0 cimom ain "$pool" --assoc-class ORXC_ResourceAllocationFromPool
show 0 cimom ain "$pool" --assoc-class ORXC_ElementCapabilities
show 0 cimom ai "$(cat "$said")" --assoc-class ORXC_SettingsDefineCapabilities \
    --properties ElementName,VirtualQuantity,Reservation,Limit

say "what a partition runs with, beside what its profile says"
partition="ORXC_LPAR_CS.CreationClassName=\"ORXC_LPAR_CS\",Name=\"4*$mtms\""
show 0 edalloc -r mem -o a --id 4 -q 256 -m "$mtms"     # not in the profile
show 0 cimom ain "$partition" --assoc-class ORXC_SettingsDefineState
running=$(sed -n 's/.*InstanceID="\(.*\)"/\1/p' "$said")
show 0 cimom ri "$partition" --result-class ORXC_ElementSettingData
show 0 cimom ain "$partition" --assoc-class ORXC_ElementSettingData
defined=$(sed -n '1s/.*InstanceID="\(.*\)"/\1/p' "$said")
for class in VirtualSystemSettingData ProcessorRASettingData MemoryRASettingData; do
    beside ORXC_$class "$running" "$defined"
done
show 0 cimom ain "ORXC_VirtualSystemSettingData.InstanceID=\"$running\"" \
    --assoc-class ORXC_VSSDComponent

say "a partition defined by the host's service, with its first profile"
# service <host>: the path of what makes, changes and removes the host's partitions.
service() {
    local class=ORXC_VirtualSystemManagementService
    printf '%s.SystemCreationClassName="ORXC_CEC_CS",SystemName="%s",' $class "$1"
    printf 'CreationClassName="%s",Name="VirtualSystemManagement"' $class
}
show 0 cimom im "$(service "$mtms")" DefineSystem \
    'SystemSettings=instance of ORXC_VirtualSystemSettingData {
        LparName = "made \"by hand\", 1"; ProfileName = "normal"; VirtualSystemType = "tmxlinux" }' \
    'ResourceSettings={instance of ORXC_ProcessorRASettingData {
        ConsumerVisibility = 3; SharingMode = "cap"; Minimum = 10; Reservation = 50; Limit = 100;
        VirtualMinimum = 100; VirtualQuantity = 100; VirtualMaximum = 200 },
    instance of ORXC_MemoryRASettingData { ConsumerVisibility = 2;
        VirtualMinimum = 262144; VirtualQuantity = 524288; VirtualMaximum = 1048576 },
    instance of ORXC_EthernetAdapterRASettingData { SlotID = 4; PortVLANID = 7;
        IEEECompatible = 1; AddVLANIDs = {20, 30} }}'
made=$(sed -n 's/^ResultingSystem = "\(.*\)";$/\1/p' "$said" | sed 's/\\"/"/g')
id=${made##*=\"} id=${id%%\**}

say "its profile changed: of what is not sent, nothing"
profile="ORX:2*normal-$id*$mtms"
show 0 cimom im "$(service "$mtms")" ModifyResourceSettings \
    "ResourceSettings={instance of ORXC_MemoryRASettingData {
        InstanceID = \"$profile\"; VirtualQuantity = 786432 }}"
show 0 qyplat -r prof -m "$mtms" --filter "lpar_ids=$id" \
    -F min_mem,desired_mem,max_mem,virtual_eth_adapters

say "started, and changed while it runs: by a job, which cimom follows"
show 0 cimom im "$made" RequestStateChange RequestedState=2
show 0 cimom im "$(service "$mtms")" AddResourceSettings \
    "AffectedConfiguration=ORXC_VirtualSystemSettingData.InstanceID=\"ORX:4*$id*$mtms\"" \
    'ResourceSettings={instance of ORXC_EthernetAdapterRASettingData { SlotID = 5; PortVLANID = 3 }}'
show 0 qyalloc -r virtualio --rsubtype eth --level lpar -m "$mtms" --filter "lpar_ids=$id" \
    -F slot_num,port_vlan_id,mac_addr
show 1 cimom im "$(service "$mtms")" ModifyResourceSettings \
    "ResourceSettings={instance of ORXC_MemoryRASettingData {
        InstanceID = \"ORX:4*$id*$mtms\"; VirtualQuantity = 2097152 }}"
show 0 cimom mi "$made" 'ElementName=renamed while it runs'
show 1 cimom di "$made"

say "moved to another host, while a client watches"
show 0 edpower -r lpar --id 1 -o on -f normal -m "beta lab"     # serves its disks there
steps=$folder/steps
printf '\n$ cimom watch --count 12 ORXC_PartitionMove >%s &\n' "$steps"
timeout 120 cimom watch --count 12 ORXC_PartitionMove >"$steps" 2>"$steps.err" &
watcher=$!
until grep -qs watching "$steps.err" || ! kill -0 $watcher 2>/dev/null; do sleep 0.1; done
cat "$steps.err"
printf '\n$ APPLIANCE_MOVE_SECONDS=2 %s &\n' "$(quoted domove -o m -m "$mtms" -t "beta lab" --id "$id")"
APPLIANCE_MOVE_SECONDS=2 domove -o m -m "$mtms" -t "beta lab" --id "$id" &
mover=$!
show 0 sleep 1
show 0 qymove -r lpar -m "$mtms" --filter "lpar_ids=$id" \
    -F name,migration_state,dest_sys_name,bytes_transmitted,bytes_remaining
printf '\n$ wait\n'
wait $mover
wait $watcher || die "not all steps of the move were told"
show 0 grep -E ' (State|PercentComplete) =' "$steps"
show 0 qyplat -r lpar -m "beta lab" -F lpar_id,name,state
id=$(sed -n 's/,renamed.*//p' "$said")

say "stopped and deleted there"
there="ORXC_LPAR_CS.CreationClassName=\"ORXC_LPAR_CS\",Name=\"$id*1111-AAB*0000002\""
show 0 cimom im "$there" RequestStateChange RequestedState=3
show 0 cimom im "$(service '1111-AAB*0000002')" DestroySystem "AffectedSystem=$there"
show 0 appliance check

say "what a client reads when a thing is not there"
show 5 cimom gi 'ORXC_Unknown.Name="1"'
show 6 cimom gi "$host\"9999-ZZZ*0000000\""
show 6 cimom --messages "$top/providers/messages" --language de gi "$host\"9999-ZZZ*0000000\""

say "served to a stock client, which knows CIM-XML alone"
served=$folder/served trace=$folder/trace
printf '\n$ VM_CIMPROVIDER_TRACE=1 VM_CIMPROVIDER_TRACE_PATH=%s cimom serve --port 0 &\n' "$trace"
VM_CIMPROVIDER_TRACE=1 VM_CIMPROVIDER_TRACE_PATH=$trace cimom serve --port 0 >"$served" &
server=$!
until grep -qs serving "$served" || ! kill -0 $server 2>/dev/null; do sleep 0.1; done
cat "$served"
url=$(sed -n 's/^serving //p' "$served")/root/cimv2
show 0 wbemcli ein "$url:ORXC_CEC_CS"
show 0 wbemcli -nl gi "$url:$host\"$mtms\""
for class in ORXC_LPAR_CS ORXC_VirtualSystemSettingData ORXC_ProcessorRASettingData; do
    printf '\n$ %s | wc -l\n' "$(quoted wbemcli ei "$url:$class")"
    wbemcli ei "$url:$class" | wc -l
done
printf '\n$ %s | wc -l\n' "$(quoted wbemcli ai "$url:$host\"$mtms\"")"
wbemcli ai "$url:$host\"$mtms\"" | wc -l
sleep 1     # the trace is written twice a second
kill $server
wait $server || die "the server did not end well"
server=

say "where the time went"
picture=$top/build/release/timeline.svg
show 0 zemtrace report "$trace"
show 0 zemtrace timeline "$trace" -o "$picture"

printf '\nShown: %s hosts and %s partitions through CIM, one object by path, its partitions and\n%s pools by association, what a partition runs with beside its profile,\nthe life of a partition, a move between hosts by its indications,\ntwo failures by name, one of them in German too, a stock client over HTTP,\nand the time of its requests: see the picture %s\n' \
    "$hosts" "$partitions" "$pools" "$picture"
