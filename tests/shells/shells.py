"""Shells that complete: each is asked what it would put in the place of the last word of a line."""

import os
import pathlib
import pty
import re
import select
import shlex
import shutil
import subprocess
import sys
import time

PATIENCE = 60  # seconds; a busy machine is slow


class Terminal:
    """An interactive shell on a pseudo-terminal."""

    def __init__(self, command, folder, environment):
        self.child, self.descriptor = pty.fork()
        if self.child == 0:
            os.chdir(folder)
            os.execvpe(command[0], command, environment)
        self.text = ""

    def type(self, text):
        os.write(self.descriptor, text.encode())

    def read_until(self, pattern):
        """What the shell has written up to the match, which is returned; forgets all of it."""
        end = time.monotonic() + PATIENCE
        while not (found := re.search(pattern, self.text, re.DOTALL)):
            if not select.select([self.descriptor], [], [], max(0, end - time.monotonic()))[0]:
                sys.exit(f"{pattern!r} does not come; what came: {self.text!r}")
            self.text += os.read(self.descriptor, 65536).decode(errors="replace")
        self.text = self.text[found.end():]
        return found

    def close(self):
        os.close(self.descriptor)
        os.waitpid(self.child, 0)


class Shell:
    """What all have in common: `share` is the folder share of the installation."""

    def __init__(self, share, folder):
        self.folder = folder
        self.told = folder / "told"
        self.environment = {
            "PATH": os.environ["PATH"], "HOME": str(folder), "TERM": "xterm", "LC_ALL": "C.UTF-8",
            "COLUMNS": "200", "XDG_DATA_DIRS": f"{share}:/usr/local/share:/usr/share",
            "XDG_CONFIG_HOME": str(folder), "XDG_DATA_HOME": str(folder),
            "XDG_CACHE_HOME": str(folder)}

    def candidates(self, line):
        """What may stand in the place of the last word of the line, or of what is behind a "=" in it:
        sorted, without what a shell puts behind it as long as more may follow."""
        last = re.search(r"\S*$", line).group()
        given = last[:last.rfind("=") + 1]
        return sorted(word.removeprefix(given).rstrip("/=") for word in self.completed(line, last))

    def describes(self, line, description):
        """Whether the list of candidates has this text."""
        raise NotImplementedError

    def close(self):
        pass


class InsertingShell(Shell):
    """One whose editor is made to put all candidates into the line, and to tell the line."""

    def start(self, command, setup):
        self.terminal = Terminal(command, self.folder, self.environment)
        self.terminal.type(setup + "\n")
        # Written with a gap, so that the echo of what is typed is not taken for it.
        self.terminal.type("printf 'rea''dy\\n'\n")
        self.terminal.read_until("ready\r?\n")

    def completed(self, line, last):
        self.told.unlink(missing_ok=True)
        # Control-X and then a: insert; Control-X and then t: tell, and empty the line.
        self.terminal.type(line + "\x18a\x18t")
        end = time.monotonic() + PATIENCE
        while not self.told.exists():
            if time.monotonic() > end:
                sys.exit(f"{line!r}: no answer; on the terminal: {self.terminal.text!r}")
            if select.select([self.terminal.descriptor], [], [], 0.01)[0]:
                self.terminal.text += os.read(self.terminal.descriptor, 65536).decode()
        told = self.told.read_text()
        start = line.removesuffix(last)
        assert told.startswith(start), (line, told)
        words = shlex.split(told[len(start):])
        return [] if words == shlex.split(last) else words

    def close(self):
        self.terminal.close()


class Bash(InsertingShell):
    program = "bash"
    needs = "/usr/share/bash-completion/bash_completion"

    def __init__(self, share, folder):
        super().__init__(share, folder)
        self.start(["bash", "--norc", "--noprofile", "-i"], f"""
            bind 'set enable-bracketed-paste off'
            bind '"\\C-xa": insert-completions'
            tell() {{ printf '%s\\n' "$READLINE_LINE" >{self.told}.new; mv {self.told}.new {self.told}; READLINE_LINE=; }}
            bind -x '"\\C-xt": tell'
            . {self.needs}
            """)


class Zsh(InsertingShell):
    program = "zsh"
    needs = "/usr/share/zsh/functions/Completion"

    def __init__(self, share, folder):
        super().__init__(share, folder)
        self.start(["zsh", "-f", "-i"], f"""
            PS1='> '; unsetopt zle_bracketed_paste prompt_cr prompt_sp; setopt interactive_comments
            fpath=({share}/zsh/site-functions $fpath)
            autoload -Uz compinit; compinit -D -u
            insert_all() {{ _main_complete; compstate[insert]=all }}
            zle -C insert-all complete-word insert_all; bindkey '^Xa' insert-all
            tell() {{ print -r -- "$BUFFER" >{self.told}.new; mv {self.told}.new {self.told}; BUFFER= }}
            zle -N tell; bindkey '^Xt' tell
            """)

    def describes(self, line, description):
        # Control-D lists; Control-U empties the line.
        self.terminal.type(line + "\x04")
        self.terminal.read_until(re.escape(description))
        self.terminal.type("\x15")
        return True


class Fish(Shell):
    program = "fish"
    needs = "/usr/share/fish/completions"

    def rows(self, line):
        told = subprocess.run(["fish", "-c", "complete -C $argv", line], cwd=self.folder,
                              env=self.environment, check=True, capture_output=True, text=True)
        assert not told.stderr, told.stderr
        return [row.split("\t") for row in told.stdout.splitlines()]

    def completed(self, line, last):
        return [row[0] for row in self.rows(line)]

    def describes(self, line, description):
        return any(row[1:] == [description] for row in self.rows(line))


SHELLS = {shell.program: shell for shell in (Bash, Zsh, Fish)}


def start(name, share, folder):
    shell = SHELLS[name]
    if shutil.which(name) is None or not pathlib.Path(shell.needs).exists():
        print(f"this machine has no {name} with completion ({shell.needs})")
        sys.exit(0)
    return shell(share, folder)
