"""The installed MOF, compiled in the order that a server's compiler is given, is the catalogue of the code."""

from deploy_case import SOURCE, DeployCase

from generator.parser import parse
from generator.resolver import resolve


def described(classes):
    """All that a class has, in words."""
    return {
        class_.name: [class_.superclass and class_.superclass.name, class_.flags]
        + [
            (f.kind, f.name, f.type, f.target, f.array, f.flags, f.default, [(p.name, p.type) for p in f.parameters])
            for f in class_.features
        ]
        for class_ in classes
    }


class Mof(DeployCase):
    def loaded(self, *names):
        return resolve(parse([str(self.share / "mof" / name) for name in names]))

    def test_the_three_files_are_the_catalogue(self):
        installed = self.loaded("kldr_qualifiers.mof", "kldr_structure.mof", "kldrprovider.mof")
        sources = resolve(parse([str(SOURCE / "module/schema" / name) for name in ("cim.mof", "kaldera.mof")]))
        self.assertEqual(described(installed), described(sources))
        self.assertEqual(len(installed), 178)

    def test_what_a_class_names_stands_before_it(self):
        seen = set()
        for class_ in self.loaded("kldr_qualifiers.mof", "kldr_structure.mof", "kldrprovider.mof"):
            seen.add(class_.name)
            for feature in class_.own_features:
                if class_.name.startswith("KALDERA_") and feature.kind == "reference":
                    self.assertIn(feature.target, seen)
                for each in [feature, *feature.parameters]:
                    if each.qualifiers.get("embeddedinstance"):
                        self.assertIn(each.target, seen, f"{class_.name}.{feature.name}")

    def test_no_file_includes_another(self):
        for file in (self.share / "mof").iterdir():
            self.assertNotIn("#pragma", file.read_text(encoding="utf-8"), file.name)
