"""The fleet of the tests: ten installations, each customised differently. Seven can be upgraded, two have something
undecided, and one has no space."""

from fleet import EXAMPLES, Site, SmallFileSystem, make_executable

OWN_TYPE = "attributetypes=( 1.3.6.1.4.1.32473.9.%d NAME 'own%d' SYNTAX 1.3.6.1.4.1.1466.115.121.1.15{%d} )\n"
OWN_CLASS = "objectclasses=( 1.3.6.1.4.1.32473.9.%d.1 NAME 'own%dClass' SUP top AUXILIARY MAY ( own%d ) )\n"
INFO = ("V3.system.at", "1.3.6.1.4.1.1466.115.121.1.15{2048}", "1.3.6.1.4.1.1466.115.121.1.15{8192}")
LONGER_INFO = INFO[:2] + ("1.3.6.1.4.1.1466.115.121.1.15{9000}",)

READY = ("full", "own", "described", "lists", "prefers", "untouched", "classes")
UNDECIDED = ("conflict", "everything")
WITHOUT_SPACE = "tight"
ALL = READY + UNDECIDED + (WITHOUT_SPACE,)


def own(number, length=64):
    return ("V3.user.at", "", OWN_TYPE % (number, number, length))


def make_sites(fleet):
    """Makes all sites, and gives back the small file system of the one without space."""
    excluded, withdrawn = EXAMPLES / "excluded-oids.txt", EXAMPLES / "withdraw-oids.txt"
    decisions = fleet.control / "decisions" / "full.toml"
    decisions.write_bytes((EXAMPLES / "decisions.toml").read_bytes())
    Site(fleet, "full", "old",
         options=["--exclude-oids", excluded, "--withdraw", withdrawn, "--decisions", EXAMPLES / "decisions.toml"],
         variables={"schema_upgrade_exclude_oids": [str(excluded)], "schema_upgrade_withdraw": str(withdrawn)})
    Site(fleet, "own", changes=[own(1)])
    Site(fleet, "described", changes=[("V3.system.at", "DESC 'Post box'", "DESC 'Box at the post office'"), own(2)])
    Site(fleet, "lists", changes=[own(3), own(4)], options=["--exclude-oids", fleet.control / "own.oids"],
         variables={"schema_upgrade_exclude_oids": [str(fleet.control / "own.oids")]})
    (fleet.control / "own.oids").write_text("1.3.6.1.4.1.32473.9.3\n")
    Site(fleet, "prefers", changes=[INFO], options=["--prefer", "old"], variables={"schema_upgrade_prefer": "old"})
    Site(fleet, "untouched", options=["--accept-base"], variables={"schema_upgrade_accept_base": True})
    Site(fleet, "classes", changes=[own(5), ("V3.user.oc", "", OWN_CLASS % (5, 5, 5))],
         options=["--layout", "library"], variables={"schema_upgrade_layout": "library"})
    Site(fleet, "conflict", changes=[LONGER_INFO])
    Site(fleet, "everything", "old")
    return make_tight_site(fleet)


def make_tight_site(fleet):
    """Room for the copy and the plan, and not for the record; or a limit of the size of files, which is as small."""
    (fleet.hosts / WITHOUT_SPACE).mkdir(parents=True)
    small = SmallFileSystem(fleet.hosts / WITHOUT_SPACE)
    if not small.is_there:
        (fleet.hosts / WITHOUT_SPACE).rmdir()
    site = TightSite(fleet, WITHOUT_SPACE, changes=[own(6), own(7)])
    site.small = small
    small.site = site
    site.limited = fleet.root / "limited" / "schema-migrate"
    site.limited.parent.mkdir()
    make_executable(site.limited, "#!/bin/bash\ntrap '' XFSZ\nulimit -f 8\nexec schema-migrate \"$@\"\n")
    return small


class TightSite(Site):
    def take_room_away(self):
        if self.small.is_there:
            self.small.resize(b"800k")
        else:
            self.variables["schema_upgrade_program"] = str(self.limited)

    def give_room(self):
        if self.small.is_there:
            self.small.resize(b"16m")
        self.variables.pop("schema_upgrade_program", None)
