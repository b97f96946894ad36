#!/usr/bin/env bash
# autopkgtest.sh: runs in the bare root behind inside.sh: debian/tests, by autopkgtest itself, which installs
# what each test wants of the packages in /srv/new.

set -euo pipefail
export LC_ALL=C DEBIAN_FRONTEND=noninteractive
cd /srv
printf '\n== autopkgtest\n'
printf 'deb [trusted=yes] file:/srv/new ./\n' >/etc/apt/sources.list.d/libschema.list
apt-get -qq update
apt-get -qq -y --no-install-recommends install autopkgtest >apt.log 2>&1 || { cat apt.log; exit 1; }
autopkgtest --no-built-binaries new/*.deb libschema/ --output-dir results -- null >autopkgtest.log 2>&1 ||
  { tail -n 60 autopkgtest.log; exit 1; }
cat results/summary
