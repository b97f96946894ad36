"""The role over a fleet of ten on this machine, from check mode to roll back."""

import scenario
import sites
from fleet import Fleet


def main():
    with Fleet() as fleet, sites.make_sites(fleet) as small:
        originals = {name: site.keep_original(fleet) for name, site in fleet.sites.items()}
        before = scenario.schema_trees(fleet, sites.ALL)
        small.site.take_room_away()
        scenario.check_mode(fleet)
        scenario.upgrade(fleet, originals)
        scenario.second_run(fleet, sites.READY)
        scenario.decide(fleet, originals)
        scenario.roll_back(fleet, before, sites.ALL)
        scenario.answers_are_left_alone(fleet)


main()
