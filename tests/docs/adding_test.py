"""Adding a class, an association, a method of the agent and an event, as CONTRIBUTING.md lists it: done in a copy of the tree, which
is built and asked. The files that are touched are those of the lists."""

import json
import os
import re
import shutil
import subprocess
import unittest
from pathlib import Path

ROOT = Path(__file__).resolve().parents[2]
BUILD = Path(os.environ["KLDR_BUILD"])
#: It stays from one run to the next, so that only what has changed is compiled.
COPY = BUILD / "tests/docs/adding"
MADE = COPY.with_name("adding_build")

#: What is written into a file, behind or in the place of a text that stands there once.
BEHIND, INSTEAD = "behind", "instead"
EDITS = {
    "class": [
        ("module/schema/kaldera.mof", BEHIND, '#pragma include ("kaldera/KALDERA_AvailableDiagnosticServiceForFCPort.mof")\n',
         '#pragma include ("kaldera/KALDERA_Bracket.mof")\n'),
        ("module/adapter/Class_Ids.def", BEHIND, "CLASS_ID(38,  LOGICALDISK,                                  KALDERA_LogicalDisk)\n",
         "CLASS_ID(39,  BRACKET,                                      KALDERA_Bracket)\n"),
        ("module/adapter/classId_t.h", INSTEAD, "MAXCLASSID == 39", "MAXCLASSID == 40"),
        ("module/managers/FCHBAManager.cpp", BEHIND, "    {PRODUCT,                                    Needs::DRIVER,   by_adapter_helper},\n",
         "    {BRACKET,                                    Needs::DRIVER,   by_adapter_helper},\n"),
        ("module/model/AdapterHelper.h", BEHIND, "    KALDERA_Product* getProductInstance(const _adapterData& adapter, const Wanted& wanted = {}) const;\n",
         "    KALDERA_Bracket* getBracketInstance(const _adapterData& adapter) const;\n"),
        ("module/model/AdapterHelper.h", BEHIND, '#include "module/schema/KALDERA_AdapterSoftwareIdentity.h"\n',
         '#include "module/schema/KALDERA_Bracket.h"\n'),
        ("module/model/AdapterHelper.cpp", BEHIND, "    switch (walk.id) {\n", """\
    case BRACKET:
        walk.instances.append(getBracketInstance(adapter));
        break;
"""),
        ("module/model/Adapter_Instances.cpp", BEHIND, "    return product.steal();\n}\n", """
KALDERA_Bracket* AdapterHelper::getBracketInstance(const _adapterData& adapter) const
{
    LOG_SCOPE("getBracketInstance");
    Ref<KALDERA_Bracket> bracket(create_null<KALDERA_Bracket>());
    bracket->CreationClassName.set(ProviderUtil::getClassName(BRACKET));
    bracket->Tag.set(to_String("bracket of " + tag(adapter)));
    bracket->SerialNumber.set(adapter.serialNumber);
    return bracket.steal();
}
"""),
    ],
    "association": [
        ("module/schema/kaldera.mof", BEHIND, '#pragma include ("kaldera/KALDERA_Product.mof")\n',
         '#pragma include ("kaldera/KALDERA_ProductBracket.mof")\n'),
    ],
    "method of the agent": [
        ("contracts/agent/Methods.def", BEHIND,
         'METHOD("discovery.getHbaByWwn",                              getHbaByWwn,                          assigned,        '
         "libGetHbaByWwn,                      ADDRESS(wwn))\n",
         'METHOD("discovery.getHbaByMac",                              getHbaByMac,                          assigned,        '
         "libGetHbaByMac,                      S(mac))\n"),
    ],
    "event": [
        ("module/alerts/Event_Catalogue.def", BEHIND,
         'EVENT(2,  15, "SFP is not supported.",                                    "Recommend to use supported SFP.")\n',
         'EVENT(2,  16, "SFP has cooled down.",                                     "No action required.")\n'),
        ("module/alerts/Event_Categories.cpp", INSTEAD, "ids(1, 2) | ids(4, 15)", "ids(1, 2) | ids(4, 16)"),
    ],
}
#: New files, each made of a neighbour by other words: the class stands for the bracket that holds a card in its slot.
LIKE_PACKAGE = {"KALDERA_PhysicalPackage": "KALDERA_Bracket", "PHYSICALPACKAGE": "BRACKET"}
LIKE_COMPONENT = {"KALDERA_ProductPhysicalComponent": "KALDERA_ProductBracket", **LIKE_PACKAGE}
NEW = {
    "class": [("module/schema/kaldera/KALDERA_PhysicalPackage.mof", LIKE_PACKAGE),
              ("module/providers/KALDERA_PhysicalPackage_Provider.cpp", LIKE_PACKAGE)],
    "association": [("module/schema/kaldera/KALDERA_ProductPhysicalComponent.mof", LIKE_COMPONENT),
                    ("module/providers/KALDERA_ProductPhysicalComponent_Provider.cpp", LIKE_COMPONENT)],
}

EVENT = {"eventCategory": 2, "eventId": 16, "eventSeverity": 4, "eventIdValue": "ZNT_PORT_SFP_COOL", "eventMsg": "SFP is cool.",
         "portIndexString": "1000024b4c100000"}


def edited(relative, text):
    """A file of the tree as it is after all additions."""
    for edits in EDITS.values():
        for file, how, old, new in edits:
            if file == relative:
                assert text.count(old) == 1, f"{file}: {old!r} stands there {text.count(old)} times"
                text = text.replace(old, old + new if how == BEHIND else new)
    return text


def in_other_words(text, words):
    for old, new in words.items():
        text = text.replace(old, new)
    return text


def content_of_copy():
    """What the copy holds: file by path."""
    files = {}
    for top in ROOT.iterdir():
        if top.name != "build" and not top.name.startswith("."):
            for file in [top] if top.is_file() else top.rglob("*"):
                if file.is_file() and "__pycache__" not in file.parts:
                    files[str(file.relative_to(ROOT))] = file.read_bytes()
    for relative in {file for edits in EDITS.values() for file, *_ in edits}:
        files[relative] = edited(relative, files[relative].decode()).encode()
    for added in NEW.values():
        for neighbour, words in added:
            files[in_other_words(neighbour, words)] = in_other_words(files[neighbour].decode(), words).encode()
    return files


def make_copy():
    """Writes what differs and nothing else, so that the build sees what has changed."""
    wanted = content_of_copy()
    for file in COPY.rglob("*"):
        if file.is_file() and str(file.relative_to(COPY)) not in wanted:
            file.unlink()
    for relative, content in wanted.items():
        file = COPY / relative
        if not file.exists() or file.read_bytes() != content:
            file.parent.mkdir(parents=True, exist_ok=True)
            file.write_bytes(content)
            if (ROOT / relative).exists():
                shutil.copymode(ROOT / relative, file)


def run(*words, **more):
    done = subprocess.run(words, capture_output=True, text=True, check=False, **more)
    assert done.returncode == 0, f"{' '.join(map(str, words))}\n{done.stdout[-4000:]}{done.stderr[-4000:]}"
    return done.stdout


class Adding(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        make_copy()
        # It need not be fast, and files may share compiler runs: the build is to be quick. No cache: it takes nothing from elsewhere.
        run("cmake", "-S", COPY, "-B", MADE, "-G", "Ninja", "-Wno-dev", f"-DCMAKE_CXX_COMPILER={os.environ['KLDR_COMPILER']}",
            "-DCMAKE_BUILD_TYPE=Debug", "-DCMAKE_CXX_FLAGS_DEBUG=-O0", "-DBUILD_TESTING=OFF", "-DKLDR_SHARE_RUNS=ON", "-DKLDR_CCACHE=OFF")
        run("cmake", "--build", MADE, "--parallel", "2", "--target", "kldrprovider_Module")

    def ask(self, *words, **environment):
        return run(BUILD / "kldrcim", "--module", MADE / "libkldrprovider_Module.so", *words, timeout=60, cwd=MADE, env={
            "HOME": str(MADE), "PATH": os.environ["PATH"], "LD_LIBRARY_PATH": str(BUILD / "simulator"),
            "KLDR_SIMULATOR_INVENTORY": str(ROOT / "simulator/inventories/demo.json"), **environment})

    def test_the_class_has_an_instance_for_each_adapter(self):
        serials = [self.ask("ei", name, "--properties", "SerialNumber").split() for name in ("KALDERA_PhysicalPackage", "KALDERA_Bracket")]
        self.assertGreater(len(serials[0]), 3)
        self.assertEqual(serials[0], serials[1])

    def test_the_association_leads_from_a_product_to_its_bracket(self):
        product = self.ask("ein", "KALDERA_Product").splitlines()[0]
        found = self.ask("ain", product, "--assoc", "KALDERA_ProductBracket").splitlines()
        self.assertEqual(len(found), 1, found)
        self.assertIn("KALDERA_Bracket.", found[0])

    def test_the_agent_answers_the_method(self):
        mac = re.search(r'"(024b4c\w+)"', self.ask("ein", "KALDERA_EthernetPort"))[1]
        request = {"jsonrpc": "2.0", "id": 1, "method": "discovery.getHbaByMac", "params": [":".join(re.findall("..", mac))]}
        reply = self.ask("cm", 'KALDERA_AgentService.Name="Kaldera Agent Service Provider"', "executeMethod",
                         f"request={json.dumps(request)}")
        self.assertIn("hbaData", reply)
        self.assertNotIn("JSONRPCError", reply)

    def test_the_event_becomes_an_alert(self):
        script = MADE / "event.json"
        script.write_text(json.dumps([{"after": 50, "event": EVENT}]), encoding="utf-8")
        alert = self.ask("watch", "--count", "1", KLDR_SIMULATOR_EVENTS=str(script))
        self.assertIn("SFP has cooled down.", alert)


class Lists(unittest.TestCase):
    def test_the_files_of_a_list_are_those_that_are_touched(self):
        page = (ROOT / "CONTRIBUTING.md").read_text(encoding="utf-8")
        for what in EDITS:
            section = re.search(rf"^### Adding an? {what}$(.*?)^##", page, re.M | re.S)[1]
            steps = "\n".join(re.findall(r"^\d+\. .*(?:\n   .*)*", section, re.M))
            told = set(re.findall(r"`((?:module|contracts)/[\w./<>]+\.\w+)`", steps))
            touched = {file for file, *_ in EDITS[what]} | {
                re.sub("KALDERA_[^_.]*", "<Class>", neighbour) for neighbour, _ in NEW.get(what, [])}
            self.assertEqual(told, touched, what)


if __name__ == "__main__":
    unittest.main()
