"""What bash offers to complete, asked as bash asks: by the functions that are registered for a command."""

import re
import shlex

from deploy_case import SOURCE, DeployCase, output_of


class Completion(DeployCase):
    def offered(self, line):
        """The words that would be offered at the end of a command line."""
        words = line.split(" ")
        program = self.prefix / {"kldrcim": "bin"}.get(words[0], "sbin") / words[0]
        asked = [str(program), *words[1:]]
        file = self.prefix / "share/bash-completion/completions" / words[0]
        script = f"""
            source {shlex.quote(str(file))}
            read -ra registered <<<"$(complete -p {words[0]})"
            COMP_WORDS=({shlex.join(asked)}) COMP_CWORD={len(asked) - 1}
            "${{registered[-2]}}" {shlex.join([asked[0], asked[-1], asked[-2]])}
            printf '%s\\n' "${{COMPREPLY[@]}}"
        """
        return sorted(output_of("bash", "--norc", "-c", script).split())

    def help_of(self, program, section):
        text = output_of(self.prefix / program, "--help")
        return re.search(rf"^{section}\n(.*?)^$", text, re.M | re.S)[1]

    def test_every_verb_and_option_of_kldrcim(self):
        verbs = set(re.findall(r"^  ([a-z]+)", self.help_of("bin/kldrcim", "Verbs"), re.M))
        self.assertLess(15, len(verbs))
        self.assertEqual(self.offered("kldrcim "), sorted(verbs))
        options = re.findall(r"^  (--[a-z-]+)", self.help_of("bin/kldrcim", "Options"), re.M)
        self.assertLess(15, len(options))
        self.assertEqual(self.offered("kldrcim --"), sorted(options))
        self.assertEqual(self.offered("kldrcim ei KALDERA_FCPort --"), sorted(options))
        self.assertEqual(self.offered("kldrcim pro"), ["profiles"])

    def test_classes_where_a_class_or_a_path_stands(self):
        for line in ("kldrcim ei ", "kldrcim gi ", "kldrcim watch ", "kldrcim ai X --assoc "):
            self.assertEqual(len(self.offered(line)), 76, line)
        self.assertEqual(self.offered("kldrcim --format json ein KALDERA_FCPortS"), ["KALDERA_FCPortStatistics", "KALDERA_FCPortSystemDevice"])
        for line in ("kldrcim tree ", "kldrcim rpc ", "kldrcim ei KALDERA_FCPort "):
            self.assertEqual(self.offered(line), [], line)

    def test_choices_of_options_and_verbs(self):
        self.assertEqual(self.offered("kldrcim --format "), ["json", "mof", "openmetrics", "plugin", "prometheus", "table"])
        self.assertEqual(self.offered("kldrcim tree --color a"), ["always", "auto"])
        self.assertEqual(self.offered("kldrcim diag "), ["list", "run"])
        self.assertEqual(self.offered("kldrcim --namespace "), [], "a verb does not stand here")
        self.assertEqual(self.offered("kldrcim --ascii tre"), ["tree"])
        self.assertEqual(self.offered(f"kldrcim --module {SOURCE}/LIC"), [f"{SOURCE}/LICENSE"])

    def test_kldr_register(self):
        usage = output_of(self.prefix / "sbin/kldr-register", "--help")
        verbs = re.match(r"usage: kldr-register ([a-z|]+) ", usage)[1].split("|")
        self.assertEqual(self.offered("kldr-register "), sorted(verbs))
        options = set(re.findall(r"(?:^  |, )(--[a-z-]+)", usage, re.M))
        self.assertLess(5, len(options))
        self.assertEqual(self.offered("kldr-register install --"), sorted(options))
        self.assertEqual(self.offered("kldr-register --server "), ["pegasus", "sfcb"])
        self.assertEqual(self.offered(f"kldr-register --root {SOURCE}/deploy/deb"), [f"{SOURCE}/deploy/debian"])
