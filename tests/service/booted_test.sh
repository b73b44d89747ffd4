#!/usr/bin/env bash
# What happens to the service in a system from its installation to its purge, over one new boot. Run by
# service_test.service, in a container that it ends with its status.
set -euo pipefail
cd /service_test
# shellcheck source=scripts/documents.sh
. ./documents.sh
unit=vantel-host.service
configuration=/etc/vantel-host/vantel-host.toml

fail() {
  echo "FAILED: $*"
  exit 1
}

# Ends the container, unless it is to boot anew.
end() { # status
  if [[ $finished != yes ]]; then
    echo "FAILED: ended with status $1, after:"
    systemctl --no-pager status $unit || true
    journalctl --boot --no-pager --lines=100 | grep -v ' pair ' || true
    systemctl exit 1
  fi
}

# Waits for a command to succeed.
await() { # seconds, command...
  local end=$((SECONDS + $1))
  shift
  until "$@" >/dev/null 2>&1; do
    ((SECONDS < end)) || fail "never held: $*"
    sleep 0.2
  done
}

expect_equal() { # what, expected, actual
  [[ $2 == "$3" ]] || fail "$1: expected '$2', and is '$3'"
}

property() { # name
  systemctl show --value --property "$1" $unit
}

daemons() {
  pgrep --exact --full --uid vantel-host '.*/ptp4l .*'
}

is_another() { # former, command...
  local former=$1 now
  shift
  now=$("$@") && [[ -n $now && $now != 0 && $now != "$former" ]]
}

is_locked() { vantel-host status; }
is_not_locked() { ! vantel-host status; }

set_priority() { # value
  sed -i -E "s/^#? *priority1 *=.*/priority1 = $1/" $configuration
}

# --- before the first boot's end

# The first ten of the document.
TenCommandsGiveALockedClock() {
  local command number=0
  while IFS= read -r command; do
    echo "$((++number)): $command"
    timeout 60 bash -c "$command" </dev/null 2>&1 || fail "command $number ended with $?"
    [[ $number != 1 ]] || StartsOnlyWithAnInterface
  done < <(commands_of service.md | head -n 10)
  expect_equal "count of commands" 10 "$number"
}

# The last one of the document.
AnswersPtp4lsOwnClient() {
  local command
  command=$(commands_of service.md | tail -n 1)
  echo "$command"
  bash -c "$command" | grep -q 'portState *UNCALIBRATED' || fail "it is not answered"
}

# After the first of these commands.
StartsOnlyWithAnInterface() {
  expect_equal "is it enabled" disabled "$(systemctl is-enabled $unit)"
  expect_equal "does it run" inactive "$(systemctl is-active $unit)"
  if systemctl start $unit; then
    fail "it starts without an interface"
  fi
  expect_equal "its status" "2 0" "$(property ExecMainStatus) $(property NRestarts)"
  journalctl --unit $unit | grep -q interface || fail "it does not say that the interface is missing"
  systemctl reset-failed $unit
  expect_equal "what systemd dislikes" "" "$(systemd-analyze verify --man=no $unit 2>&1 || true)"
  # The daemon that it follows came just now.
  systemctl enable --now grandmaster
}

ChronydFollowsIt() {
  is_locked || fail "it is not locked"
  await 30 eval 'chronyc -n sources | grep -q "^#\* PTP"'
}

HasTheRightsOfItsUserAndThreeMore() {
  local process
  for process in "$(property MainPID)" "$(daemons)"; do
    expect_equal "user" vantel-host "$(stat -c %U "/proc/$process")"
    # Bits 10, 12 and 13: CAP_NET_BIND_SERVICE, CAP_NET_ADMIN, CAP_NET_RAW.
    expect_equal "capabilities" 0000000000003400 "$(sed -n 's/^CapEff:\t//p' "/proc/$process/status")"
  done
}

RestartsADaemonThatWasKilled() {
  local host daemon
  host=$(property MainPID)
  daemon=$(daemons)
  kill -KILL "$daemon"
  await 20 is_another "$daemon" daemons
  await 30 is_locked
  expect_equal "the host" "$host" "$(property MainPID)"
}

GivesUpADaemonThatHangs() {
  local host daemon
  sed -i '/^restart = /a give-up-after = 3' $configuration
  systemctl restart $unit
  await 30 is_locked
  host=$(property MainPID)
  daemon=$(daemons)
  kill -STOP "$daemon"
  await 20 is_not_locked
  await 40 is_another "$daemon" daemons
  await 30 is_locked
  expect_equal "the host" "$host" "$(property MainPID)"
  journalctl --unit $unit | grep -q 'lost for [0-9]* s' || fail "it was not given up"
  [[ ! -e /proc/$daemon ]] || fail "the daemon that hung is still there"
  expect_equal "zombies" "" "$(pgrep --parent "$host" --runstates Z || true)"
  sed -i '/^give-up-after = /d' $configuration
  systemctl restart $unit
  await 30 is_locked
}

StartsAnewWhenTheHostWasKilled() {
  local host daemon
  host=$(property MainPID)
  daemon=$(daemons)
  kill -KILL "$host"
  await 20 is_another "$host" property MainPID
  await 30 is_locked
  expect_equal "daemons" 1 "$(daemons | wc -l)"
  is_another "$daemon" daemons || fail "the daemon of the killed host is still there"
}

StartsAnewWhenBothWereKilled() {
  local host
  host=$(property MainPID)
  kill -KILL "$host" "$(daemons)"
  await 20 is_another "$host" property MainPID
  await 30 is_locked
}

WatchdogEndsAHostThatHangs() {
  local host
  mkdir -p /run/systemd/system/$unit.d
  printf '[Service]\nWatchdogSec=3\n' >/run/systemd/system/$unit.d/watchdog.conf
  systemctl daemon-reload
  systemctl restart $unit
  await 30 is_locked
  host=$(property MainPID)
  sleep 6 # longer than the watchdog waits: a host that works is left alone
  expect_equal "the host" "$host" "$(property MainPID)"
  kill -STOP "$host"
  await 30 is_another "$host" property MainPID
  journalctl --unit $unit | grep -q 'Watchdog timeout' || fail "it was not the watchdog"
  rm -r /run/systemd/system/$unit.d
  systemctl daemon-reload
  systemctl restart $unit
  await 30 is_locked
}

ReloadTakesNewSettings() {
  local host
  host=$(property MainPID)
  set_priority 77
  systemctl reload $unit
  await 30 eval 'grep -Eq "^priority1[[:space:]]+77$" /run/vantel-host/morwen/ClockHub/ptp4l_bc.conf'
  await 30 is_locked
  expect_equal "the host" "$host" "$(property MainPID)"
}

ReloadOfABadFileChangesNothing() {
  local host daemon
  host=$(property MainPID)
  daemon=$(daemons)
  cp $configuration good
  set_priority '"high"'
  systemctl reload $unit
  await 10 eval "journalctl --unit $unit --lines=20 | grep 'priority1'"
  cp good $configuration
  is_locked || fail "it is not locked"
  expect_equal "host and daemon" "$host $daemon" "$(property MainPID) $(daemons)"
}

TellsThatTheGrandmasterIsGone() {
  systemctl stop grandmaster
  await 30 is_not_locked
  systemctl start grandmaster
  await 40 is_locked
}

UpgradeKeepsTheConfigurationAndStartsIt() {
  local host
  host=$(property MainPID)
  cp $configuration good
  apt-get -q -y install ./upgrade/vantel-host_*.deb
  is_another "$host" property MainPID || fail "the former host still runs"
  await 30 is_locked
  cmp good $configuration || fail "the configuration is another"
  expect_equal "is it enabled" enabled "$(systemctl is-enabled $unit)"
}

StopLeavesNothing() {
  local start=$SECONDS
  systemctl stop $unit
  ((SECONDS - start < 20)) || fail "it took $((SECONDS - start)) s"
  expect_equal "its result" success "$(property Result)"
  if daemons; then
    fail "ptp4l is still there"
  fi
  [[ ! -e /run/vantel-host ]] || fail "its folder is still there"
}

# --- after a new boot

RunsAfterANewBoot() {
  await 40 is_locked
  await 30 eval 'chronyc -n sources | grep -q "^#\* PTP"'
}

RemovedAndPurgedItLeavesNothing() {
  echo 1 >/var/lib/vantel-host/run.jsonl
  apt-get -q -y remove vantel-host
  if daemons || pgrep --exact vantel-host; then
    fail "it still runs"
  fi
  apt-get -q -y purge vantel-host
  expect_equal "what is left" "" "$(find /etc /usr /var/lib /run -name '*vantel-host*' \
    ! -path '/var/lib/dpkg/*' ! -path '/etc/chrony/*' ! -path '*.service.d*' ! -path '/run/systemd/*')"
  expect_equal "unit" not-found "$(property LoadState)"
}

run() { # test...
  local name start
  for name in "$@"; do
    start=$SECONDS
    echo "==> $name"
    "$name"
    echo "passed, $((SECONDS - start)) s"
  done
}

finished=no
trap 'end $?' EXIT
if [[ ! -e booted ]]; then
  touch booted
  # The document is in a package that is not installed yet.
  dpkg-deb --fsys-tarfile vantel-host_*.deb | tar -x --to-stdout ./usr/share/doc/vantel-host/service.md >service.md
  run TenCommandsGiveALockedClock ChronydFollowsIt AnswersPtp4lsOwnClient HasTheRightsOfItsUserAndThreeMore \
    RestartsADaemonThatWasKilled GivesUpADaemonThatHangs StartsAnewWhenTheHostWasKilled StartsAnewWhenBothWereKilled \
    WatchdogEndsAHostThatHangs ReloadTakesNewSettings ReloadOfABadFileChangesNothing \
    TellsThatTheGrandmasterIsGone UpgradeKeepsTheConfigurationAndStartsIt StopLeavesNothing
  finished=yes
  systemctl reboot
else
  run RunsAfterANewBoot RemovedAndPurgedItLeavesNothing
  echo "service_test: passed"
  finished=yes
  systemctl exit 0
fi
