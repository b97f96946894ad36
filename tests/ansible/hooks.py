"""The role with servers that are stopped and started: in which order, what happens when stopping fails, when a server
writes its schema while it stops, and when the whole run is killed in between. And a new server beside the old one, and
plans only."""

import json
import shutil
import subprocess

from fleet import EXAMPLES, TOOL, Fleet, Site, contents, expect, expect_in, tree
from sites import own

STOP = """---
- name: Stop
  ansible.builtin.command:
    argv: [sh, -c, "grep -q own V3.user.at && echo stop old >>../log || echo stop new >>../log; {{ while_stopping | default('true') }}"]
    chdir: "{{ schema_upgrade_directory }}"
  changed_when: true
"""
START = STOP.replace("Stop", "Start").replace("stop", "start").replace("{{ while_starting | default('true') }}", "true")


def make_sites(fleet):
    (fleet.control / "stop.yml").write_text(STOP)
    (fleet.control / "start.yml").write_text(START)
    hooks = {"schema_upgrade_stop_tasks": str(fleet.control / "stop.yml"),
             "schema_upgrade_start_tasks": str(fleet.control / "start.yml"),
             # What the site adds does not come along, so that its file tells which directory is in place.
             "schema_upgrade_exclude_oids": [str(fleet.control / "own.oids")], "schema_upgrade_record": False}
    (fleet.control / "own.oids").write_text("1.3.6.1.4.1.32473.9.1\n")
    Site(fleet, "served", changes=[own(1)], variables=hooks)
    Site(fleet, "unstoppable", changes=[own(1)], variables=dict(hooks, while_stopping="test -e ../stoppable"))
    Site(fleet, "writing", changes=[own(1)],
         variables=dict(hooks, while_stopping="test -e ../written || echo '# written' >>V3.user.oc; touch ../written"))
    Site(fleet, "killed", changes=[own(1)], variables=dict(
        hooks, while_stopping=f"test -e ../killed || {{ touch ../killed; kill -9 -$(cat {fleet.root}/tmp/group); }}"))


def log_of(fleet, name):
    log = fleet.sites[name].home / "log"
    return log.read_text().splitlines() if log.exists() else []


def servers(fleet):
    make_sites(fleet)
    before = {name: tree(site.schema) for name, site in fleet.sites.items()}
    three = "served,unstoppable,writing"
    fleet.play("--check", "--limit", "served").expect(failed=[], changed=["served"])
    expect("what check mode stops", [], log_of(fleet, "served"))
    played = fleet.play("--limit", three)
    played.expect(failed=["unstoppable", "writing"], changed=["served", "unstoppable", "writing"])
    expect("a server", ["stop old", "start new"], log_of(fleet, "served"))
    expect("one that does not stop", ["stop old", "start old"], log_of(fleet, "unstoppable"))
    expect("its schema", before["unstoppable"], tree(fleet.sites["unstoppable"].schema))
    expect("one that writes its schema", ["stop old", "start old"], log_of(fleet, "writing"))
    expect_in("the message", "has changed since it was copied, and was left in place; run the upgrade again",
              played.message("writing"))
    written = tree(fleet.sites["writing"].schema)
    (fleet.sites["unstoppable"].home / "stoppable").touch()
    fleet.play("--limit", three).expect(failed=[], changed=["unstoppable", "writing"])
    for name in ("unstoppable", "writing"):
        expect(name, ["stop old", "start old", "stop old", "start new"], log_of(fleet, name))
    expect("what the server had written", written, tree(fleet.sites["writing"].work / "standby"))
    fleet.play("--limit", "served", playbook="rollback.yml").expect(failed=[], changed=["served"])
    expect("rolled back", ["stop old", "start new", "stop new", "start old"], log_of(fleet, "served"))
    expect("its schema", before["served"], tree(fleet.sites["served"].schema))


def killed(fleet):
    """The controller is killed while the server is being stopped; the next run starts it again."""
    group = fleet.root / "tmp/group"
    played = fleet.play("--limit", "killed", group=group)
    expect("exit code of what was killed", -9, played.code)
    expect("killed", ["stop old"], log_of(fleet, "killed"))
    fleet.play("--limit", "killed").expect(failed=[], changed=["killed"])
    expect("run again", ["stop old", "stop old", "start new"], log_of(fleet, "killed"))
    # The same where the directories had been exchanged already.
    (fleet.sites["killed"].work / "stopped").touch()
    fleet.play("--limit", "killed").expect(failed=[], changed=["killed"])
    expect("run once more", ["stop old", "stop old", "start new", "start new"], log_of(fleet, "killed"))
    fleet.play("--limit", "killed").expect(failed=[], changed=[])


def another_server(fleet):
    """A new server is installed beside the old one; its schema is the release's."""
    old = fleet.root / "old-server"
    shutil.copytree(EXAMPLES / "old", old)
    site = Site(fleet, "another", "new", variables={
        "schema_upgrade_from": str(old), "schema_upgrade_to": str(fleet.hosts / "another/schema"),
        "schema_upgrade_decisions": [str(EXAMPLES / "decisions.toml")]})
    shipped = site.keep_original(fleet)
    site.options = ["--decisions", EXAMPLES / "decisions.toml"]
    fleet.play("--limit", "another", schema_upgrade_state="planned").expect(failed=[], changed=["another"])
    expect("what a plan alone leaves", contents(shipped), contents(site.schema))
    expect("what it makes", False, (site.work / "standby").exists())
    expect("the plan", True, json.loads((site.work / "plan.json").read_text())["ready"])
    fleet.play("--limit", "another").expect(failed=[], changed=["another"])
    expect("the schema", fleet.by_hand(site, old, fleet.root / "by-hand/another"), contents(site.schema))
    expect("the shipped one", contents(shipped), contents(site.work / "standby"))
    subprocess.run([TOOL, "verify", "--plan", site.work / "plan.json", site.schema], check=True, stdout=subprocess.DEVNULL)
    fleet.play("--limit", "another").expect(failed=[], changed=[])
    # What was in place before is kept when other decisions are made after a roll back.
    fleet.play("--limit", "another", schema_upgrade_state="rolled_back").expect(failed=[], changed=["another"])
    migrated = contents(site.work / "standby")
    other = (EXAMPLES / "decisions.toml").read_text().replace("clauses = { LENGTH = \"new\" }", "clauses = { LENGTH = \"old\" }")
    (fleet.control / "other.toml").write_text(other)
    site.variables["schema_upgrade_decisions"] = [str(fleet.control / "other.toml")]
    site.options = ["--decisions", fleet.control / "other.toml"]
    fleet.play("--limit", "another").expect(failed=[], changed=["another"])
    expect("the schema", fleet.by_hand(site, old, fleet.root / "by-hand/other"), contents(site.schema))
    expect("what was in place before", migrated, contents(site.work / "standby.1"))
    expect("its record", True, (site.work / "record.1/SHA256SUMS").exists())


def main():
    with Fleet() as fleet:
        servers(fleet)
        killed(fleet)
        another_server(fleet)


main()
