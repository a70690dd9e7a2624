# shellcheck shell=bash disable=SC2154 # run-case, which reads this file, sets share, name, build, here and others
# The emulated machine: the words in which a case describes it, and its life from power-on to power-off.

devices=()                    # qemu's arguments, beside those that every machine has
started=()                    # the processes to end
firmware=bios                 # or uefi
board=q35                     # or microvm
sockets=$(mktemp -d)          # paths of sockets have to be short

# machine ARGUMENT...: qemu arguments.
machine() { devices+=("$@"); }

# uefi: the machine starts by UEFI firmware instead of a BIOS.
uefi() { firmware=uefi; }

# bare: the machine has no firmware to speak of, no PCI and no other bus with a device on it.
bare() { board=microvm; }

# disk NAME: a blank disk for a -device ...,drive=NAME.
disk() {
  truncate -s 16M "$share/$1.disk"
  devices+=(-drive "if=none,id=$1,format=raw,file=$share/$1.disk")
}

# network NAME: a network without anything outside for a -device ...,netdev=NAME. Cards get no boot ROM: nothing boots by them.
network() { devices+=(-netdev "user,id=$1,restrict=on"); }

# structure TYPE HANDLE BYTES TEXT...: an SMBIOS structure with these bytes behind its header and these strings. Bytes are
# pairs of hexadecimal digits; the handle is four of them.
structure() {
  local type=$1 handle=$2 bytes file=$share/structure-$1-$2 byte text
  bytes=${3//[[:space:]]/}
  shift 3
  printf -v bytes '%02x%02x%s%s%s' "$type" $((4 + ${#bytes} / 2)) "${handle:2:2}" "${handle:0:2}" "$bytes"
  {
    for ((byte = 0; byte < ${#bytes}; byte += 2)); do
      # shellcheck disable=SC2059 # the format is the byte
      printf "\\x${bytes:byte:2}"
    done
    for text in "$@"; do
      printf '%s\0' "$text"
    done
    [ $# -gt 0 ] || printf '\0'
    printf '\0'
  } >"$file"
  devices+=(-smbios "file=$file")
}

# monitor: the commands of the case may steer the emulator.
monitor() {
  mkfifo "$sockets/monitor.in" "$sockets/monitor.out"
  # shellcheck disable=SC2054 # the commas are qemu's
  devices+=(-chardev "pipe,id=monitor,path=$sockets/monitor" -mon chardev=monitor,mode=readline)
}

# program COMMAND...: a process beside the machine, which ends with it.
program() {
  "$@" >"$share/program.log" 2>&1 &
  started+=($!)
}

# guest: the commands of the case, on standard input; see guest/session for what they find.
guest() { cat >"$share/commands"; }

endAll() {
  local process
  for process in "${started[@]}"; do
    kill "$process" 2>/dev/null || true
    wait "$process" 2>/dev/null || true
  done
  rm -rf "$sockets"
}

# died WORDS...: ends the test, with what the machine said last.
died() {
  echo "$name: $*"
  echo "--- the last lines of its console ($share/console)"
  tail -n 25 "$share/console" 2>/dev/null | tr -d '\r'
  echo "--- what its commands complained of ($share/errors)"
  tail -n 15 "$share/errors" 2>/dev/null || true
  exit 1
}

# The file system that the kernel starts with: a shell, and the modules that lead to the host's files, in their order.
makeInitramfs() {
  local root=$machine_folder/root folder=$share/initramfs module release
  release=$(cat "$machine_folder/release")
  mkdir -p "$folder/bin" "$folder/modules"
  cp "$root/bin/busybox" "$folder/bin/"
  cp "$here/guest/init" "$folder/init"
  chmod +x "$folder/init"
  for module in virtio_pci virtio_mmio 9pnet_virtio 9p overlay; do
    "$root/tools/modprobe" -d "$root" -S "$release" --show-depends "$module"
  done | sed -n 's/^insmod \([^ ]*\).*/\1/p' | awk '!seen[$0]++' >"$share/modules"
  while read -r module; do
    cp "$module" "$folder/modules/"
    basename "$module"
  done <"$share/modules" >"$folder/modules/order"
  (cd "$folder" && find . | "$root/bin/cpio" --quiet -o -H newc) >"$share/initramfs.cpio"
  rm -rf "$folder" "$share/modules"
}

qemu() {
  local root=$machine_folder/root libraries
  libraries=$root/usr/lib/x86_64-linux-gnu
  LD_LIBRARY_PATH=$libraries:$root/lib/x86_64-linux-gnu QEMU_MODULE_DIR=$libraries/qemu \
    exec "$root/usr/bin/qemu-system-x86_64" "$@"
}

boot() {
  local root=$machine_folder/root kernel=$machine_folder/vmlinux all
  cp "$here/guest/session" "$share/session"
  printf '%s=%q\n' MACHINE "$root" PROGRAMS "$build" RELEASE "$(cat "$machine_folder/release")" >"$share/settings"
  makeInitramfs

  local connector=virtio-9p-pci chosen=$board clock=""
  if [ "$board" = microvm ]; then
    connector=virtio-9p-device
    chosen=microvm,auto-kernel-cmdline=off
    # It has no clock to measure that of the processor by, which is the clock of this machine.
    clock="tsc_early_khz=$(sed -n "s/^cpu MHz.*: *\([0-9]*\)\..*/\1000/p" /proc/cpuinfo | head -n 1)"
  fi
  # shellcheck disable=SC2054 # the commas are qemu's
  all=(-nodefaults -no-user-config -display none -vga none -no-reboot
    -machine "$chosen,accel=tcg" -cpu qemu64 -m 512 -smp 1
    -L "$root/usr/share/qemu" -L "$root/usr/share/seabios"
    -serial "file:$share/console"
    -fsdev local,id=host,path=/,security_model=none,readonly=on,multidevs=remap
    -device "$connector,fsdev=host,mount_tag=host"
    -fsdev "local,id=share,path=$share,security_model=none,multidevs=remap"
    -device "$connector,fsdev=share,mount_tag=share")
  if [ "$firmware" = uefi ]; then
    # UEFI firmware starts kernels as it starts any program: packed, with the part that makes a program of it.
    kernel=$root/boot/vmlinuz-$(cat "$machine_folder/release")
    cp "$root/usr/share/OVMF/OVMF_VARS_4M.fd" "$share/variables"
    all+=(-drive "if=pflash,format=raw,readonly=on,file=$root/usr/share/OVMF/OVMF_CODE_4M.fd"
      -drive "if=pflash,format=raw,file=$share/variables")
  fi
  all+=(-kernel "$kernel" -initrd "$share/initramfs.cpio"
    -append "console=ttyS0 quiet loglevel=4 panic=-1 mitigations=off nokaslr no_timer_check reboot=t $clock")

  qemu "${all[@]}" "${devices[@]}" >"$share/qemu.log" 2>&1 &
  local process=$! end=$((SECONDS + bound)) begin=$SECONDS
  started+=("$process")
  while kill -0 "$process" 2>/dev/null; do
    [ "$SECONDS" -lt "$end" ] || died "the machine did not come to an end within $bound seconds"
    # What the guest asks of the emulator; see guest/session.
    if [ -f "$share/asked" ]; then
      cat "$share/asked" >"$sockets/monitor.in"
      rm "$share/asked"
    fi
    sleep 0.2
  done
  wait "$process" || died "the emulator failed: $(cat "$share/qemu.log")"
  [ -f "$share/finished" ] || died "the machine stopped before its commands were done. $(cat "$share/qemu.log")"
  echo "$name: ran $((SECONDS - begin)) s"
}
