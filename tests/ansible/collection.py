"""What the collection says of itself is so: versions, options, defaults, and that every file of it can be read."""

import json
import py_compile
import shutil
import subprocess

import yaml

from fleet import SOURCE, Fleet, Site, expect

COLLECTION = SOURCE / "ansible/ansible_collections/directory/schema"
MODULES = ("schema_migrate", "schema_directory")
ROLE = COLLECTION / "roles/upgrade"


class Asked(Exception):
    pass


def specification_of(name):
    """What the module gives to AnsibleModule."""
    source = (COLLECTION / f"plugins/modules/{name}.py").read_text()
    module = {"__name__": name}
    exec(compile(source, name, "exec"), module)  # pylint: disable=exec-used
    asked = {}

    def ask(**arguments):
        asked.update(arguments)
        raise Asked

    module["AnsibleModule"] = ask
    try:
        module["main"]()
    except Asked:
        return asked
    raise SystemExit(f"{name} makes no AnsibleModule")


def facts_of(option):
    keys = ("type", "elements", "default", "choices", "required", "aliases")
    return {key: option[key] for key in keys if option.get(key) not in (None, False, [])}


def modules_are_documented(fleet):
    for name in MODULES:
        full = f"directory.schema.{name}"
        printed = subprocess.run(["ansible-doc", "--json", full], env=fleet.environment(), check=True, capture_output=True)
        doc = json.loads(printed.stdout)[full]
        specification = specification_of(name)
        expect(f"options of {name}", {key: facts_of(value) for key, value in specification["argument_spec"].items()},
               {key: facts_of(value) for key, value in doc["doc"]["options"].items()})
        expect(f"{name} supports check mode", True, specification["supports_check_mode"])
        for key, value in {**doc["doc"]["options"], **doc["return"]}.items():
            if not value.get("description") or not value.get("type"):
                raise SystemExit(f"{name}: {key} has no description or type")
        tasks = yaml.safe_load(doc["examples"])
        for task in tasks:
            unknown = set(task[full]) - set(doc["doc"]["options"])
            expect(f"unknown options of the example {task['name']}", set(), unknown)
        text = subprocess.run(["ansible-doc", full], env=fleet.environment(), check=True, capture_output=True).stdout
        if b"RETURN VALUES" not in text:
            raise SystemExit(f"ansible-doc tells no returned values of {name}")


def role_is_documented(fleet):
    specification = yaml.safe_load((ROLE / "meta/argument_specs.yml").read_text())["argument_specs"]
    options = specification["main"]["options"]
    defaults = yaml.safe_load((ROLE / "defaults/main.yml").read_text())
    expect("variables with a default, or required", set(options),
           set(defaults) | {name for name, option in options.items() if option.get("required")})
    told = {name: option["default"] for name, option in options.items() if "default" in option}
    expect("defaults", {name: defaults[name] for name in told}, told)
    readme = (COLLECTION / "README.md").read_text()
    expect("variables that README does not name", [], [name for name in options if f"`{name}`" not in readme])
    done = subprocess.run(["ansible-doc", "-t", "role", "directory.schema.upgrade"], env=fleet.environment(), check=True,
                          capture_output=True)
    for name in options:
        if name not in done.stdout.decode():
            raise SystemExit(f"ansible-doc does not tell of {name}")


def every_file_can_be_read(fleet):
    version = (SOURCE / "VERSION").read_text().strip()
    expect("version of the collection", version, yaml.safe_load((COLLECTION / "galaxy.yml").read_text())["version"])
    for path in sorted(COLLECTION.rglob("*.py")):
        py_compile.compile(str(path), cfile=str(fleet.root / "compiled"), doraise=True)
    for path in sorted(COLLECTION.rglob("*.yml")):
        yaml.safe_load(path.read_text())
    if shutil.which("yamllint"):
        rules = "{extends: default, rules: {line-length: {max: 150}, braces: {max-spaces-inside: 1}}}"
        subprocess.run(["yamllint", "--strict", "-d", rules, COLLECTION], check=True)
    Site(fleet, "one")
    fleet.write_inventory()
    subprocess.run(["ansible-playbook", "--syntax-check", "-i", fleet.root / "inventory.json", fleet.control / "upgrade.yml",
                    fleet.control / "rollback.yml"],
                   env=fleet.environment(), check=True, stdout=subprocess.DEVNULL)
    subprocess.run(["ansible-galaxy", "collection", "build", "--output-path", fleet.root / "built", COLLECTION],
                   env=fleet.environment(), check=True, stdout=subprocess.DEVNULL)
    expect("what is built", [f"directory-schema-{version}.tar.gz"], [path.name for path in (fleet.root / "built").iterdir()])


def main():
    with Fleet() as fleet:
        modules_are_documented(fleet)
        role_is_documented(fleet)
        every_file_can_be_read(fleet)


main()
