"""An SSH server of the test's own: on a port, with keys and settings of its own, all in the private folder. Neither
the server of the machine nor anybody's ~/.ssh has to do with it."""

import getpass
import os
import pathlib
import shutil
import socket
import subprocess
import time

WORD_OF_SKIPPING = "this machine does not let the tests log in by SSH"


class CannotLogIn(Exception):
    pass


def free_port():
    with socket.socket() as probe:
        probe.bind(("127.0.0.1", 0))
        return probe.getsockname()[1]


class Sshd:
    def __init__(self, folder):
        self.folder = pathlib.Path(folder)
        self.process = None
        self.is_run_folder_ours = False
        self.port = free_port()

    def __enter__(self):
        server = shutil.which("sshd", path=f"{os.environ['PATH']}:/usr/sbin")
        if server is None or shutil.which("ssh") is None:
            raise CannotLogIn("openssh-server and openssh-client are not installed")
        self.folder.mkdir(mode=0o700)
        for key in ("host", "user"):
            subprocess.run(["ssh-keygen", "-q", "-t", "ed25519", "-N", "", "-f", self.folder / key], check=True)
        shutil.copy(self.folder / "user.pub", self.folder / "authorized")
        host_key = (self.folder / "host.pub").read_text()
        (self.folder / "known").write_text(f"[127.0.0.1]:{self.port} {host_key}")
        (self.folder / "settings").write_text(f"""\
Port {self.port}
ListenAddress 127.0.0.1
HostKey {self.folder}/host
AuthorizedKeysFile {self.folder}/authorized
PidFile none
PasswordAuthentication no
KbdInteractiveAuthentication no
PermitRootLogin prohibit-password
StrictModes no
UsePAM no
MaxStartups 100
Subsystem sftp internal-sftp
""")
        self.make_run_folder()
        self.process = subprocess.Popen([server, "-D", "-f", self.folder / "settings", "-E", self.folder / "log"],
                                        stdin=subprocess.DEVNULL)
        try:
            self.log_in()
        except BaseException:
            self.__exit__()
            raise
        return self

    # A server of root's wants this folder; one that the machine has not made yet is made, and removed again.
    def make_run_folder(self):
        if os.geteuid() == 0:
            try:
                os.mkdir("/run/sshd", 0o755)
                self.is_run_folder_ours = True
            except FileExistsError:
                pass

    def log_in(self):
        for _ in range(50):
            done = subprocess.run(["ssh", *self.options(), "-p", str(self.port), "-l", getpass.getuser(), "127.0.0.1", "true"],
                                  stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, check=False)
            if done.returncode == 0:
                return
            if b"Connection refused" not in done.stdout or self.process.poll() is not None:
                break
            time.sleep(0.1)
        log = self.folder / "log"
        raise CannotLogIn(" ".join((done.stdout.decode() + (log.read_text() if log.exists() else "")).split()))

    def options(self):
        return ["-F", "none", "-o", f"UserKnownHostsFile={self.folder}/known", "-o", "GlobalKnownHostsFile=none", "-o",
                "StrictHostKeyChecking=yes", "-o", f"IdentityFile={self.folder}/user", "-o", "IdentitiesOnly=yes", "-o",
                "IdentityAgent=none", "-o", "BatchMode=yes"]

    def connection(self):
        return {"ansible_connection": "ssh", "ansible_host": "127.0.0.1", "ansible_port": self.port,
                "ansible_user": getpass.getuser()}

    def settings(self):
        return {"ANSIBLE_SSH_ARGS": " ".join(self.options() + ["-o", "ControlMaster=auto", "-o", "ControlPersist=60s"]),
                "ANSIBLE_SSH_CONTROL_PATH_DIR": str(self.folder), "ANSIBLE_SSH_CONTROL_PATH": f"{self.folder}/c",
                "ANSIBLE_HOST_KEY_CHECKING": "true"}

    def __exit__(self, *ignored):
        if (self.folder / "c").exists():
            subprocess.run(["ssh", "-F", "none", "-o", f"ControlPath={self.folder}/c", "-O", "exit", "127.0.0.1"],
                           stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL, check=False)
        if self.process is not None:
            self.process.terminate()
            self.process.wait()
        if self.is_run_folder_ours:
            os.rmdir("/run/sshd")
