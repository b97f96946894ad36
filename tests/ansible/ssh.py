"""The role over a fleet of ten by SSH: upgraded, run once more, and rolled back."""

import scenario
import sites
from fleet import Fleet
from sshd import WORD_OF_SKIPPING, CannotLogIn, Sshd


def main():
    # The server is started below the small file system, so that whoever logs in sees it.
    with Fleet() as fleet, sites.make_sites(fleet) as small:
        try:
            with Sshd(fleet.root / "ssh") as sshd:
                fleet.connection = sshd.connection()
                fleet.settings = sshd.settings()
                run(fleet, small)
        except CannotLogIn as reason:
            print(f"{WORD_OF_SKIPPING}: {reason}")


def run(fleet, small):
    originals = {name: site.keep_original(fleet) for name, site in fleet.sites.items()}
    before = scenario.schema_trees(fleet, sites.ALL)
    small.site.take_room_away()
    scenario.upgrade(fleet, originals)
    scenario.second_run(fleet, sites.READY[:3])
    scenario.roll_back(fleet, before, sites.READY[:3])


main()
