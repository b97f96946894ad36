"""fleet.py SCHEMA-MIGRATE FOLDER: writes the plans of a thousand installations into the folder, and measures what
schema-migrate fleet takes for a hundred and for all of them."""

import hashlib
import json
import os
import random
import statistics
import sys

TOOL, FOLDER = sys.argv[1:3]
DEFINITIONS, FEW, MANY, ROUNDS = 2000, 100, 1000, 3
PLANS = [os.path.join(FOLDER, f"server{server:04}.json") for server in range(MANY)]
SYNTAX = "1.3.6.1.4.1.1466.115.121.1.15"


def digest(text):
    return hashlib.sha256(text.encode()).hexdigest()


def row(number, length):
    """A definition as plan --save writes it, whose site has this length of its own, or none."""
    is_open = length is not None and number % 4 == 0
    change = "same" if length is None else "changed-by-both-in-conflict" if is_open else "changed-by-site"
    clauses = [] if length is None else [
        {"clause": "SYNTAX", "base": f"{SYNTAX}{{1024}}", "old": f"{SYNTAX}{{{length}}}",
         "new": f"{SYNTAX}{{{2048 if is_open else 1024}}}",
         "result": None if is_open else f"{SYNTAX}{{{length}}}", "decided": not is_open, "risk": "data"}]
    others = [("OID", f"1.3.6.1.4.1.32473.1.{number}"), ("NAME", f"'attribute{number}'"),
              ("DESC", f"'What the attribute number {number} is for'"), ("EQUALITY", "caseIgnoreMatch"),
              ("SUBSTR", "caseIgnoreSubstringsMatch"), ("SYNTAX", f"{SYNTAX}{{1024}}"),
              ("USAGE", "userApplications")]
    question = {"by": "oid", "take": ["old", "new", "base", "drop"],
                "clauses": [{"clause": "SYNTAX", "take": ["old", "new", "base"]}], "move": False}
    return {
        "kind": "attribute-type", "oid": others[0][1], "name": f"attribute{number}", "class": change,
        "renamed": False, "renumbered": False, "risk": "data" if clauses else "none",
        "outcome": "same" if length is None else "undecided" if is_open else "old",
        "reason": "the site and the release changed it in two ways: SYNTAX" if is_open else "as it is",
        "notes": [], "decision": None, "question": question if is_open else None,
        "fingerprint": "sha256:" + digest(f"{number} {length}"), "text": None, "clauses": clauses,
        "otherClauses": [{"clause": clause, "value": value} for clause, value in others
                         if clause != "SYNTAX" or not clauses],
        "places": {side: {"file": f"/srv/{side}/V3.user.at", "line": number + 1}
                   for side in ("base", "old", "new", "result")}}


def changes_of(server):
    """Fifty definitions are changed by many, in five ways; one by this server alone."""
    draw = random.Random(server)
    changes = {at * (DEFINITIONS // 50): 2000 + draw.randrange(5) for at in range(50) if draw.random() < .4}
    changes.setdefault(draw.randrange(DEFINITIONS), 5000 + server)
    return changes


def plan_of(server, unchanged):
    changes = changes_of(server)
    rows = [json.dumps(row(at, changes[at]), indent=2) if at in changes else unchanged[at]
            for at in range(DEFINITIONS)]
    head = {"version": 1, "program": {"name": "schema-migrate", "version": "2.0.0"}, "command": "plan",
            "ready": not any(at % 4 == 0 for at in changes),
            "options": {"base": "/srv/base", "from": "/srv/old", "to": "/srv/new", "excludeOids": [],
                        "withdraw": None, "decisions": [], "prefer": None, "acceptBase": False,
                        "allowUnused": False, "repair": False},
            "inputs": [{"role": role, "path": f"/srv/{role}/V3.user.at",
                        "sha256": digest(role if role != "old" else str(server))}
                       for role in ("base", "old", "new")],
            "outputs": []}
    tail = {"superiors": [], "repairs": [], "findings": [], "newInResult": [], "refusals": [],
            "failures": [], "counts": {"definitions": DEFINITIONS, "class": {}, "outcome": {}, "risk": {}}}
    return (json.dumps(head, indent=2)[:-2] + ',\n  "definitions": [\n' + ",\n".join(rows) + "\n  ],\n" +
            json.dumps(tail, indent=2)[2:] + "\n")


def write_plans():
    """In a process of its own, whose memory is none of that of the runs."""
    writer = os.fork()
    if writer == 0:
        unchanged = [json.dumps(row(at, None), indent=2) for at in range(DEFINITIONS)]
        for server in range(MANY):
            with open(PLANS[server], "w", encoding="ascii") as file:
                file.write(plan_of(server, unchanged))
        os._exit(0)
    os.waitpid(writer, 0)


def measured(plans):
    """Seconds of the program and of the system for it, and KiB at most, of one run."""
    process = os.posix_spawn(TOOL, [TOOL, "fleet", *plans], os.environ, file_actions=[
        (os.POSIX_SPAWN_OPEN, 1, "/dev/null", os.O_WRONLY, 0),
        (os.POSIX_SPAWN_OPEN, 2, "/dev/null", os.O_WRONLY, 0)])
    _, status, usage = os.wait4(process, 0)
    if os.waitstatus_to_exitcode(status) != 4:
        sys.exit(f"schema-migrate fleet ended with {os.waitstatus_to_exitcode(status)}")
    return usage.ru_utime, usage.ru_stime, usage.ru_maxrss


def median(values):
    return statistics.median(list(values))


def main():
    write_plans()
    size = sum(os.path.getsize(plan) for plan in PLANS) / 1e6
    rounds = [(measured(PLANS[:FEW]), measured(PLANS)) for _ in range(ROUNDS)]
    print(f"| plans of {DEFINITIONS} definitions | MB | program | system | peak memory |")
    print("|---|---:|---:|---:|---:|")
    for at, count in enumerate((FEW, MANY)):
        print(f"| {count} | {size * count / MANY:.0f} | {median(run[at][0] for run in rounds):.2f} s | "
              f"{median(run[at][1] for run in rounds):.2f} s | "
              f"{median(run[at][2] for run in rounds) / 1024:.1f} MiB |")
    ratios = [median(run[1][of] / max(run[0][of], .01) for run in rounds) for of in range(3)]
    print(f"| ratio, median of {ROUNDS} rounds | | {ratios[0]:.2f} | {ratios[1]:.2f} | {ratios[2]:.2f} |")


main()
