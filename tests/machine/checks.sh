# shellcheck shell=bash disable=SC2154 # run-case, which reads this file, sets share, name, build, here and others
# What a case expects of the files that its commands wrote. Each check is noted as the case is read, and made when the
# machine has run; all are made, so that one run tells all that is wrong.

checks=()
suspects=() # the files that a check failed on

# check COMMAND...: notes a check.
check() { checks+=("$(printf '%q ' "$@")"); }

# holds FILE PATTERN: one line of FILE, and no second, is like PATTERN, a pattern of the shell over the whole line.
holds() { check lineIsThereOnce "$@"; }

# holdsAll FILE PATTERNS: for each line of the file PATTERNS, which may not be empty, one line of FILE, and no second.
holdsAll() { check linesAreThere "$@"; }

# lacks FILE PATTERN: no line of FILE, which may not be empty, is like PATTERN.
lacks() { check lineIsNotThere "$@"; }

# empty FILE: it is there, and holds nothing.
empty() { check holdsNothing "$@"; }

# agree FILE FILE: both hold the same bytes, and some.
agree() { check bytesAgree "$@"; }

# below FILE NUMBER: the number in FILE is smaller.
below() { check numberIsBelow "$@"; }

# here FILE COMMAND...: runs a command on the host once the machine has run; FILE gets its output.
here() { check runsHere "$@"; }

hasText() {
  [ ! -s "$1" ] || return 0
  echo "$1 is empty or not there"
  return 1
}

# linesLike FILE PATTERN: how many there are.
linesLike() {
  local line count=0
  while IFS= read -r line || [ -n "$line" ]; do
    # shellcheck disable=SC2053 # a pattern is meant
    [[ ${line%$'\r'} != $2 ]] || count=$((count + 1))
  done <"$1"
  echo "$count"
}

lineIsThereOnce() {
  local count
  hasText "$1" || return 1
  count=$(linesLike "$1" "$2")
  [ "$count" -ne 1 ] || return 0
  echo "$count lines of $1 are like: $2"
  suspects+=("$1")
  return 1
}

linesAreThere() {
  local pattern failed=0
  hasText "$2" || return 1
  while IFS= read -r pattern; do
    lineIsThereOnce "$1" "$pattern" || failed=1
  done <"$2"
  return $failed
}

lineIsNotThere() {
  hasText "$1" || return 1
  [ "$(linesLike "$1" "$2")" -ne 0 ] || return 0
  echo "$1 has a line like: $2"
  suspects+=("$1")
  return 1
}

holdsNothing() {
  [ -e "$1" ] || { echo "$1 is not there"; return 1; }
  [ -s "$1" ] || return 0
  echo "$1 is not empty"
  suspects+=("$1")
  return 1
}

bytesAgree() {
  hasText "$1" || return 1
  ! cmp "$1" "$2" || return 0
  diff "$1" "$2" | head -n 20
  return 1
}

numberIsBelow() {
  local number
  hasText "$1" || return 1
  number=$(cat "$1")
  if [[ $number =~ ^-?[0-9]+$ ]] && [ "$number" -lt "$2" ]; then
    return 0
  fi
  echo "$1 holds $number, which is not a number below $2"
  return 1
}

runsHere() {
  local file=$1
  shift
  ! "$@" >"$file" || return 0
  echo "failed: $*"
  return 1
}

verify() {
  local one failed=0
  [ ${#checks[@]} -gt 0 ] || { echo "$name checks nothing"; exit 1; }
  cd "$share" || exit 1
  for one in "${checks[@]}"; do
    eval "$one" >check.log 2>&1 || { failed=$((failed + 1)); sed 's/^/FAILED: /' check.log; }
  done
  rm -f check.log ./*.disk initramfs.cpio
  if [ "$failed" -eq 0 ]; then
    echo "$name: ${#checks[@]} checks passed"
    return
  fi
  [ -s errors ] && suspects+=(errors)
  for one in $(printf "%s\n" "${suspects[@]}" | sort -u); do
    echo "--- $share/$one"
    tail -n 80 "$one"
  done
  echo "$name: $failed of ${#checks[@]} checks failed"
  exit 1
}
