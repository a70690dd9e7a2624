# shellcheck shell=bash
# Whole processes, timed and compared. Read by bench/run, bench/discovery/run, and on the emulated machine.

PATH=$PATH:/usr/sbin:/sbin # an ordinary user's lacks them

# shortest TIMES COMMAND...: the microseconds of the shortest of so many runs. Fails, and says nothing, where the command fails.
shortest() {
  local times=$1 best="" begin took
  shift
  while [ "$times" -gt 0 ]; do
    begin=${EPOCHREALTIME//[.,]/}
    "$@" >/dev/null || return
    took=$((${EPOCHREALTIME//[.,]/} - begin))
    if [ -z "$best" ] || [ "$took" -lt "$best" ]; then best=$took; fi
    times=$((times - 1))
  done
  echo "$best"
}

# milliseconds MICROSECONDS: as a text with three digits behind the point.
milliseconds() { printf '%d.%03d' $(($1 / 1000)) $(($1 % 1000)); }

# inventories TIMES SWINV: prints lines process NAME MICROSECONDS VERSIONS for swinv list, lshw -json and dmidecode: how long
# the shortest took, and how many versions and revisions it tells, those of hardware among them. What cannot do its work on this
# machine has no line.
inventories() {
  local times=$1 swinv=$2 tool took
  for tool in lshw dmidecode; do
    command -v "$tool" >/dev/null || { echo "$tool is not installed: scripts/install-packages bench" >&2; return 1; }
  done
  took=$(shortest "$times" "$swinv" list) || return
  echo "process swinv $took $("$swinv" list --format csv --property VersionString | sed 1d | grep -c '[0-9]')"
  took=$(shortest "$times" lshw -json 2>/dev/null) &&
    echo "process lshw $took $(lshw -json 2>/dev/null | grep -c '"[a-z]*version" : "\|"firmware" : "')"
  took=$(shortest "$times" dmidecode 2>/dev/null) &&
    echo "process dmidecode $took $(dmidecode | grep -c '\(Version\|Revision\): .*[0-9]')"
  return 0
}
