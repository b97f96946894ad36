"""Both modules by themselves: what they return, what they say, and what they leave alone."""

import json
import shutil
import subprocess

from fleet import EXAMPLES, SOURCE, TOOL, Fleet, contents, expect, expect_in, make_executable, tree

MODULES = SOURCE / "ansible/ansible_collections/directory/schema/plugins/modules"
COMPLETE = {"exclude_oids": [str(EXAMPLES / "excluded-oids.txt")], "withdraw": str(EXAMPLES / "withdraw-oids.txt"),
            "decisions": [str(EXAMPLES / "decisions.toml")]}


class Bench:
    """A folder with the example in it, and the modules run there."""

    def __init__(self, fleet):
        self.fleet = fleet
        self.folder = fleet.root / "it's a $(folder) with; names"
        for name in ("base", "old", "new"):
            shutil.copytree(EXAMPLES / name, self.folder / name)
        self.sides = {"base": str(self.folder / "base"), "from": str(self.folder / "old"), "to": str(self.folder / "new")}

    def path(self, name):
        return str(self.folder / name)

    def run(self, module="schema_migrate", check=False, diff=False, **options):
        if module == "schema_migrate":
            options.setdefault("program", str(TOOL))
        arguments = dict(options, _ansible_check_mode=check, _ansible_diff=diff,
                         _ansible_remote_tmp=str(self.fleet.root / "tmp"), _ansible_keep_remote_files=False)
        done = subprocess.run(["/usr/bin/python3", "-B", MODULES / f"{module}.py"], cwd=self.fleet.root,
                              input=json.dumps({"ANSIBLE_MODULE_ARGS": arguments}).encode(), stdout=subprocess.PIPE,
                              env=self.fleet.environment(), check=False)
        return json.loads(done.stdout)

    def expect(self, result, outcome, rc, changed=False):
        expect("outcome", (outcome, rc, changed, rc != 0), (result.get("outcome"), result.get("rc"), result.get("changed"),
                                                           result.get("failed", False)))
        if rc != 0:
            expect_in("the message", "What to do: ", result["msg"])


def check(bench):
    before = tree(bench.folder)
    result = bench.run(command="check", directory=bench.path("old"), rules={"L112": "off"})
    bench.expect(result, "done", 0)
    expect("counts", {"error": 0, "warning": 24, "accepted": 0}, result["counts"])
    expect("facts", {"command": "check", "outcome": "done", "counts": result["counts"],
                     "version": (SOURCE / "VERSION").read_text().strip()}, result["ansible_facts"]["schema_migrate"])
    result = bench.run(command="check", directory=bench.path("old"), rules={"L112": "off"}, fail_on="warning")
    bench.expect(result, "findings", 1)
    expect_in("the message", "0 errors, 24 warnings; ", result["msg"])
    expect_in("the message", "and 5 more lines", result["msg"])
    expect("facts of a task that fails", None, result.get("ansible_facts"))
    result = bench.run(command="check", directory=bench.path("nowhere"))
    bench.expect(result, "input", 3)
    expect_in("the message", "nowhere: error: the directory cannot be read: No such file or directory", result["msg"])
    bench.expect(bench.run(command="check", directory=bench.path("old"), rules={"L112": "loud"}), "usage", 2)
    expect("what check leaves", before, tree(bench.folder))


def plan(bench):
    files = {"save": bench.path("plan.json"), "template": bench.path("undecided.toml")}
    before = tree(bench.folder)
    result = bench.run(command="plan", check=True, diff=True, **bench.sides, **files)
    bench.expect(result, "undecided", 4, changed=True)
    expect("what check mode leaves", before, tree(bench.folder))
    result = bench.run(command="plan", **bench.sides, **files)
    bench.expect(result, "undecided", 4, changed=True)
    expect("undecided", 11, len(result["undecided"]))
    expect("the first of them", {
        "kind": "attribute-type", "oid": "0.9.2342.19200300.100.1.4", "name": "info",
        "class": "changed-by-both-in-conflict", "outcome": "undecided", "risk": "data", "decision": None,
        "reason": "the site and the release changed it in two ways: SYNTAX"}, result["undecided"][0])
    template = (bench.folder / "undecided.toml").read_text()
    # An extension that goes with its attribute type has no entry.
    expect("entries of the template", 10, template.count("[[definition]]"))
    before = tree(bench.folder)
    bench.expect(bench.run(command="plan", **bench.sides, **files), "undecided", 4)
    expect("what a second run leaves", before, tree(bench.folder))
    # One that somebody has answered in is not replaced; one that nobody has, is.
    (bench.folder / "undecided.toml").write_text(template + 'take = "old"\n')
    before = tree(bench.folder)
    result = bench.run(command="plan", **bench.sides, **files)
    expect_in("the message", "undecided.toml holds answers already, and was left alone", result["msg"])
    expect("what is left of answers", before, tree(bench.folder))
    (bench.folder / "undecided.toml").write_text("# nothing\n")
    bench.expect(bench.run(command="plan", **bench.sides, **files), "undecided", 4, changed=True)
    expect("the template", template, (bench.folder / "undecided.toml").read_text())
    result = bench.run(command="plan", **dict(bench.sides, base=bench.path("old")))
    bench.expect(result, "refused", 4)
    expect_in("the message", "BASE equals OLD definition by definition", result["msg"])
    result = bench.run(command="plan", diff=True, **bench.sides, **COMPLETE, **files)
    bench.expect(result, "done", 0, changed=True)
    expect("ready", (True, []), (result["ready"], result["undecided"]))
    expect_in("the difference", "object class room (0.9.2342.19200300.100.4.7): changed by both mergeable -> merged"
              " [structure]\n  the site and the release changed different parts of it\n  MAY\n    base    roomNumber $"
              " description $ seeAlso $ telephoneNumber\n    old     roomNumber $ description $ seeAlso $ telephoneNumber $"
              " siteFloor\n    new     roomNumber $ description $ seeAlso $ telephoneNumber $ buildingName\n    result "
              " roomNumber $ description $ seeAlso $ telephoneNumber $ buildingName $ siteFloor\n",
              result["diff"]["prepared"])


def migrate(bench):
    by_options = dict(bench.sides, **COMPLETE)
    out, record = {"out": bench.path("out")}, {"record": bench.path("record")}
    before = tree(bench.folder)
    result = bench.run(command="migrate", check=True, **by_options, **out, **record)
    bench.expect(result, "done", 0, changed=True)
    expect("what check mode leaves", before, tree(bench.folder))
    bench.expect(bench.run(command="migrate", **bench.sides, **out), "undecided", 4)
    expect("what an undecided run leaves", before, tree(bench.folder))
    bench.expect(bench.run(command="migrate", **by_options, out=bench.path("no/out")), "not-written", 5)
    bench.expect(bench.run(command="migrate", **by_options, **out, **record), "done", 0, changed=True)
    written = tree(bench.folder)
    bench.expect(bench.run(command="migrate", **by_options, **out, **record), "done", 0)
    plan_of_the_record = {"plan": bench.path("record/plan.json")}
    bench.expect(bench.run(command="migrate", check=True, **plan_of_the_record, **out), "done", 0)
    bench.expect(bench.run(command="verify", **plan_of_the_record, directory=bench.path("out")), "done", 0)
    bench.expect(bench.run(command="migrate", **plan_of_the_record, out=bench.path("second")), "done", 0, changed=True)
    expect("a second output", contents(bench.path("out")), contents(bench.path("second")))
    shutil.rmtree(bench.path("second"))
    expect("what further runs leave", written, tree(bench.folder))
    (bench.folder / "out/V3.user.oc").write_text("# nothing\n")
    written = tree(bench.folder)
    result = bench.run(command="migrate", **by_options, **out)
    bench.expect(result, "refused", 1)
    expect_in("the message", "out is there already, and is not what the plan says, so that it was left alone", result["msg"])
    result = bench.run(command="verify", **plan_of_the_record, directory=bench.path("out"))
    bench.expect(result, "differences", 1)
    expect_in("the message", "Not verified: ", result["msg"])
    (bench.folder / "new/V3.user.oc").write_text("# another\n")
    result = bench.run(command="migrate", **plan_of_the_record, out=bench.path("second"))
    bench.expect(result, "refused", 4)
    expect_in("the message", "the plan does not hold any more", result["msg"])


def what_does_not_fit(bench):
    result = bench.run(command="check", directory=bench.path("old"), save=bench.path("x"), prefer="old")
    expect("options of another command", "command check takes no prefer, save", result["msg"])
    result = bench.run(command="check", directory=bench.path("old"), program="/nowhere/schema-migrate")
    expect_in("a program that is not there", "/nowhere/schema-migrate is no program on this host. What to do: ", result["msg"])
    result = bench.run(command="migrate", out=bench.path("x"))
    expect_in("neither plan nor sides", "plan, from", result["msg"])
    killed = bench.fleet.root / "killed"
    make_executable(killed, "#!/bin/sh\nkill -9 $$\n")
    bench.expect(bench.run(command="check", directory=bench.path("old"), program=str(killed)), "failed", -9)


def directory(bench):
    """An upgrade of a directory by hand: what is refused, and what is left."""
    path, work = bench.path("server"), bench.path("server.upgrade")
    shutil.copytree(bench.path("old"), path)
    (bench.folder / "server/notes").write_text("ours\n")
    at = {"module": "schema_directory", "path": path, "work": work}
    expect_in("nothing to roll back", "there is nothing to roll back", bench.run(**at, state="rolled_back")["msg"])
    before = tree(bench.folder)
    result = bench.run(check=True, **at, state="prepared")
    expect("preparing in check mode", (True, False, path), (result["changed"], result["upgraded"], result["source"]))
    expect("what check mode leaves", before, tree(bench.folder))
    for changed in (True, False):
        result = bench.run(**at, state="prepared")
        expect("preparing", (changed, False, f"{work}/original"), (result["changed"], result["upgraded"], result["source"]))
    expect_in("without a migrated directory", "standby is not there; migrate to it first",
              bench.run(**at, state="in_place")["msg"])
    shutil.copytree(bench.path("base"), f"{work}/standby")
    (bench.folder / "server/notes").write_text("changed\n")
    result = bench.run(**at, state="in_place")
    expect_in("a directory that has changed", "has changed since it was copied, and was left in place", result["msg"])
    expect("preparing again", True, bench.run(**at, state="prepared")["changed"])
    old = tree(path)
    result = bench.run(**at, state="in_place", others=[bench.path("new"), path])
    expect("in place", (True, True), (result["changed"], result["upgraded"]))
    expect("what is in place", dict(contents(bench.path("base")), notes=b"changed\n"), contents(path))
    expect("the old directory", old, tree(f"{work}/standby"))
    for state in ("prepared", "cleared", "in_place"):
        result = bench.run(**at, state=state)
        expect(f"{state} when it is in place", (False, True), (result["changed"], result["upgraded"]))
    # Whatever becomes of either, it is known which is which.
    (bench.folder / "server/V3.user.at").write_text("# changed by the server\n")
    (bench.folder / "server.upgrade/standby/later").write_text("\n")
    expect("which is in place", True, bench.run(**at, state="prepared")["upgraded"])
    (bench.folder / "server.upgrade/standby/later").unlink()
    for changed in (True, False):
        result = bench.run(**at, state="rolled_back")
        expect("rolled back", (changed, False), (result["changed"], result["upgraded"]))
    expect("the directory after rolling back", old, tree(path))
    result = bench.run(**at, state="cleared")
    expect("cleared", [f"{work}/standby.1"], result["renamed"])
    expect("what is kept of it", b"# changed by the server\n", contents(f"{work}/standby.1")["V3.user.at"])
    result = bench.run(module="schema_directory", path=path, work=f"{path}/inside", state="prepared")
    expect_in("a work directory inside", "name a work directory beside the schema", result["msg"])
    result = bench.run(module="schema_directory", path=path, work="/proc/work", state="prepared")
    expect_in("another file system", "lie in two file systems", result["msg"])


def main():
    for test in (check, plan, migrate, what_does_not_fit, directory):
        with Fleet() as fleet:
            test(Bench(fleet))
            expect("temporary files", [], [path.name for path in (fleet.root / "tmp").iterdir()])


main()
