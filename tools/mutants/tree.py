"""A copy of the sources, built by itself, in which one mutation at a time is tried."""

import json
import os
import shutil
import signal
import subprocess
import threading
import time

# Not what a test asks for, so that the mutation and not the optimiser is what is waited for. Without debug information and
# with paths below the tree alone, a compiler cache serves each tree with what it keeps of the others.
OPTIONS = ["-DCMAKE_BUILD_TYPE=Debug", "-DCMAKE_CXX_FLAGS_DEBUG=-O0"]
# What the library a CIM server loads is made of, and what the tests load and run beside it.
PRODUCT = ["kldrprovider_Module"]
COMPANIONS = ["dzntj", "kldrcim"]


def sources(root):
    """Every file but what is built. Git is not asked: the files may have come without it."""
    for top, folders, names in os.walk(root):
        folders[:] = sorted(each for each in folders if not (each in ("build", "__pycache__") or each.startswith(".")))
        for name in sorted(names):
            yield os.path.relpath(os.path.join(top, name), root)


def copy(root, to):
    """Makes `to` a copy; what is the same stays untouched, and need not be built again."""
    wanted = set(sources(root))
    for path in set(sources(to)) - wanted:
        os.remove(os.path.join(to, path))
    for path in wanted:
        source, target = os.path.join(root, path), os.path.join(to, path)
        os.makedirs(os.path.dirname(target), exist_ok=True)
        if not os.path.exists(target) or not same(source, target):
            shutil.copyfile(source, target)
            shutil.copymode(source, target)


def same(one, other):
    with open(one, "rb") as a, open(other, "rb") as b:
        return a.read() == b.read()


def run(command, limit=None, **options):
    """Status and output of a command; a status of None if it had to be ended, with all that it had started."""
    process = subprocess.Popen(command, stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.STDOUT,
                               text=True, errors="replace", start_new_session=True, **options)
    try:
        output, _ = process.communicate(timeout=limit)
        return process.returncode, output
    except subprocess.TimeoutExpired:
        os.killpg(process.pid, signal.SIGKILL)
        output, _ = process.communicate()
        return None, output
    finally:
        # What a test left behind must not disturb the next one.
        try:
            os.killpg(process.pid, signal.SIGKILL)
        except ProcessLookupError:
            pass


def own_processes():
    """The head of a command that sees no processes but its own; nothing where the system does not allow it. The shell stays in
    between: the first process of all would be treated as no other is."""
    for rights in ([], ["--user", "--map-root-user"]):
        head = ["unshare", *rights, "--pid", "--fork", "--kill-child", "--mount-proc", "sh", "-c", '"$0" "$@"; exit $?']
        try:
            if run([*head, "true"])[0] == 0:
                return head
        except FileNotFoundError:
            break
    return []


class Broken(Exception):
    """The tree does not build, or its tests do not pass, without any mutation."""


class Tree:
    # Tests that look at the whole machine's processes must not meet those of others, and where they may, not those of another
    # tree.
    _alone = own_processes()
    _resources = {}
    _guard = threading.Lock()

    def __init__(self, root, folder, jobs, preset="native"):
        self.folder, self.jobs = folder, jobs
        self.build_folder = os.path.join(folder, "build", preset)
        self.environment = {**os.environ, "CCACHE_BASEDIR": folder, "GTEST_FAIL_FAST": "1", "GTEST_BRIEF": "1"}
        self.tests, self.seconds = {}, {}
        os.makedirs(folder, exist_ok=True)
        copy(root, folder)
        status, output = self.run(["cmake", "--preset", preset, "-Wno-dev", "--log-level=WARNING", *OPTIONS])
        if status != 0:
            raise Broken(output)

    def run(self, command, limit=None):
        return run(command, limit, cwd=self.folder, env=self.environment)

    def build(self, targets):
        return self.run(["cmake", "--build", self.build_folder, "--parallel", str(self.jobs), "--target", *targets])

    def prepare(self, tests):
        """Builds what the tests need, and takes the time of each."""
        status, output = self.build(PRODUCT + COMPANIONS + list(tests))
        if status != 0:
            raise Broken(output)
        _, listed = self.run(["ctest", "--test-dir", self.build_folder, "--show-only=json-v1"])
        self.tests = {test["name"]: test for test in json.loads(listed[listed.index("{") :])["tests"]}
        for test in tests:
            # Once more for one that failed: it has to pass, and to be quick it need not.
            for _ in range(2):
                status, output, self.seconds[test] = self.test(test, 900)
                if status == 0:
                    break
            else:
                raise Broken(f"{test}:\n{output}")

    def test(self, name, limit):
        """Status, output and seconds; what others keep it waiting does not count."""
        properties = {each["name"]: each["value"] for each in self.tests[name].get("properties", [])}
        environment = dict(self.environment)
        environment.update(each.split("=", 1) for each in properties.get("ENVIRONMENT", []) if "=" in each)
        wanted = properties.get("RESOURCE_LOCK", [])
        is_alone = self._alone and "process_list" in wanted
        command = (self._alone if is_alone else []) + self.tests[name]["command"]
        locks = [self.resource(each) for each in wanted if not (is_alone and each == "process_list")]
        for lock in locks:
            lock.acquire()
        begin = time.monotonic()
        try:
            status, output = run(command, limit, cwd=properties["WORKING_DIRECTORY"], env=environment)
            return status, output, time.monotonic() - begin
        finally:
            for lock in locks:
                lock.release()

    @classmethod
    def resource(cls, name):
        with cls._guard:
            return cls._resources.setdefault(name, threading.Lock())

    def judge(self, path, text, tests):
        """What becomes of the tree with this text at this path: ("killed", by what), ("survived", "") or ("refused", "") if
        the compiler does not take it."""
        target = os.path.join(self.folder, path)
        with open(target, encoding="utf-8") as file:
            original = file.read()
        write(target, text)
        try:
            return self.verdict(tests)
        finally:
            write(target, original)

    def verdict(self, tests):
        if self.build(PRODUCT)[0] != 0:
            return "refused", ""
        for test in tests:
            status, output = self.build([test])
            if status != 0:
                # The product holds, and what a test knows of its sizes and values does not.
                return ("killed", f"{test}, compiled") if "static assertion failed" in output else ("refused", "")
            status, output, _ = self.test(test, 20 + 5 * self.seconds.get(test, 60))
            if status is None:
                return "killed", f"{test}, hung"
            if status != 0:
                return "killed", test
        return "survived", ""


def write(path, text):
    with open(path, "w", encoding="utf-8") as file:
        file.write(text)
