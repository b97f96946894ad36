"""What the role does with a fleet, stage after stage. Each stage finds the fleet as the one before has left it."""

import json
import re
import shutil
import subprocess

import sites
from fleet import SOURCE, TOOL, contents, expect, expect_in, tree

# What Ansible and the tests write themselves.
OWN = ("inventory.json", "home", "remote", "tmp")
# Whose plans and records come to the controller.
FETCHED = ("full", "conflict")


def everything(fleet):
    return {name: about for name, about in tree(fleet.root).items() if not name.startswith(OWN)}


def schema_trees(fleet, names):
    return {name: tree(fleet.sites[name].schema) for name in names}


def expect_nothing_temporary(fleet):
    left = [str(path) for folder in ("tmp", "remote") for path in (fleet.root / folder).iterdir()]
    expect("temporary files", [], left)


def check_mode(fleet):
    before = everything(fleet)
    tried = ("full", "prefers", "untouched", sites.WITHOUT_SPACE, "conflict")
    played = fleet.play("--check", "--diff", "--limit", ",".join(tried))
    expect("what is there after check mode", before, everything(fleet))
    expect_nothing_temporary(fleet)
    # Only what is written misses room.
    played.expect(failed=["conflict"], changed=tried)
    expect_in("the difference", """\
attribute type info (0.9.2342.19200300.100.1.4): changed by both in conflict -> old [data]
  the site and the release changed it in two ways: SYNTAX; OLD's is preferred
  SYNTAX
    base    1.3.6.1.4.1.1466.115.121.1.15{2048}
    old     1.3.6.1.4.1.1466.115.121.1.15{8192}
    new     1.3.6.1.4.1.1466.115.121.1.15{4096}
    result  1.3.6.1.4.1.1466.115.121.1.15{8192}
""", played.text)
    expect_in("the difference of an undecided site", """\
    new     1.3.6.1.4.1.1466.115.121.1.15{4096}
    result  undecided
""", played.text)


def upgrade(fleet, originals):
    failing = sites.UNDECIDED + (sites.WITHOUT_SPACE,)
    before = schema_trees(fleet, failing)
    for name in FETCHED:
        fleet.sites[name].variables.update(schema_upgrade_plans=str(fleet.control / "plans"),
                                           schema_upgrade_records=str(fleet.control / "records"))
    played = fleet.play()
    played.expect(failed=failing, changed=sites.ALL)
    expect_in_place(fleet, originals, sites.READY)
    expect("the sites that failed", before, schema_trees(fleet, failing))
    expect("templates", ["conflict.toml", "everything.toml"],
           sorted(path.name for path in (fleet.control / "undecided").iterdir()))
    template = fleet.control / "undecided/conflict.toml"
    message = played.message("conflict")
    expect_in("the message of the undecided site", f"1 definitions are undecided, and the schema was left as it is. What to"
              f" do: decide in {template}, keep that as {fleet.control}/decisions/conflict.toml, and run again.", message)
    expect_in("the message of the undecided site", "undecided: attribute type info (0.9.2342.19200300.100.1.4): the site"
              " and the release changed it in two ways: SYNTAX", message)
    expect_in("the message of the other", "11 definitions are undecided", played.message("everything"))
    message = played.message(sites.WITHOUT_SPACE)
    expect_in("the message of the site without space", "not-written (exit code 5)", message)
    if not re.search("No space left on device|File too large", message):
        raise SystemExit(f"the message of the site without space does not say so: {message}")
    expect_plans_and_records(fleet)


def expect_plans_and_records(fleet):
    plans = {path.stem: json.loads(path.read_text())["ready"] for path in (fleet.control / "plans").iterdir()}
    expect("plans on the controller", {"conflict": False, "full": True}, plans)
    expect("records on the controller", ["full.tar"], [path.name for path in (fleet.control / "records").iterdir()])
    subprocess.run(["tar", "-xf", fleet.control / "records/full.tar", "-C", fleet.root], check=True)
    subprocess.run(["sha256sum", "--check", "--quiet", "SHA256SUMS"], cwd=fleet.root / "record", check=True)
    shutil.rmtree(fleet.root / "record")


def expect_in_place(fleet, originals, names):
    """In place is what the tool itself makes of the site, verified by it; the old directory is kept as it was."""
    for name in names:
        site = fleet.sites[name]
        out = fleet.root / "by-hand" / name
        expected = fleet.by_hand(site, originals[name], out)
        if name != "classes":  # the library writes the time
            expect(f"the schema of {name}", expected, contents(site.schema))
        subprocess.run([TOOL, "verify", "--plan", site.work / "plan.json", site.schema], check=True,
                       stdout=subprocess.DEVNULL)
        expect(f"the old schema of {name}", contents(originals[name]), contents(site.work / "standby"))
        expect(f"the mode of {name}", site.mode, oct(site.schema.stat().st_mode))
        shutil.rmtree(out)


def second_run(fleet, names):
    before = everything(fleet)
    played = fleet.play("--limit", ",".join(names))
    played.expect(failed=[], changed=[])
    expect("what is there after the second run", before, everything(fleet))


def decide(fleet, originals):
    """The templates filled in, and room for the site that had none."""
    template = (fleet.control / "undecided/conflict.toml").read_text()
    decided, number = re.subn(r"(?m)^# take:.*$", 'take = "old"', template)
    expect("answers", 1, number)
    (fleet.control / "decisions/conflict.toml").write_text(decided)
    fleet.sites["conflict"].options = ["--decisions", fleet.control / "decisions/conflict.toml"]
    decisions = fleet.control / "decisions/everything.toml"
    shutil.copy(fleet.control / "decisions/full.toml", decisions)
    fleet.sites["everything"].options = ["--decisions", decisions]
    fleet.sites[sites.WITHOUT_SPACE].give_room()
    late = sites.UNDECIDED + (sites.WITHOUT_SPACE,)
    played = fleet.play("--limit", ",".join(late))
    played.expect(failed=[], changed=late)
    expect_in_place(fleet, originals, late)


def roll_back(fleet, before, names):
    fleet.play("--limit", ",".join(names), schema_upgrade_state="rolled_back").expect(failed=[], changed=names)
    expect("the schemas after rolling back", {name: before[name] for name in names}, schema_trees(fleet, names))
    again = everything(fleet)
    fleet.play("--limit", ",".join(names[:3]), schema_upgrade_state="rolled_back").expect(failed=[], changed=[])
    expect("what is there after rolling back once more", again, everything(fleet))


def answers_are_left_alone(fleet):
    """Who answers in the template where it is loses nothing."""
    fleet.sites["conflict"].variables["schema_upgrade_host_decisions"] = "/nowhere"
    template = fleet.control / "undecided/conflict.toml"
    template.write_text(template.read_text() + 'take = "new"\n')
    answered = template.read_bytes()
    played = fleet.play("--limit", "conflict")
    played.expect(failed=["conflict"], changed=["conflict"])
    expect_in("the message about answers", f"{template} holds answers already", played.message("conflict"))
    expect("the answers", answered, template.read_bytes())
