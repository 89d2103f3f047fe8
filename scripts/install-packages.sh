#!/usr/bin/env bash
# Installs the Debian packages the build and the tests need (listed in packages.txt).
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
sudo_cmd=""
[ "$(id -u)" -eq 0 ] || sudo_cmd="sudo"
export DEBIAN_FRONTEND=noninteractive
$sudo_cmd apt-get update -qq
# shellcheck disable=SC2046
$sudo_cmd apt-get install -y -qq --no-install-recommends $(grep -v '^#' "$here/packages.txt") >/dev/null
# The tests run the dialogs under a German locale (a decimal comma) as well:
# generated here when the machine doesn't have it yet.
if ! locale -a 2>/dev/null | grep -qix 'de_DE\.utf-\?8'; then
    $sudo_cmd localedef -i de_DE -f UTF-8 de_DE.UTF-8
fi
