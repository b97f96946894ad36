#!/usr/bin/env python3
"""complete.py SHELL PREFIX: what SHELL completes of command lines of the installation in PREFIX.

Commands and options are those of --help, whatever these are; some values are told one by one.
"""

import os
import pathlib
import re
import subprocess
import sys
import tempfile

import shells

FOLDERS = ["second", "site", "a folder"]
FILES = ["sheet", "some.toml"]
RULES = ["D201", "D202", "D203", "D204", "D205", "D206", "D207", "D208", "D209"]
OF_A_FOLDER = ("DIR", "BASE", "OLD", "NEW", "OUT", "RDIR")
OF_A_FILE = ("FILE", "PLAN")

# The last word, or what is behind "=" in it, may become these.
ROWS = [
    ("c", ["check", "completion"]),
    ("xyz", []),
    ("completion ", ["bash", "fish", "zsh"]),
    ("check --format ", ["github", "json", "sarif", "text"]),
    ("check --format=", ["github", "json", "sarif", "text"]),
    ("check --format=s", ["sarif"]),
    ("check --fail-on ", ["error", "warning"]),
    ("migrate --layout ", ["keep", "library"]),
    ("plan --prefer ", ["new", "old"]),
    ("diff --risk s", ["structure"]),
    ("diff --class changed-by-both", ["changed-by-both-in-conflict", "changed-by-both-mergeable"]),
    ("show site --as ", ["kept", "written"]),
    ("show site --file V3.c", ["V3.config.at", "V3.config.oc"]),
    ("check --color a", ["always", "auto"]),
    ("explain D20", RULES),
    ("check --rule D20", RULES),
    ("check --rule=D20", RULES),
    ("check --rule D201=", ["error", "off", "warning"]),
    ("check --rule=D201=e", ["error"]),
    ("check --format json --rule D20", RULES),
    ("check s", ["second", "site"]),
    ("check a", ["a folder"]),
    ("check site s", ["second", "site"]),
    ("check -- s", ["second", "site"]),
    ("check --context s", ["second", "site"]),
    ("check site/in", ["site/inner"]),
    # The option's value is no argument; the second one of show is a name.
    ("show --kind object-class s", ["second", "site"]),
    ("show site s", []),
    ("verify --plan some.toml s", ["second", "site"]),
    ("migrate --max-input s", []),
    # The value of one command's --repair, and none of another's.
    ("check --repair s", ["second", "site"]),
    ("plan --repair --prefer ", ["new", "old"]),
]


def helped(prefix, arguments):
    return subprocess.run([prefix / "bin/schema-migrate", *arguments, "--help"], check=True,
                          capture_output=True, text=True).stdout


def section(text, title):
    found = re.search(rf"^{title}:\n((?:  .*\n)+)", text, re.MULTILINE)
    return found.group(1) if found else ""


def options_of(text):
    """Of each option its names, and the name of its value, which may be empty."""
    return [(names.split(","), value) for names, value in
            re.findall(r"^  (-[\w,-]+)(?: ([A-Z=]+))?", section(text, "Options"), re.MULTILINE)]


def expectations(prefix):
    text = helped(prefix, [])
    commands = re.findall(r"^  ([a-z]+)", section(text, "Subcommands"), re.MULTILINE)
    assert "check" in commands, text
    yield "", commands
    for command in ["", *commands]:
        line = command + " " if command else ""
        options = options_of(helped(prefix, line.split()))
        names = [name for names, _ in options for name in names]
        assert "--help" in names, names
        yield line + "-", names
        for (*_, name), value in options:
            yield line + name[:-1], [each for each in names if each.startswith(name[:-1])]
            if value in OF_A_FOLDER:
                yield f"{line}{name} s", ["second", "site"]
                yield f"{line}{name}=s", ["second", "site"]
            if value in OF_A_FILE and (command, name) != ("show", "--file"):
                yield f"{line}{name} s", ["second", "site", *FILES]
    yield from ROWS


def main():
    name, prefix = sys.argv[1], pathlib.Path(sys.argv[2])
    os.environ["PATH"] = f"{prefix}/bin:{os.environ['PATH']}"
    failures = 0
    tried = 0
    with tempfile.TemporaryDirectory() as folder:
        folder = pathlib.Path(folder).resolve()
        for each in [*FOLDERS, "site/inner"]:
            (folder / each).mkdir()
        for each in FILES:
            (folder / each).write_text("")
        shell = shells.start(name, prefix / "share", folder)
        for line, expected in expectations(prefix):
            tried += 1
            found = shell.candidates("schema-migrate " + line)
            if found != sorted(expected):
                failures += 1
                print(f"{line!r}: expected {sorted(expected)}, but the shell has {found}")
        for line, description in (("check --fo", "text, json, sarif or github"),
                                  ("ver", "tell whether an output is what a saved plan says"),
                                  ("explain D208", "single-member-takes-the-end")):
            if name != "bash" and not shell.describes("schema-migrate " + line, description):
                failures += 1
                print(f"{line!r}: {description!r} is not told")
        shell.close()
    print(f"{tried} lines, {failures} failures")
    return 1 if failures else 0


sys.exit(main())
