"""A fleet of installations below one private folder, and ansible-playbook over it.

Sites are made from the examples, each customised in its own way. Everything that Ansible writes lies in the
folder, too: its home, its temporary files, its sockets.
"""

import ctypes
import hashlib
import json
import os
import pathlib
import re
import shutil
import stat
import subprocess
import tempfile

TOOL = pathlib.Path(os.environ["SCHEMA_MIGRATE"])
SOURCE = pathlib.Path(os.environ["SOURCE"])
EXAMPLES = SOURCE / "examples"
PLAYBOOKS = {
    "upgrade.yml": """---
- name: Upgrade
  hosts: all
  gather_facts: false
  environment: "{{ test_environment }}"
  roles:
    - directory.schema.upgrade
""",
    "rollback.yml": """---
- name: Roll back
  hosts: all
  gather_facts: false
  environment: "{{ test_environment }}"
  tasks:
    - name: Roll back
      ansible.builtin.import_role:
        name: directory.schema.upgrade
        tasks_from: rollback
""",
}
SANITIZERS = ("ASAN_OPTIONS", "LSAN_OPTIONS", "UBSAN_OPTIONS")


def expect(what, expected, actual):
    if isinstance(expected, dict) and isinstance(actual, dict):
        names = [name for name in sorted(set(expected) | set(actual)) if expected.get(name) != actual.get(name)]
        expected, actual = ({name: side.get(name) for name in names} for side in (expected, actual))
    if expected != actual:
        raise SystemExit(f"{what}, expected:\n{expected}\n{what}, actual:\n{actual}")


def expect_in(what, part, text):
    if part not in text:
        raise SystemExit(f"{what} lacks:\n{part}\nand is:\n{text}")


def tree(folder):
    """Every entry with all that can change: kind and mode, owner, size, time, bytes."""
    entries = {}
    for path in sorted(pathlib.Path(folder).rglob("*")):
        about = path.lstat()
        content = hashlib.sha256(path.read_bytes()).hexdigest() if path.is_file() else ""
        entries[str(path.relative_to(folder))] = (oct(about.st_mode), about.st_uid, about.st_gid, about.st_ino,
                                                  about.st_mtime_ns, content)
    return entries


def contents(folder):
    return {path.name: path.read_bytes() for path in sorted(pathlib.Path(folder).iterdir())}


class Site:
    """One installation: its schema directory, its options for the tool, and what the role is told of it."""

    def __init__(self, fleet, name, start="base", changes=(), options=(), variables=None):
        self.name = name
        self.home = fleet.hosts / name
        self.schema = self.home / "schema"
        self.work = self.home / "schema.upgrade"
        self.options = list(options)
        self.variables = dict(variables or {})
        self.home.mkdir(parents=True, exist_ok=True)
        shutil.copytree(EXAMPLES / start, self.schema)
        for file, text, other in changes:
            path = self.schema / file
            before = path.read_text()
            if text and before.count(text) != 1:
                raise SystemExit(f"{file} of {start} has {before.count(text)} times: {text}")
            path.write_text(before.replace(text, other) if text else before + other)
        fleet.sites[name] = self

    def keep_original(self, fleet):
        """A copy to compare with. The directory gets a mode that is not the usual one."""
        self.schema.chmod(0o750)
        self.mode = oct(self.schema.stat().st_mode)
        kept = fleet.root / "kept" / self.name
        shutil.copytree(self.schema, kept)
        return kept


class Fleet:
    def __init__(self):
        self.root = pathlib.Path(tempfile.mkdtemp(prefix="schema-fleet-")).resolve()
        self.hosts = self.root / "hosts"
        self.control = self.root / "control"
        for folder in (self.control / "decisions", self.root / "home", self.root / "remote", self.root / "tmp",
                       self.root / "by-hand"):
            folder.mkdir(parents=True)
        for release in ("base", "new"):
            shutil.copytree(EXAMPLES / release, self.root / release)
        self.sites = {}
        self.connection = {"ansible_connection": "local"}
        self.settings = {}
        for name, text in PLAYBOOKS.items():
            (self.control / name).write_text(text)
        (self.root / "ansible.cfg").write_text("")

    def __enter__(self):
        return self

    def __exit__(self, *ignored):
        shutil.rmtree(self.root)

    def environment(self):
        kept = {name: os.environ[name] for name in ("PATH",) + SANITIZERS if name in os.environ}
        kept["PATH"] = f"{TOOL.parent}:{kept['PATH']}"
        return dict(
            kept, HOME=str(self.root / "home"), TMPDIR=str(self.root / "tmp"), LC_ALL="C.UTF-8",
            ANSIBLE_HOME=str(self.root / "home/.ansible"), ANSIBLE_CONFIG=str(self.root / "ansible.cfg"), ANSIBLE_NOCOLOR="1",
            ANSIBLE_COLLECTIONS_PATH=str(SOURCE / "ansible"), ANSIBLE_FORKS="4", ANSIBLE_PIPELINING="true",
            ANSIBLE_RETRY_FILES_ENABLED="false", PYTHONDONTWRITEBYTECODE="1", **self.settings)

    def write_inventory(self):
        # What goes to a host goes there as a variable, since SSH brings no environment along.
        sanitizers = {name: os.environ[name] for name in SANITIZERS if name in os.environ}
        everywhere = dict(
            self.connection, ansible_python_interpreter="/usr/bin/python3", ansible_remote_tmp=str(self.root / "remote"),
            test_environment=dict(sanitizers, PATH=f"{TOOL.parent}:{os.environ['PATH']}", TMPDIR=str(self.root / "tmp"),
                                  PYTHONDONTWRITEBYTECODE="1"),
            schema_upgrade_directory=f"{self.hosts}/{{{{ inventory_hostname }}}}/schema",
            schema_upgrade_base=str(self.root / "base"), schema_upgrade_to=str(self.root / "new"))
        hosts = {name: site.variables for name, site in self.sites.items()}
        (self.root / "inventory.json").write_text(json.dumps({"all": {"vars": everywhere, "hosts": hosts}}))

    # With a group, its process group stands in that file, so that it can be killed.
    def play(self, *arguments, playbook="upgrade.yml", group=None, **variables):
        self.write_inventory()
        command = ["ansible-playbook", "-i", str(self.root / "inventory.json"), str(self.control / playbook),
                   *arguments]
        if variables:
            command += ["--extra-vars", json.dumps(variables)]
        playing = subprocess.Popen(command, env=self.environment(), cwd=self.control, stdin=subprocess.DEVNULL,
                                   stdout=subprocess.PIPE, stderr=subprocess.STDOUT, start_new_session=True)
        if group:
            group.write_text(str(playing.pid))
        text = playing.communicate()[0].decode()
        return Played(text, playing.returncode)

    def by_hand(self, site, original, out):
        """What the tool itself makes of the site: the same options, another way."""
        subprocess.run([str(TOOL), "migrate", "--base", str(self.root / "base"), "--from", str(original), "--to",
                        str(self.root / "new"), "--out", str(out), *site.options], check=True,
                       stdout=subprocess.DEVNULL, stderr=subprocess.PIPE)
        return contents(out)


class Played:
    """What ansible-playbook printed."""

    def __init__(self, text, code):
        self.text = text
        self.code = code
        self.recap = {}
        for line in text.splitlines():
            found = re.match(r"^(\S+)\s+: (ok=.*)$", line)
            if found:
                self.recap[found[1]] = {key: int(number) for key, number in re.findall(r"(\w+)=(\d+)", found[2])}

    def hosts(self, word):
        return sorted(host for host, counts in self.recap.items() if counts[word])

    def message(self, host):
        found = re.findall(rf"^fatal: \[{host}\]: \w+! => (.*)$", self.text, re.MULTILINE)
        return json.loads(found[-1])["msg"] if found else f"no failure of {host} in:\n{self.text}"

    def expect(self, failed, changed):
        if not self.recap:
            raise SystemExit(f"ansible-playbook has no recap:\n{self.text}")
        hosts = sorted(self.hosts("failed") + self.hosts("unreachable"))
        if hosts != sorted(failed) or self.hosts("changed") != sorted(changed):
            for host in hosts:
                print(f"{host}: {self.message(host)}")
        expect("hosts that failed", sorted(failed), hosts)
        expect("hosts that changed", sorted(changed), self.hosts("changed"))
        expect("exit code", 2 if failed else 0, self.code)


MS_REC, MS_PRIVATE, MS_REMOUNT, CLONE_NEWNS = 16384, 1 << 18, 32, 0x00020000


def mount(source, target, kind, flags, options):
    libc = ctypes.CDLL(None, use_errno=True)
    return libc.mount(source, os.fsencode(str(target)), kind, flags, options) == 0


class SmallFileSystem:
    """A file system of a given size over a folder, for this process and its children, where that can be had."""

    def __init__(self, folder):
        self.folder = folder
        libc = ctypes.CDLL(None, use_errno=True)
        self.site = None
        self.is_there = (libc.unshare(CLONE_NEWNS) == 0 and mount(b"none", "/", None, MS_REC | MS_PRIVATE, None) and
                         mount(b"small", folder, b"tmpfs", 0, b"size=8m"))

    def resize(self, size):
        if not mount(b"small", self.folder, b"tmpfs", MS_REMOUNT, b"size=" + size):
            raise SystemExit("the small file system cannot be given another size")

    def __enter__(self):
        return self

    def __exit__(self, *ignored):
        if self.is_there:
            ctypes.CDLL(None).umount2(os.fsencode(str(self.folder)), 2)


def make_executable(path, text):
    path.write_text(text)
    path.chmod(path.stat().st_mode | stat.S_IXUSR | stat.S_IXGRP | stat.S_IXOTH)
