# Puts another directory in the place of a server's schema directory, and takes it out again. At every moment, and
# whenever a run is interrupted, the place holds one of the two, whole, where the file system can exchange them.

from __future__ import absolute_import, division, print_function

__metaclass__ = type

DOCUMENTATION = r"""
module: schema_directory
short_description: Put a migrated schema directory in place, keep the old one, and roll back
description:
  - Looks after the schema directory of one server during an upgrade, with a work directory beside it. In that lie
    C(original), a copy of the schema directory as it was when the upgrade began, and C(standby), the directory that
    is not in place - the migrated one before it is put in place, the old one itself afterwards.
  - To put in place, and to roll back, is to exchange the schema directory and C(standby). Linux does that in one
    step. Where the file system cannot, it takes two, and a run that was interrupted between them is completed by
    the next one.
version_added: 2.0.0
author: The libschema maintainers
options:
  path:
    description: The schema directory of the server. Where it is a symbolic link, what that points to.
    type: path
    required: true
  work:
    description: The work directory, in the same file system as I(path). It is created for root, or the user, alone.
    type: path
    required: true
  state:
    description:
      - With C(prepared) the copy of I(path) is made, or made again if I(path) has changed since; nothing else is
        touched. When the migrated directory is in place already, nothing is done.
      - With C(cleared) what lies in the work directory as C(standby) and C(record), and is not the old directory, is
        renamed to C(standby.1), C(record.1) and so on.
      - With C(in_place) C(standby) is put in the place of I(path), which must be as it was when it was copied.
      - With C(rolled_back) the old directory is put back, as it is. What was in place lies in C(standby) then.
    type: str
    choices: [prepared, cleared, in_place, rolled_back]
    required: true
  others:
    description:
      - Directories whose other entries, those that are none of the nine V3.* files of a schema, belong into the
        directory that is put in place. The first directory that has an entry counts. With C(in_place) only.
    type: list
    elements: path
    default: []
  method:
    description:
      - How directories are exchanged. C(exchange) in one step or not at all, C(rename) in two, C(auto) in one where
        the file system can.
    type: str
    choices: [auto, exchange, rename]
    default: auto
notes:
  - Owner, group, mode and extended attributes of what is put in place become those of the old directory and of its
    file of the same name; a file that it did not have gets those of its other files.
"""

EXAMPLES = r"""
- name: Copy the schema before the upgrade
  directory.schema.schema_directory:
    path: /srv/server/schema
    work: /srv/server/schema.upgrade
    state: prepared

- name: Put the migrated schema in place
  directory.schema.schema_directory:
    path: /srv/server/schema
    work: /srv/server/schema.upgrade
    state: in_place
    others: [/srv/release-9/schema, /srv/server/schema]

- name: Go back to the old one
  directory.schema.schema_directory:
    path: /srv/server/schema
    work: /srv/server/schema.upgrade
    state: rolled_back
"""

RETURN = r"""
upgraded:
  description: Whether the migrated directory is in place, after the task; in check mode, before it.
  returned: always
  type: bool
original:
  description: The copy of the schema directory as it was when the upgrade began.
  returned: always
  type: str
  sample: /srv/server/schema.upgrade/original
source:
  description: Where the old schema can be read - C(original), or in check mode I(path) when that is not made yet.
  returned: always
  type: str
standby:
  description: The directory that is not in place.
  returned: always
  type: str
contents:
  description: What lies in the work directory.
  returned: always
  type: list
  elements: str
  sample: [original, plan.json, record, standby, state.json]
renamed:
  description: The new names of what C(cleared) has renamed.
  returned: with C(cleared)
  type: list
  elements: str
"""

import ctypes
import errno
import filecmp
import json
import os
import shutil
import stat
import tempfile

from ansible.module_utils.basic import AnsibleModule

SCHEMA_FILES = frozenset(
    "V3." + name
    for name in (
        "modifiedschema",
        "system.at",
        "system.oc",
        "orv.at",
        "orv.oc",
        "user.at",
        "user.oc",
        "config.at",
        "config.oc",
    )
)
AT_FDCWD = -100
RENAME_EXCHANGE = 2
NOT_SUPPORTED = (errno.ENOSYS, errno.EINVAL, errno.EOPNOTSUPP)


class Refused(Exception):
    """What cannot be done, and what to do."""


def same(one, other):
    """Whether two entries are alike: kind, bytes, names of what is in them, targets of links."""
    kinds = [stat.S_IFMT(os.lstat(path).st_mode) for path in (one, other)]
    if kinds[0] != kinds[1]:
        return False
    if kinds[0] == stat.S_IFLNK:
        return os.readlink(one) == os.readlink(other)
    if kinds[0] == stat.S_IFREG:
        return filecmp.cmp(one, other, shallow=False)
    if kinds[0] == stat.S_IFDIR:
        names = sorted(os.listdir(one))
        return names == sorted(os.listdir(other)) and all(
            same(os.path.join(one, name), os.path.join(other, name)) for name in names
        )
    return True


def sync(path):
    descriptor = os.open(path, os.O_RDONLY | os.O_NOFOLLOW)
    try:
        os.fsync(descriptor)
    finally:
        os.close(descriptor)


def sync_all(path):
    for folder, ignored, names in os.walk(path):
        for name in names:
            if stat.S_ISREG(os.lstat(os.path.join(folder, name)).st_mode):
                sync(os.path.join(folder, name))
        sync(folder)


def remove(path):
    if os.path.isdir(path) and not os.path.islink(path):
        shutil.rmtree(path)
    elif os.path.lexists(path):
        os.unlink(path)


def copy(source, target):
    """Copies an entry with all that is in it; root keeps the owners."""
    if os.path.isdir(source) and not os.path.islink(source):
        shutil.copytree(source, target, symlinks=True)
        for folder, folders, names in os.walk(source):
            for name in folders + names:
                path = os.path.join(folder, name)
                keep_owner(path, os.path.join(target, os.path.relpath(path, source)))
    else:
        shutil.copy2(source, target, follow_symlinks=False)
    keep_owner(source, target)


def keep_owner(source, target):
    if os.geteuid() == 0:
        like = os.lstat(source)
        os.lchown(target, like.st_uid, like.st_gid)


def exchange(one, other):
    """Exchanges two names in one step, or raises OSError."""
    libc = ctypes.CDLL(None, use_errno=True)
    if not hasattr(libc, "renameat2"):
        raise OSError(errno.ENOSYS, os.strerror(errno.ENOSYS))
    arguments = (AT_FDCWD, os.fsencode(one), AT_FDCWD, os.fsencode(other), RENAME_EXCHANGE)
    if libc.renameat2(*arguments) != 0:
        raise OSError(ctypes.get_errno(), os.strerror(ctypes.get_errno()))


class Upgrade(object):
    """The schema directory and its work directory."""

    def __init__(self, path, work, method, is_only_looking):
        self.path = os.path.realpath(path)
        self.work = os.path.abspath(work)
        self.method = method
        self.is_only_looking = is_only_looking
        self.original = os.path.join(self.work, "original")
        self.standby = os.path.join(self.work, "standby")
        self.leaving = os.path.join(self.work, "leaving")
        self.state = os.path.join(self.work, "state.json")
        self.changed = False

    # Between the two steps of an exchange by renaming, "leaving" is what was in the place.
    def complete_what_was_interrupted(self):
        if not os.path.lexists(self.leaving):
            return
        is_place_empty = not os.path.lexists(self.path)
        if is_place_empty != os.path.lexists(self.standby):
            raise Refused(
                "%s was left by a run that was interrupted, and what it left is not as it was; put by hand into %s what"
                " belongs there" % (self.leaving, self.path)
            )
        self.changed = True
        if self.is_only_looking:
            raise Refused("a run was interrupted while it exchanged directories; run once without check mode")
        if is_place_empty:
            os.rename(self.standby, self.path)
        os.rename(self.leaving, self.standby)

    def refuse_what_cannot_work(self):
        if not os.path.isdir(self.path):
            raise Refused("%s is no directory; name the directory with the V3.* files of the server" % self.path)
        if os.path.ismount(self.path):
            raise Refused("%s is a mount point, and cannot be renamed; name a directory in it" % self.path)
        beside = self.work
        while not os.path.isdir(beside):
            beside = os.path.dirname(beside)
        if os.stat(beside).st_dev != os.stat(self.path).st_dev:
            raise Refused("%s and %s lie in two file systems; name a work directory in that of the schema" % (self.work, self.path))
        if (self.work + os.sep).startswith(self.path + os.sep):
            raise Refused("%s lies in %s; name a work directory beside the schema" % (self.work, self.path))

    def inode_of(self, which):
        try:
            with open(self.state) as state:
                return json.load(state)[which]
        except (OSError, ValueError, KeyError):
            return None

    def is_upgraded(self):
        """Which of the two is in the place. Both are known by their inodes, or else by what is in them."""
        inode = os.stat(self.path).st_ino
        if inode in (self.inode_of("old"), self.inode_of("new")):
            return inode == self.inode_of("new")
        if not os.path.isdir(self.standby):
            return False
        if os.stat(self.standby).st_ino == self.inode_of("old"):
            return True
        is_original = [os.path.isdir(self.original) and same(self.original, one) for one in (self.path, self.standby)]
        if is_original[0] != is_original[1]:
            return is_original[1]
        raise Refused(
            "neither %s nor %s is the directory with which the upgrade began, so that nobody can tell which of them is in"
            " place; look at both, and move %s away to begin anew" % (self.path, self.standby, self.work)
        )

    def is_copied(self):
        return os.path.isdir(self.original) and same(self.path, self.original)

    def prepare(self):
        self.remove_what_was_interrupted()
        if self.is_copied() and self.inode_of("old") == os.stat(self.path).st_ino:
            return
        self.changed = True
        if self.is_only_looking:
            return
        if not os.path.isdir(self.work):
            os.makedirs(self.work, 0o700)
        private = tempfile.mkdtemp(prefix=".temporary-", dir=self.work)
        try:
            made = os.path.join(private, "original")
            copy(self.path, made)
            sync_all(made)
            if not same(self.path, made):
                raise Refused("%s changed while it was copied; run again" % self.path)
            if os.path.lexists(self.original):
                os.rename(self.original, os.path.join(private, "earlier"))
            os.rename(made, self.original)
            self.write_state({"old": os.stat(self.path).st_ino})
        finally:
            remove(private)
        sync(self.work)

    def remove_what_was_interrupted(self):
        names = os.listdir(self.work) if os.path.isdir(self.work) else []
        for name in names:
            if name.startswith(".temporary-"):
                self.changed = True
                if not self.is_only_looking:
                    remove(os.path.join(self.work, name))

    def write_state(self, inodes):
        made = os.path.join(self.work, ".temporary-state")
        with open(made, "w") as state:
            json.dump(inodes, state)
            state.flush()
            os.fsync(state.fileno())
        os.rename(made, self.state)

    def clear(self):
        renamed = []
        for name in ("standby", "record"):
            path = os.path.join(self.work, name)
            if os.path.lexists(path):
                number = 1
                while os.path.lexists("%s.%d" % (path, number)):
                    number += 1
                renamed.append("%s.%d" % (path, number))
                if not self.is_only_looking:
                    os.rename(path, renamed[-1])
        self.changed = self.changed or bool(renamed)
        return renamed

    def put_in_place(self, others):
        if not os.path.isdir(self.standby):
            raise Refused("%s is not there; migrate to it first" % self.standby)
        if not self.is_copied():
            raise Refused("%s has changed since it was copied, and was left in place; run the upgrade again" % self.path)
        self.changed = True
        if self.is_only_looking:
            return
        for other in others:
            self.bring_others(other)
        self.give_owners()
        sync_all(self.standby)
        self.write_state({"old": os.stat(self.path).st_ino, "new": os.stat(self.standby).st_ino})
        self.swap()

    def bring_others(self, folder):
        for name in sorted(os.listdir(folder)):
            target = os.path.join(self.standby, name)
            if name not in SCHEMA_FILES and not os.path.lexists(target):
                private = tempfile.mkdtemp(prefix=".temporary-", dir=self.work)
                try:
                    copy(os.path.join(folder, name), os.path.join(private, name))
                    os.rename(os.path.join(private, name), target)
                finally:
                    remove(private)

    def give_owners(self):
        example = self.path
        for name in sorted(os.listdir(self.path)):
            if stat.S_ISREG(os.lstat(os.path.join(self.path, name)).st_mode):
                example = os.path.join(self.path, name)
                break
        for name in os.listdir(self.standby):
            path = os.path.join(self.standby, name)
            if stat.S_ISREG(os.lstat(path).st_mode):
                old = os.path.join(self.path, name)
                give_owner(path, old if os.path.isfile(old) else example)
        give_owner(self.standby, self.path)

    def swap(self):
        if self.method != "rename":
            try:
                exchange(self.path, self.standby)
                self.sync_places()
                return
            except OSError as error:
                if self.method == "exchange" or error.errno not in NOT_SUPPORTED:
                    raise
        os.rename(self.path, self.leaving)
        os.rename(self.standby, self.path)
        os.rename(self.leaving, self.standby)
        self.sync_places()

    def sync_places(self):
        sync(os.path.dirname(self.path))
        sync(self.work)

    def roll_back(self):
        if not os.path.isdir(self.standby):
            raise Refused("the old directory, %s, is not there any more; %s is a copy of it" % (self.standby, self.original))
        self.changed = True
        if not self.is_only_looking:
            self.swap()


def give_owner(path, example):
    if not os.path.isfile(example) and os.path.isfile(path):
        return
    like = os.stat(example)
    now = os.stat(path)
    if (like.st_uid, like.st_gid) != (now.st_uid, now.st_gid):
        os.chown(path, like.st_uid, like.st_gid)
    times = (now.st_atime_ns, now.st_mtime_ns)
    shutil.copystat(example, path)
    os.utime(path, ns=times)


def carry_out(upgrade, state, others, result):
    upgrade.complete_what_was_interrupted()
    upgrade.refuse_what_cannot_work()
    is_upgraded = upgrade.is_upgraded()
    result["upgraded"] = is_upgraded
    if state == "prepared" and not is_upgraded:
        upgrade.prepare()
    elif state == "cleared":
        result["renamed"] = [] if is_upgraded else upgrade.clear()
    elif state == "in_place" and not is_upgraded:
        upgrade.put_in_place(others)
    elif state == "rolled_back":
        if is_upgraded:
            upgrade.roll_back()
        elif not os.path.isdir(upgrade.original):
            raise Refused("there is nothing to roll back: %s holds no upgrade of %s" % (upgrade.work, upgrade.path))
    if upgrade.changed and not upgrade.is_only_looking:
        result["upgraded"] = upgrade.is_upgraded()
    result["changed"] = upgrade.changed
    is_original_there = os.path.isdir(upgrade.original) and (is_upgraded or upgrade.is_copied())
    result["source"] = upgrade.original if is_original_there else upgrade.path
    result["contents"] = sorted(os.listdir(upgrade.work)) if os.path.isdir(upgrade.work) else []


def main():
    module = AnsibleModule(
        argument_spec={
            "path": {"type": "path", "required": True},
            "work": {"type": "path", "required": True},
            "state": {
                "type": "str",
                "required": True,
                "choices": ["prepared", "cleared", "in_place", "rolled_back"],
            },
            "others": {"type": "list", "elements": "path", "default": []},
            "method": {"type": "str", "default": "auto", "choices": ["auto", "exchange", "rename"]},
        },
        supports_check_mode=True,
    )
    params = module.params
    upgrade = Upgrade(params["path"], params["work"], params["method"], module.check_mode)
    result = {"original": upgrade.original, "standby": upgrade.standby}
    try:
        carry_out(upgrade, params["state"], params["others"], result)
    except Refused as refused:
        module.fail_json(msg="%s" % refused, **result)
    except (OSError, shutil.Error) as error:
        module.fail_json(
            msg="%s of %s: %s. What to do: see that there is room and the right to write, and run again; what is in place"
            " is whole" % (params["state"], upgrade.path, error),
            **result
        )
    module.exit_json(**result)


if __name__ == "__main__":
    main()
