#!/bin/sh
# Runs a command inside a private D-Bus session bus with a fresh GNOME keyring,
# created and unlocked without any question, in a throw-away home folder.
# usage: with_keyring.sh COMMAND [ARGS...]
# Nothing stays running: the keyring daemon ends with the bus.
set -eu
home=$(mktemp -d)
trap 'rm -rf "$home"' EXIT
export HOME="$home" XDG_DATA_HOME="$home/data" XDG_CONFIG_HOME="$home/config"
export XDG_RUNTIME_DIR="$home/run" XDG_CACHE_HOME="$home/cache"
mkdir -p "$XDG_RUNTIME_DIR" && chmod 700 "$XDG_RUNTIME_DIR"
dbus-run-session -- sh -c '
  printf "keyring-test" | gnome-keyring-daemon --replace --unlock --components=secrets >/dev/null
  "$@"' sh "$@"
