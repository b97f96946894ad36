#!/usr/bin/env bash
# inside.sh: runs in the bare root, where scripts/bare-root has put the packages of 1.0.0 into /srv/old, the new
# ones into /srv/new, and the sources into /srv/libschema.

set -euo pipefail
export LC_ALL=C DEBIAN_FRONTEND=noninteractive
cd /srv

title() {
  printf '\n== %s\n' "$*"
}

# use FOLDER...: the packages in these folders can be installed beside Debian's.
use() {
  local folder
  for folder in "$@"; do
    printf 'deb [trusted=yes] file:/srv/%s ./\n' "$folder"
  done >/etc/apt/sources.list.d/libschema.list
  apt-get -qq update
}

install() {
  apt-get -qq -y --no-install-recommends install "$@" >/srv/apt.log 2>&1 || { cat /srv/apt.log; exit 1; }
}

# What is there: packages and files, but for what apt, dpkg and ldconfig note for themselves and /srv.
state() {
  dpkg-query --show --showformat='${db:Status-Abbrev} ${Package}\n' | sort
  find / \( -path /proc -o -path /sys -o -path /dev -o -path /srv -o -path /var/cache -o -path /var/log \
    -o -path /var/lib/apt -o -path /var/lib/dpkg -o -path /etc/apt -o -path /etc/ld.so.cache \) -prune \
    -o -print | sort
}

versions() {
  dpkg-query --show --showformat='${Package} ${Version} ${db:Status-Status}\n' '*schema*' |
    awk '$3 == "installed" { print $1, $2 }'
}

title 'What the consumers are compiled with'
apt-get -qq update
install g++ cmake make pkg-config
state >before

title 'The packages of 1.0.0, and a program that is linked with them'
use old
install libschema-dev schema-migrate
versions
schema-migrate --version
g++ -std=c++17 libschema/tests/package/consumer/takeover.cpp -o takeover $(pkg-config --cflags --libs libschema)
mkdir out
./takeover libschema/examples/old libschema/examples/new out

title 'Upgrade'
use old new
install libschema-dev schema-migrate libschema-doc
versions
[ "$(schema-migrate --version)" = "schema-migrate $(cat libschema/VERSION)" ]

title 'The program of 1.0.0 runs as before'
./takeover libschema/examples/old libschema/examples/new out
! ldd ./takeover | grep 'not found'
ldd ./takeover | grep schema

title 'The example is migrated by the installed tool'
su -s /bin/sh -c /srv/libschema/debian/tests/migrate nobody
title 'Consumers by pkg-config and by CMake, shared and static'
su -s /bin/sh -c /srv/libschema/debian/tests/consumer nobody
ls /usr/share/man/man1/schema-migrate.1.gz /usr/share/doc/libschema-doc/html/index.html

title 'Remove and purge'
rm -f /tmp/attr.txt /tmp/orvattr.txt /tmp/objectclass.txt /tmp/lexan.txt  # the library's, by its rules
mapfile -t ours < <(versions | cut -d ' ' -f 1)
apt-get -qq -y remove "${ours[@]}" >/srv/apt.log
apt-get -qq -y purge "${ours[@]}" >/srv/apt.log
apt-get -qq -y --purge autoremove >/srv/apt.log
[ -z "$(versions)" ]
state >after
diff before after
printf 'nothing is left behind\n'
