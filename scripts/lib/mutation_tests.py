"""The tests of a scratch copy of the project, in steps that scripts/mutate runs one after another."""

import collections
import hashlib
import json
import os
import re
import resource
import shutil
import signal
import subprocess
import time

QUICK = 0.15  # seconds up to which a test belongs to the first step of its program
A_MOMENT = 1  # seconds up to which a test counts with --quick
MEMORY = 6 << 30

# Tests to run at once. `program` is what they are built into, "" for all of the build.
Step = collections.namedtuple('Step', 'name program command folder environment seconds')

CONFIGURE = ['-G', 'Ninja', '-DCMAKE_BUILD_TYPE=None', '-DCMAKE_CXX_FLAGS=-O1 -w',
             '-DBUILD_TESTING=ON', '-DCMAKE_LINK_DEPENDS_NO_SHARED=ON',
             '-DCMAKE_GTEST_DISCOVER_TESTS_DISCOVERY_MODE=PRE_TEST']


def limits():
    os.setsid()
    resource.setrlimit(resource.RLIMIT_AS, (MEMORY, MEMORY))
    resource.setrlimit(resource.RLIMIT_CORE, (0, 0))


class Copy:
    """A scratch copy of the project with a build of its own, and a /tmp of its own if it may."""

    def __init__(self, project, place, may_mount):
        self.project, self.place = project, place
        self.tree, self.build, self.tmp = (os.path.join(place, n) for n in ('tree', 'build', 'tmp'))
        self.may_mount = may_mount
        for folder in (self.tree, self.tmp):
            os.makedirs(folder, exist_ok=True)
        os.chmod(self.tmp, 0o1777)
        self.environment = dict(os.environ, LC_ALL='C', CCACHE_BASEDIR=place, CCACHE_NOHASHDIR='1')

    def update(self):
        """Makes the tree what the project is now; files that are equal keep their time."""
        names = subprocess.run(
            ['git', 'ls-files', '-z', '--cached', '--others', '--exclude-standard'],
            cwd=self.project, check=True, capture_output=True).stdout.decode().split('\0')
        names = {name for name in names if name and os.path.isfile(os.path.join(self.project, name))}
        for folder, _, files in os.walk(self.tree):
            for file in files:
                path = os.path.join(folder, file)
                if os.path.relpath(path, self.tree) not in names:
                    os.remove(path)
        for name in names:
            source, target = os.path.join(self.project, name), os.path.join(self.tree, name)
            os.makedirs(os.path.dirname(target), exist_ok=True)
            if not os.path.exists(target) or open(source, 'rb').read() != open(target, 'rb').read():
                shutil.copy(source, target)

    def configure(self):
        options = list(CONFIGURE)
        if shutil.which('ccache'):
            options.append('-DCMAKE_CXX_COMPILER_LAUNCHER=ccache')
        subprocess.run(['cmake', '-S', self.tree, '-B', self.build] + options, check=True,
                       env=self.environment, stdout=subprocess.DEVNULL)

    def make(self, targets, *options):
        """Whether the targets, or everything, can be built."""
        with open(os.path.join(self.place, 'build.log'), 'wb') as log:
            return subprocess.run(['ninja', '-C', self.build, '-j1', *options] + targets,
                                  env=self.environment, stdout=log, stderr=log).returncode == 0

    def read(self, path):
        with open(os.path.join(self.tree, path), encoding='utf-8', newline='') as text:
            return text.read()

    def write(self, path, text):
        with open(os.path.join(self.tree, path), 'w', encoding='utf-8', newline='') as out:
            out.write(text)

    def run(self, command, folder, environment, seconds):
        """Exit code and output, with None for one that had to be ended."""
        if self.may_mount:
            command = ['unshare', '-m', 'sh', '-c', 'mount --make-rprivate / && '
                       'mount --bind "$0" /tmp && exec "$@"', self.tmp] + command
        log = os.path.join(self.place, 'output')
        with open(log, 'wb') as out:
            process = subprocess.Popen(command, cwd=folder, env={**self.environment, **environment},
                                       stdin=subprocess.DEVNULL, stdout=out, stderr=out,
                                       preexec_fn=limits)
            try:
                code = process.wait(seconds)
            except subprocess.TimeoutExpired:
                code = None
            try:
                os.killpg(process.pid, signal.SIGKILL)
            except ProcessLookupError:
                pass
            process.wait()
        for name in os.listdir(self.tmp):
            path = os.path.join(self.tmp, name)
            if os.path.isdir(path) and not os.path.islink(path):
                subprocess.run(['chmod', '-R', 'u+rwX', path], check=False)
                shutil.rmtree(path, ignore_errors=True)
            else:
                os.remove(path)
        with open(log, 'rb') as text:
            return code, text.read().decode(errors='replace')

    # ---- The tests ----

    def measured_steps(self, without, is_whole, is_quick):
        """As steps(), kept on disk for as long as the tests are the same."""
        digest = hashlib.sha1(repr((without, is_whole, is_quick)).encode())
        for folder, _, files in sorted(os.walk(os.path.join(self.tree, 'tests'))):
            for file in sorted(files):
                with open(os.path.join(folder, file), 'rb') as data:
                    digest.update(data.read())
        kept = os.path.join(self.place, f'steps-{digest.hexdigest()[:10]}.json')
        if not os.path.exists(kept):
            measured = self.steps(without, is_whole and not is_quick, is_quick)
            with open(kept, 'w', encoding='utf-8') as out:
                json.dump(measured, out)
        with open(kept, encoding='utf-8') as text:
            steps, failing = json.load(text)
        return [Step(*step) for step in steps], failing

    def as_in(self, other, steps):
        """The steps of another copy as steps of this one."""
        def here(text):
            return text.replace(other.place + '/', self.place + '/')

        return [step._replace(command=[here(word) for word in step.command],
                              folder=here(step.folder),
                              environment={k: here(v) for k, v in step.environment.items()})
                for step in steps]

    def steps(self, without, is_whole, is_quick):
        """All tests in steps, measured; the second value names those that fail without any change.

        What needs the whole build counts only if that is to be had; slow tests only if all count.
        """
        listed = subprocess.run(['ctest', '--test-dir', self.build, '--show-only=json-v1'],
                                env=self.environment, check=True, capture_output=True).stdout
        programs, others, steps, failing = {}, [], [], []
        for test in json.loads(listed)['tests']:
            if 'command' not in test:
                failing.append(test['name'])
                continue
            command = test['command']
            program = os.path.relpath(command[0], self.build)
            own = program if not program.startswith('..') else ''
            properties = {p['name']: p['value'] for p in test.get('properties', [])}
            folder = properties.get('WORKING_DIRECTORY', self.build)
            environment = dict(pair.split('=', 1) for pair in properties.get('ENVIRONMENT', []))
            if re.search(without, test['name']) or not (own or is_whole):
                continue
            if any(word.startswith('--gtest_filter=') for word in command[1:]) and own:
                programs[own] = (command[0], folder, environment)
            else:
                others.append((not properties.get('FIXTURES_SETUP'), Step(
                    test['name'], own, command, folder, environment, 0)))
        for program, (path, folder, environment) in programs.items():
            self.split(program, path, folder, environment, is_quick, steps, failing)
        for _, step in sorted(others, key=lambda other: other[0]):
            begin = time.monotonic()
            code, _ = self.run(step.command, step.folder, step.environment, 10 if is_quick else 900)
            if code is None and is_quick:
                continue
            if code == 0:
                steps.append(step._replace(seconds=time.monotonic() - begin))
            else:
                failing.append(step.name)
        return steps, failing

    def split(self, program, path, folder, environment, is_quick, steps, failing):
        _, output = self.run([path], folder, environment, 60 if is_quick else 1800)
        quick, slow, bad = [], [], []
        for result, name, time in re.findall(
                r'^\[ +(OK|FAILED) +\] ([\w/.]+).* \((\d+) ms\)$', output, re.M):
            seconds = int(time) / 1000
            (bad if result == 'FAILED' else quick if seconds <= QUICK else slow).append(
                (name, seconds))
        if is_quick:
            slow = [(name, seconds) for name, seconds in slow if seconds <= A_MOMENT]
        if not quick + slow + bad:
            failing.append(program)
            return
        failing += [program + ' ' + name for name, _ in bad]
        name = os.path.basename(program)

        def step(title, chosen, tests):
            steps.append(Step(title, program,
                              [path, '--gtest_brief=1', '--gtest_fail_fast',
                               '--gtest_filter=' + chosen],
                              folder, environment, sum(seconds for _, seconds in tests)))

        if quick:
            # Of a run that was cut off the others are not known.
            step(name, ':'.join(test for test, _ in quick) if is_quick else
                 '-' + ':'.join(test for test, _ in slow + bad), quick)
        if slow:
            step(name + ', slow ones', ':'.join(test for test, _ in slow), slow)

    def objects(self):
        """For every source of the project, the objects that are compiled from it."""
        listed = subprocess.run(['ninja', '-C', self.build, '-t', 'deps'], check=True,
                                capture_output=True).stdout.decode()
        compiled, target = collections.defaultdict(set), ''
        for line in listed.splitlines():
            if line.startswith(' '):
                path = os.path.relpath(os.path.join(self.build, line.strip()), self.tree)
                compiled[path].add(target)
            else:
                target = line.split(':')[0]
        return compiled

    def inputs(self, program):
        """All that goes into a program."""
        listed = subprocess.run(['ninja', '-C', self.build, '-t', 'inputs', program], check=True,
                                capture_output=True).stdout.decode()
        return set(listed.split())
