# Runs schema-migrate on a host. The program does the work; what is here gives it its arguments, reads its JSON
# documents and exit codes, and finds out beforehand whether there is anything to do.

from __future__ import absolute_import, division, print_function

__metaclass__ = type

DOCUMENTATION = r"""
module: schema_migrate
short_description: Check, plan, migrate and verify the schema of a directory server
description:
  - Runs the installed program C(schema-migrate) on the host, and gives back what its JSON documents and its exit
    codes say. Its messages are passed on as they are, with what to do about them.
  - Nothing that is there already is overwritten, but for a plan or a page that an earlier run has saved.
version_added: 2.0.0
author: The libschema maintainers
options:
  command:
    description:
      - C(check) tells what is wrong with the schema in I(directory), and fails when there are findings.
      - C(plan) tells what a migration of I(from) to I(to) would do, and fails when something is undecided or refused.
      - C(migrate) carries out such a plan and writes I(out). Where I(out) is there already and is what the plan
        says, nothing is done; where it is anything else, it is left alone, and the task fails.
      - C(verify) tells whether I(directory) is what I(plan) says, and fails when it is not.
    type: str
    choices: [check, plan, migrate, verify]
    required: true
  program:
    description: The program, as a path or as a name that is looked for in C(PATH).
    type: path
    default: schema-migrate
  directory:
    description: The directory with the V3.* files to C(check), or to C(verify) against I(plan).
    type: path
  against:
    description: C(check) names and files against the installation in this directory.
    type: path
  rules:
    description: Severities of rules for C(check), such as C({"L112":"off"}).
    type: dict
  fail_on:
    description: The least severity of a finding that makes C(check) fail. C(error) if it is not given.
    type: str
    choices: [error, warning]
  from:
    description: The directory with the V3.* files of the installation.
    type: path
    aliases: [old]
  to:
    description: The directory with the V3.* files of the new release as it is shipped.
    type: path
    aliases: [new]
  base:
    description:
      - The directory with the V3.* files of the old release as it was shipped. Without it nobody can tell who has
        changed what, and whatever differs is undecided.
    type: path
  accept_base:
    description: The base may equal the installation, as that of one that was never customised does.
    type: bool
    default: false
  exclude_oids:
    description: Lists of OIDs that are not carried over.
    type: list
    elements: path
    default: []
  withdraw:
    description: A list of OIDs that the installation takes back.
    type: path
  decisions:
    description: Files with decisions; see schema-migrate-decisions(5).
    type: list
    elements: path
    default: []
  allow_unused:
    description: Decisions may be about definitions that this installation does not have.
    type: bool
    default: false
  prefer:
    description: Decide every clause that both have changed in two ways.
    type: str
    choices: [old, new]
  repair:
    description: Mend in private copies of the inputs what can be mended without changing what is said.
    type: bool
    default: false
  max_input:
    description: Refuse inputs that are larger than this, such as C(100M).
    type: str
  plan:
    description: The saved plan to C(migrate) by, in the place of I(from), I(to) and the rest; or to C(verify) against.
    type: path
  save:
    description: Save the plan in this file. It is saved, too, when something is undecided.
    type: path
  template:
    description:
      - Write a decisions file with an entry for each definition that is undecided, to be filled in.
      - A template of an earlier run is replaced as long as nobody has filled anything in; otherwise the task fails.
    type: path
  html:
    description: Write the report of C(check), C(plan) or C(migrate) as a page for a browser, too.
    type: path
  out:
    description: The directory that C(migrate) creates. It appears whole and verified, or not at all.
    type: path
  record:
    description: The directory that C(migrate) creates for the change ticket.
    type: path
  layout:
    description: Files laid out as those of the new release, or as the library writes them. C(keep) if it is not given.
    type: str
    choices: [keep, library]
  allow_foreign_parent:
    description: Create I(out) also where another user may rename it.
    type: bool
    default: false
notes:
  - In check mode C(migrate) does everything but write I(out) and I(record), and C(plan) writes no file. What is
    private to a run lies in the temporary directory of the module or of the program, and is gone at its end.
  - In diff mode C(plan) and C(migrate) give the three-way difference, for each definition that changes who changed
    it, what comes of it, and each clause as the base, the installation, the new release and the result have it.
  - Relative paths begin in the directory in which Ansible works on the host. Give absolute ones.
"""

EXAMPLES = r"""
- name: Look for mistakes in the schema of the installation
  directory.schema.schema_migrate:
    command: check
    directory: /srv/server/schema
    rules:
      L112: "off"

- name: See what the upgrade would do, and what is undecided
  directory.schema.schema_migrate:
    command: plan
    base: /srv/release-8/schema
    from: /srv/server/schema
    to: /srv/release-9/schema
    decisions: [/srv/upgrade/decisions.toml]
    save: /srv/upgrade/plan.json
    template: /srv/upgrade/undecided.toml
  register: plan
  diff: true

- name: Carry the plan out
  directory.schema.schema_migrate:
    command: migrate
    plan: /srv/upgrade/plan.json
    out: /srv/upgrade/migrated
    record: /srv/upgrade/record

- name: Make sure that it is what was planned
  directory.schema.schema_migrate:
    command: verify
    plan: /srv/upgrade/plan.json
    directory: /srv/upgrade/migrated
"""

RETURN = r"""
ansible_facts:
  description: What the last run of the program found, for the tasks that follow. A task that fails sets none.
  returned: success
  type: dict
  contains:
    schema_migrate:
      description: The facts.
      returned: success
      type: dict
      contains:
        command:
          description: The command that was run.
          type: str
          sample: plan
        outcome:
          description: As the returned value of this name.
          type: str
          sample: done
        version:
          description: The version of the program. Not of C(verify).
          type: str
          sample: 2.0.0
        counts:
          description: As the returned value of this name. Not of C(verify).
          type: dict
outcome:
  description:
    - What the exit code, and what was told with it, means.
    - C(done), C(findings) of C(check), C(differences) of C(verify), C(usage), C(input), C(undecided), C(refused),
      C(not-written), or C(failed) when the program did not come to its end.
  returned: when the program was run
  type: str
  sample: undecided
rc:
  description: The exit code of the program.
  returned: when the program was run
  type: int
  sample: 4
cmd:
  description: The program and its arguments.
  returned: when the program was run
  type: list
  elements: str
messages:
  description: What the program said on standard error, line by line.
  returned: when the program was run
  type: list
  elements: str
report:
  description: What C(verify) told, line by line.
  returned: when the program has verified something
  type: list
  elements: str
counts:
  description:
    - How many definitions there are of each class, outcome and risk; of C(check) how many errors and warnings.
  returned: when the program wrote a document
  type: dict
  sample: {"definitions": 251, "outcome": {"added": 28, "undecided": 11}}
ready:
  description: Whether a migration may go ahead.
  returned: with C(plan) and C(migrate), when the program wrote a document
  type: bool
definitions:
  description: Every definition that is not the same everywhere, in the words of docs/json/plan.schema.json.
  returned: with C(plan) and C(migrate), on success
  type: list
  elements: dict
  contains:
    kind:
      description: C(attribute-type), C(object-class) or C(vendor-extension).
      type: str
    oid:
      description: Its OID.
      type: str
    name:
      description: Its first name; of a vendor extension that of its attribute type.
      type: str
    class:
      description: Who changed it.
      type: str
    outcome:
      description: What comes of it.
      type: str
    risk:
      description: C(none), C(cosmetic), C(structure) or C(data).
      type: str
    reason:
      description: Why.
      type: str
    decision:
      description: File and line of the decision about it, if there is one.
      type: str
undecided:
  description: Those of the definitions that somebody has to decide about.
  returned: with C(plan) and C(migrate), when the program wrote a document
  type: list
  elements: dict
refusals:
  description: Why a migration must not go ahead, beside what is undecided.
  returned: with C(plan) and C(migrate), when the program wrote a document
  type: list
  elements: dict
findings:
  description: What C(check) found, each with rule, severity, file, line, column, definition and text.
  returned: with C(check)
  type: list
  elements: dict
diff:
  description: The three-way difference as text.
  returned: in diff mode, with C(plan) and C(migrate)
  type: dict
  contains:
    prepared:
      description: The text.
      type: str
"""

import filecmp
import json
import os
import re
import shutil

from ansible.module_utils.basic import AnsibleModule
from ansible.module_utils.common.text.converters import to_text

# What each command takes: the option of the module, that of the program.
INPUTS = {
    "from": "--from",
    "to": "--to",
    "base": "--base",
    "accept_base": "--accept-base",
    "exclude_oids": "--exclude-oids",
    "withdraw": "--withdraw",
    "decisions": "--decisions",
    "allow_unused": "--allow-unused",
    "prefer": "--prefer",
    "repair": "--repair",
}
OPTIONS = {
    "check": {
        "against": "--against",
        "exclude_oids": "--exclude-oids",
        "withdraw": "--withdraw",
        "rules": "--rule",
        "fail_on": "--fail-on",
        "html": "--html",
    },
    "plan": dict(INPUTS, max_input="--max-input", save="--save", template="--template", html="--html"),
    "migrate": dict(
        INPUTS,
        plan="--plan",
        max_input="--max-input",
        html="--html",
        out="--out",
        record="--record",
        layout="--layout",
        allow_foreign_parent="--allow-foreign-parent",
    ),
    "verify": {"plan": "--plan", "max_input": "--max-input"},
}
PATHS = ("directory", "against", "from", "to", "base", "withdraw", "plan", "save", "template", "html", "out", "record")

OUTCOMES = {0: "done", 2: "usage", 3: "input", 5: "not-written"}
ADVICE = {
    "findings": "correct what is named; 'schema-migrate explain RULE' tells more of a rule",
    "differences": "what differs was changed after the migration, or is not its output; look at it before it is used",
    "usage": "the program does not take these arguments; is it of the version that this collection belongs to?",
    "input": "correct the input that is named, and run again; nothing was written",
    "undecided": "decide in the file that the option template names, give it as decisions, and run again; nothing was"
    " written",
    "refused": "see to the reasons, and run again; nothing was written",
    "not-written": "see that there is room and the right to write, and run again; nothing was put in place unless a"
    " message says so",
    "failed": "the program did not come to its end; run it by hand as cmd tells",
}
ANSWER = re.compile(r"^\s*(take|text|clauses|rename|renumber|reason)\s*=", re.MULTILINE)
LINES_TOLD = 20


class Run(object):
    """One run of the program, and what came of it."""

    def __init__(self, module, arguments):
        self.cmd = arguments
        self.rc, out, err = module.run_command(arguments)
        self.out = to_text(out)
        self.messages = to_text(err).splitlines()
        self.document = None
        if self.out.startswith("{"):
            try:
                self.document = json.loads(self.out)
            except ValueError:
                pass

    def outcome(self, command):
        if self.rc == 1:
            return {"check": "findings", "verify": "differences"}.get(command, "failed")
        if self.rc == 4:
            return "undecided" if undecided_of(self.document) else "refused"
        return OUTCOMES.get(self.rc, "failed")


def undecided_of(document):
    definitions = (document or {}).get("definitions", [])
    return [definition for definition in definitions if definition["outcome"] == "undecided"]


def words_for(option, value):
    """The words on the command line for an option and what was given for it."""
    if value is True:
        return [option]
    if isinstance(value, dict):
        return [word for key in sorted(value) for word in (option, "%s=%s" % (key, value[key]))]
    if isinstance(value, list):
        return [word for one in value for word in (option, one)]
    return [option, value] if value else []


class Command(object):
    """What the task asks for, as the program takes it."""

    def __init__(self, module):
        self.module = module
        self.name = module.params["command"]
        self.options = OPTIONS[self.name]
        self.params = dict(module.params)
        self.refuse_what_does_not_belong()
        for key in PATHS:
            if self.params[key]:
                self.params[key] = os.path.abspath(self.params[key])
        for key in ("exclude_oids", "decisions"):
            self.params[key] = [os.path.abspath(path) for path in self.params[key]]
        self.program = self.params["program"]
        if os.sep not in self.program:
            self.program = module.get_bin_path(self.program) or self.program

    def refuse_what_does_not_belong(self):
        known = set(self.options) | {"command", "program"}
        if self.name in ("check", "verify"):
            known.add("directory")
        strange = sorted(key for key, value in self.module.params.items() if value and key not in known)
        if strange:
            self.module.fail_json(msg="command %s takes no %s" % (self.name, ", ".join(strange)))

    def arguments(self, command, params):
        """The whole command line of `command`, with those of `params` that it takes."""
        words = [self.program, command]
        if command != "verify":
            words += ["--format", "json"]
        for key in sorted(OPTIONS[command]):
            words += words_for(OPTIONS[command][key], params.get(key))
        return words

    def run(self, command=None, params=None, more=None):
        return Run(self.module, self.arguments(command or self.name, params or self.params) + (more or []))

    def private(self, name):
        """A name in a directory that only this run has, and that goes with it."""
        return os.path.join(self.module.tmpdir, name)


def compact(definition):
    keys = ("kind", "oid", "name", "class", "outcome", "risk", "reason", "decision")
    return dict((key, definition[key]) for key in keys)


def shown(text):
    return "-" if text is None else text


def difference(document):
    """The three-way difference of a plan as text."""
    lines = []
    for definition in document["definitions"]:
        if definition["class"] == "same" and definition["outcome"] in ("same", "new", "gone"):
            continue
        label = definition["kind"].replace("-", " ")
        if definition["name"]:
            label += " " + definition["name"]
        who = definition["class"].replace("-", " ")
        lines.append("%s (%s): %s -> %s [%s]" % (label, definition["oid"], who, definition["outcome"], definition["risk"]))
        lines.append("  " + definition["reason"])
        for clause in definition["clauses"]:
            undecided = definition["outcome"] == "undecided" and not clause["decided"]
            lines.append("  " + clause["clause"])
            for side in ("base", "old", "new"):
                lines.append("    %-7s %s" % (side, shown(clause[side])))
            lines.append("    %-7s %s" % ("result", "undecided" if undecided else shown(clause["result"])))
    return "".join(line + "\n" for line in lines)


def result_of(command, run):
    outcome = run.outcome(command.name)
    result = {"changed": False, "rc": run.rc, "cmd": run.cmd, "messages": run.messages, "outcome": outcome}
    facts = {"command": command.name, "outcome": outcome}
    document = run.document
    if document is not None:
        result["counts"] = facts["counts"] = document["counts"]
        facts["version"] = document["program"]["version"]
        if document["command"] == "check":
            result["findings"] = document["findings"]
        else:
            result["ready"] = document["ready"]
            result["refusals"] = document["refusals"] + document["failures"]
            changed = [one for one in document["definitions"] if one["class"] != "same" or one["outcome"] != "same"]
            result["definitions"] = [compact(one) for one in changed]
            result["undecided"] = [compact(one) for one in undecided_of(document)]
            if command.module._diff:
                result["diff"] = {"prepared": difference(document)}
    elif run.out:
        result["report"] = run.out.splitlines()
    result["ansible_facts"] = {"schema_migrate": facts}
    return result


def told(command, run, result):
    """What a failed run has to say, in one text."""
    outcome = result["outcome"]
    lines = [line for line in run.messages if "warning:" not in line]
    if outcome == "findings":
        counts = result.get("counts", {})
        lines = ["%s errors, %s warnings" % (counts.get("error"), counts.get("warning"))]
        severities = ("error", "warning") if command.params["fail_on"] == "warning" else ("error",)
        findings = [one for one in result.get("findings", []) if one["severity"] in severities]
        lines += ["%(file)s:%(line)s:%(column)s: %(severity)s: %(text)s [%(rule)s]" % one for one in findings]
    elif outcome == "differences":
        lines = result.get("report", [])[-1:] + result.get("report", [])[:-1] + lines
    if len(lines) > LINES_TOLD:
        lines = lines[:LINES_TOLD] + ["and %d more lines" % (len(lines) - LINES_TOLD)]
    return "schema-migrate %s: %s (exit code %d): %s. What to do: %s." % (
        command.name,
        outcome,
        run.rc,
        "; ".join(lines) or "it said nothing",
        ADVICE[outcome],
    )


def end(command, run, result):
    if run.rc != 0:
        # What is undecided and what is refused says it; all the rest would hide it.
        for key in ("ansible_facts", "definitions"):
            result.pop(key, None)
        command.module.fail_json(msg=told(command, run, result), **result)
    command.module.exit_json(**result)


def differs(one, other):
    return not os.path.isfile(other) or not filecmp.cmp(one, other, shallow=False)


def place_template(command, made, result):
    """Puts a new template where the last one was, unless somebody has answered in that."""
    path = command.params["template"]
    if not result.get("undecided") or not os.path.isfile(made) or not differs(made, path):
        return
    if os.path.lexists(path):
        with open(path, "rb") as earlier:
            if ANSWER.search(to_text(earlier.read())):
                command.module.fail_json(
                    msg="%s holds answers already, and was left alone. What to do: give it as decisions, or another name"
                    " as template." % path,
                    **result
                )
    result["changed"] = True
    if not command.module.check_mode:
        command.module.atomic_move(made, path)


def plan(command):
    params = dict(command.params)
    made = command.private("undecided.toml")
    saved = command.private("plan.json")
    if params["template"]:
        params["template"] = made
    if params["save"]:
        params["save"] = saved
    if command.module.check_mode:
        params["html"] = None
    run = command.run(params=params)
    result = result_of(command, run)
    if params["save"] and os.path.isfile(saved) and differs(saved, command.params["save"]):
        result["changed"] = True
        if not command.module.check_mode:
            # The program itself knows what it may replace, and brings it to the disk.
            params["save"] = command.params["save"]
            params["template"] = None
            again = command.run(params=params)
            if again.rc != run.rc:
                end(command, again, result_of(command, again))
    if params["template"] or command.params["template"]:
        place_template(command, made, result)
    end(command, run, result)


def is_there(path):
    try:
        return bool(os.listdir(path))
    except OSError:
        return os.path.lexists(path) and not os.path.isdir(path)


def leave_what_is_there(command):
    """Where the output is there already: it is what the plan says, or nothing is done."""
    params = dict(command.params)
    planned = None
    if not params["plan"]:
        params["save"] = params["plan"] = command.private("plan.json")
        planned = command.run("plan", dict(params, html=None))
        if planned.rc != 0:
            end(command, planned, result_of(command, planned))
    verified = command.run("verify", params, [params["out"]])
    result = result_of(command, planned or verified)
    result.update(rc=verified.rc, cmd=verified.cmd, messages=verified.messages, report=verified.out.splitlines())
    result.pop("diff", None)
    if verified.rc != 0:
        result.pop("ansible_facts")
        result["outcome"] = "refused"
        command.module.fail_json(
            msg="schema-migrate migrate: refused: %s is there already, and is not what the plan says, so that it was left"
            " alone: %s. What to do: look at it, move it away or name another directory."
            % (params["out"], "; ".join(verified.out.splitlines()[-1:] + verified.messages)),
            **result
        )
    if params["record"] and not os.path.isdir(params["record"]):
        command.module.warn("%s is what the plan says, but the record %s is not there" % (params["out"], params["record"]))
    command.module.exit_json(**result)


def migrate(command):
    if is_there(command.params["out"]):
        leave_what_is_there(command)
    if command.module.check_mode:
        private = dict(command.params, out=command.private("migrated"), record=None, html=None)
        run = command.run(params=private, more=["--dry-run"])
    else:
        run = command.run()
    result = result_of(command, run)
    result["changed"] = run.rc == 0
    end(command, run, result)


def look(command):
    params = dict(command.params)
    if command.module.check_mode and "html" in params:
        params["html"] = None
    run = command.run(params=params, more=[params["directory"]])
    end(command, run, result_of(command, run))


def main():
    module = AnsibleModule(
        argument_spec={
            "command": {"type": "str", "required": True, "choices": ["check", "plan", "migrate", "verify"]},
            "program": {"type": "path", "default": "schema-migrate"},
            "directory": {"type": "path"},
            "against": {"type": "path"},
            "rules": {"type": "dict"},
            "fail_on": {"type": "str", "choices": ["error", "warning"]},
            "from": {"type": "path", "aliases": ["old"]},
            "to": {"type": "path", "aliases": ["new"]},
            "base": {"type": "path"},
            "accept_base": {"type": "bool", "default": False},
            "exclude_oids": {"type": "list", "elements": "path", "default": []},
            "withdraw": {"type": "path"},
            "decisions": {"type": "list", "elements": "path", "default": []},
            "allow_unused": {"type": "bool", "default": False},
            "prefer": {"type": "str", "choices": ["old", "new"]},
            "repair": {"type": "bool", "default": False},
            "max_input": {"type": "str"},
            "plan": {"type": "path"},
            "save": {"type": "path"},
            "template": {"type": "path"},
            "html": {"type": "path"},
            "out": {"type": "path"},
            "record": {"type": "path"},
            "layout": {"type": "str", "choices": ["keep", "library"]},
            "allow_foreign_parent": {"type": "bool", "default": False},
        },
        required_if=[
            ("command", "check", ["directory"]),
            ("command", "plan", ["from", "to"]),
            ("command", "migrate", ["out"]),
            ("command", "migrate", ["plan", "from"], True),
            ("command", "verify", ["directory", "plan"]),
        ],
        required_together=[("from", "to")],
        mutually_exclusive=[("plan", key) for key in ("from", "base", "withdraw", "prefer")],
        supports_check_mode=True,
    )
    command = Command(module)
    if shutil.which(command.program) is None:
        module.fail_json(
            msg="%s is no program on this host. What to do: install schema-migrate, or name it with the option program."
            % command.program
        )
    {"check": look, "verify": look, "plan": plan, "migrate": migrate}[command.name](command)


if __name__ == "__main__":
    main()
