"""Real shells, asked what they would offer at the end of a command line."""

import os
import pty
import select
import shlex
import time

from deploy_case import ENVIRONMENT, DeployCase, output_of

#: Types the line, presses the Tab key, and writes each word that a completion function hands to zsh, with what stands before it,
#: into a file.
ZSH = """
fpath=({folder} $fpath)
path=({programs} $path)
autoload -Uz compinit && compinit -D -u
compadd() {{
    local -a found
    builtin compadd -A found "$@"
    (( $#found )) && print -rl -- $IPREFIX$^found >>{hits}
    builtin compadd "$@"
}}
zle-line-init() {{
    LBUFFER={line}
    zle complete-word
    BUFFER=exit
    zle accept-line
}}
zle -N zle-line-init
"""


class CompletionCase(DeployCase):
    def bash(self, line, directory="bin"):
        """The words that bash would offer, by the functions that are registered for a command."""
        words = line.split(" ")
        asked = [str(self.prefix / directory / words[0]), *words[1:]]
        file = self.prefix / "share/bash-completion/completions" / words[0]
        script = f"""
            source {shlex.quote(str(file))}
            read -ra registered <<<"$(complete -p {words[0]})"
            COMP_WORDS=({shlex.join(asked)}) COMP_CWORD={len(asked) - 1}
            "${{registered[-2]}}" {shlex.join([asked[0], asked[-1], asked[-2]])}
            printf '%s\\n' "${{COMPREPLY[@]}}"
        """
        return sorted(output_of("bash", "--norc", "-c", script).split())

    def fish(self, line):
        """The words that fish would offer, without their descriptions."""
        file = self.prefix / "share/fish/vendor_completions.d/kldrcim.fish"
        home = self.root / "fish"
        home.mkdir(exist_ok=True)
        script = f"source {shlex.quote(str(file))}; complete -C {shlex.quote(line)}"
        text = output_of("env", f"HOME={home}", f"PATH={self.prefix}/bin:{ENVIRONMENT['PATH']}", "fish", "-N", "-c", script)
        return sorted({each.split("\t")[0] for each in text.splitlines()})

    def zsh(self, line):
        """What zsh's own completion system gets to offer, on a terminal, when the Tab key is pressed."""
        hits = self.root / "hits"
        hits.unlink(missing_ok=True)
        (self.root / ".zshrc").write_text(
            ZSH.format(
                folder=self.prefix / "share/zsh/vendor-completions", hits=hits, programs=self.prefix / "bin", line=shlex.quote(line)
            ),
            encoding="utf-8",
        )
        child, terminal = pty.fork()
        if not child:
            home = {"HOME": str(self.root), "ZDOTDIR": str(self.root), "TERM": "dumb", "LISTMAX": "1000"}
            os.execvpe("zsh", ["zsh", "-d", "-i"], {**ENVIRONMENT, **home})
        shown = self.read_to_end(terminal)
        os.close(terminal)
        self.assertEqual(os.waitpid(child, 0)[1], 0, shown)
        return sorted(set(hits.read_text(encoding="utf-8").split())) if hits.exists() else []

    def read_to_end(self, terminal):
        seen, deadline = b"", time.monotonic() + 60
        while time.monotonic() < deadline:
            if select.select([terminal], [], [], 1)[0]:
                try:
                    part = os.read(terminal, 4096)
                except OSError:  # A terminal's way to say that nobody writes any more.
                    return seen
                seen += part
        self.fail(f"zsh does not end: {seen}")
