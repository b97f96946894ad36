"""Whenever the exchange of two directories is killed: the schema directory is one of the two, whole, and the next run
goes on from there. Each run is killed before its first change of the file system, before its second, and so on."""

import errno
import importlib.util
import os
import shutil
import sys
import tempfile

from fleet import EXAMPLES, SOURCE, contents, expect, tree

KILLED = 9
CHANGES = (("os", "rename"), ("os", "mkdir"), ("os", "rmdir"), ("os", "unlink"), ("os", "chown"), ("os", "chmod"), ("os", "utime"),
           ("shutil", "copy2"), ("module", "exchange"))


def load():
    path = SOURCE / "ansible/ansible_collections/directory/schema/plugins/modules/schema_directory.py"
    specification = importlib.util.spec_from_file_location("schema_directory", path)
    module = importlib.util.module_from_spec(specification)
    specification.loader.exec_module(module)
    return module


MODULE = load()
# What is on the disk does not matter to a kill.
MODULE.sync = lambda path: None


class Place:
    def __init__(self, root):
        self.path = os.path.join(root, "schema")
        self.work = os.path.join(root, "schema.upgrade")
        shutil.copytree(EXAMPLES / "old", self.path)
        self.write("schema/notes", "the site's\n")
        self.old = tree(self.path)
        self.new = dict(contents(EXAMPLES / "new"), notes=b"the site's\n")
        self.run("prepared", "auto")
        shutil.copytree(EXAMPLES / "new", os.path.join(self.work, "standby"))
        self.root = root

    def write(self, name, text):
        with open(os.path.join(os.path.dirname(self.path), name), "w", encoding="ascii") as file:
            file.write(text)

    def run(self, state, method):
        result = {}
        upgrade = MODULE.Upgrade(self.path, self.work, method, False)
        MODULE.carry_out(upgrade, state, [self.path], result)
        return result

    def run_and_kill(self, state, method, number):
        """Whether the run was killed before its change of that number."""
        child = os.fork()
        if child == 0:
            left = [number]

            def before(function):
                def changed(*arguments, **keywords):
                    left[0] -= 1
                    if left[0] == 0:
                        os._exit(KILLED)
                    return function(*arguments, **keywords)
                return changed

            code = 1
            try:
                for owner, name in CHANGES:
                    owner = {"os": os, "shutil": shutil, "module": MODULE}[owner]
                    setattr(owner, name, before(getattr(owner, name)))
                self.run(state, method)
                code = 0
            except BaseException as error:  # pylint: disable=broad-except
                print(f"{state} by {method}, change {number}: {error!r}", file=sys.stderr, flush=True)
            os._exit(code)
        code = os.waitstatus_to_exitcode(os.waitpid(child, 0)[1])
        if code not in (0, KILLED):
            raise SystemExit("the run failed")
        return code == KILLED

    def expect_one_of_the_two(self, method):
        if method == "rename" and not os.path.exists(self.path):
            return True
        is_one = tree(self.path) == self.old or contents(self.path) == self.new
        expect(f"the schema is one of the two, by {method}", True, is_one)
        return False

    def expect_state(self, state):
        if state == "in_place":
            expect("what is in place", self.new, contents(self.path))
            expect("what is kept", self.old, tree(os.path.join(self.work, "standby")))
        else:
            expect("what is in place", self.old, tree(self.path))
            expect("what is kept", self.new, contents(os.path.join(self.work, "standby")))
        expect("what is left over", [], [name for name in os.listdir(self.work) if name == "leaving"])


def kill_everywhere(method, then):
    kills = without_schema = 0
    for state in ("in_place", "rolled_back"):
        number = 1
        while True:
            with tempfile.TemporaryDirectory(prefix="schema-exchange-") as root:
                place = Place(os.path.realpath(root))
                if state == "rolled_back":
                    place.run("in_place", method)
                was_killed = place.run_and_kill(state, method, number)
                without_schema += place.expect_one_of_the_two(method)
                if was_killed and then == "prepared":
                    # What a run of the role does first says which of the two is in place, and completes.
                    is_upgraded = place.run("prepared", method)["upgraded"]
                    expect("which is in place", is_upgraded, contents(place.path) == place.new)
                place.run(state, method)
                place.expect_state(state)
            if not was_killed:
                break
            kills += 1
            number += 1
    return kills, without_schema


def kill_while_copying():
    number = 1
    while True:
        with tempfile.TemporaryDirectory(prefix="schema-exchange-") as root:
            place = Place(os.path.realpath(root))
            place.write("schema/notes", "changed\n")
            was_killed = place.run_and_kill("prepared", "auto", number)
            place.run("prepared", "auto")
            expect("the copy", contents(place.path), contents(os.path.join(place.work, "original")))
            expect("the work directory", ["original", "standby", "state.json"], sorted(os.listdir(place.work)))
        if not was_killed:
            return number - 1
        number += 1


def not_supported(method, error):
    """What becomes of it where the file system cannot exchange."""
    def exchange(*ignored):
        raise OSError(error, os.strerror(error))

    kept = MODULE.exchange
    MODULE.exchange = exchange
    try:
        with tempfile.TemporaryDirectory(prefix="schema-exchange-") as root:
            place = Place(os.path.realpath(root))
            try:
                place.run("in_place", method)
                place.expect_state("in_place")
                return "done"
            except OSError as raised:
                expect("the schema", place.old, tree(place.path))
                return raised.errno
    finally:
        MODULE.exchange = kept


def main():
    for then in ("prepared", "the same"):
        kills, without_schema = kill_everywhere("exchange", then)
        expect("moments without a schema", 0, without_schema)
        if kills < 10:
            raise SystemExit(f"only {kills} kills")
        kills, without_schema = kill_everywhere("rename", then)
        # Between two names, once on the way there, and once back.
        expect("moments without a schema", 2, without_schema)
    if kill_while_copying() < 10:
        raise SystemExit("copying was hardly killed")
    expect("without exchange", "done", not_supported("auto", errno.EINVAL))
    expect("without exchange, where that is wanted", errno.EINVAL, not_supported("exchange", errno.EINVAL))
    expect("another error", errno.EIO, not_supported("auto", errno.EIO))


main()
