"""Building and testing a mutated tree, in a copy of the developer's one."""
import contextlib
import json
import os
import pathlib
import re
import resource
import shutil
import signal
import subprocess
import tempfile
import time

from mutation.sources import digest

PROCESSORS = os.cpu_count() or 1
MOST_WRITTEN = 4 << 30  # bytes of a file: a mutated program may tell its failure for ever


def set_up_child():
    """A session of its own, which can be ended as a whole; bounded, and the first to go where memory is short."""
    os.setsid()
    resource.setrlimit(resource.RLIMIT_CORE, (0, 0))
    resource.setrlimit(resource.RLIMIT_FSIZE, (MOST_WRITTEN, MOST_WRITTEN))
    pathlib.Path("/proc/self/oom_score_adj").write_text("1000")


def run(commands, seconds, folder=None, silence=float("inf")):
    """Runs commands side by side until one fails, all are done, the time is over, or one has been silent for so long.

    Returns the first failed one's status ("late" if it was the time, 0 if none failed) and what it wrote.
    """
    with contextlib.ExitStack() as stack:
        started = []
        for command, environment in commands:
            output = stack.enter_context(tempfile.TemporaryFile("a+b"))  # so that reading it moves nobody's place
            process = subprocess.Popen(command, stdin=subprocess.DEVNULL, stdout=output, stderr=subprocess.STDOUT,
                                       env=os.environ | environment, cwd=folder, preexec_fn=set_up_child)
            stack.callback(end, process)
            started.append((process, output))
        written, spoke = [0] * len(started), [0.0] * len(started)
        waited, last = 0.0, time.monotonic()
        while True:
            now = time.monotonic()
            waited, last = waited + min(now - last, 1), now  # while all are suspended, no time goes by
            for i, (process, output) in enumerate(started):
                status, size = process.poll(), os.fstat(output.fileno()).st_size
                if size != written[i]:
                    written[i], spoke[i] = size, waited
                late = waited > seconds or waited - spoke[i] > silence
                if status or (late and status is None):
                    return "late" if status is None else status, text_of(output)
            if all(process.poll() == 0 for process, _ in started):
                return 0, "".join(text_of(output) for _, output in started)
            time.sleep(0.02)


def end(process):
    """It and all that it started: ninja gives each of its processes a group of its own, so the session is looked at."""
    while left := list(session_of(process.pid)):
        for pid in left:
            with contextlib.suppress(ProcessLookupError):
                os.kill(pid, signal.SIGKILL)
        process.poll()
        time.sleep(0.01)
    process.wait()


def session_of(leader):
    for stat in pathlib.Path("/proc").glob("[0-9]*/stat"):
        with contextlib.suppress(OSError):
            # pid (name) state parent group session; the name may hold anything.
            state, _, _, session = stat.read_text(errors="replace").rpartition(")")[2].split()[:4]
            if int(session) == leader and state != "Z":
                yield int(stat.parent.name)


def text_of(output):
    output.seek(max(0, output.seek(0, os.SEEK_END) - 1_000_000))
    return output.read().decode(errors="replace")


class Tree:
    """The copy, with builds of its own; it stays for the next time, when only what differs is built."""

    def __init__(self, root):
        self.root, self.folder = root, root / "build" / "mutate"
        self.build_folder = self.folder / "build" / "release"
        self.digest = ""

    def take(self):
        """Makes it equal to the developer's tree, with what is not committed yet."""
        listed = subprocess.run(["git", "ls-files", "-z", "--cached", "--others", "--exclude-standard"], cwd=self.root,
                                check=True, capture_output=True, text=True).stdout.split("\0")
        texts = {path: (self.root / path).read_bytes() for path in listed if (self.root / path).is_file()}
        for path, text in texts.items():
            copy = self.folder / path
            if not copy.is_file() or copy.read_bytes() != text:
                copy.parent.mkdir(parents=True, exist_ok=True)
                copy.write_bytes(text)
                shutil.copymode(self.root / path, copy)
        for path in self.folder.rglob("*"):
            name = path.relative_to(self.folder)
            if path.is_file() and name.parts[0] not in ("build", "lock") and str(name) not in texts:
                path.unlink()
        self.digest = digest(texts)

    def configure(self):
        options = ["-DCMAKE_BUILD_TYPE=Release", "-DPIXELKILN_WARNINGS_AS_ERRORS=OFF",
                   "-DCMAKE_GTEST_DISCOVER_TESTS_DISCOVERY_MODE=PRE_TEST"]
        if shutil.which("ccache"):
            os.environ.setdefault("CMAKE_CXX_COMPILER_LAUNCHER", "ccache")
            os.environ.setdefault("CCACHE_BASEDIR", str(self.root))
        return run([(["cmake", "-S", ".", "-B", self.build_folder, "-G", "Ninja", *options], {})], 600, self.folder)

    def build(self, *targets):
        return run([(["ninja", "-C", self.build_folder, *targets], {})], 7200)

    @contextlib.contextmanager
    def mutated(self, mutation):
        path = self.folder / mutation.path
        text = path.read_text()
        try:
            path.write_text(mutation.applied(text))
            yield
        finally:
            path.write_text(text)


class Tests:
    """The tests in the order in which they are tried."""

    def __init__(self, tree, seconds):
        self.tree = tree
        self.program = tree.build_folder / "tests" / "pixelkiln_tests"
        self.seconds = seconds  # of the unmutated tree, by what is run; as far as it has been

    def unit_tests(self, chosen):
        commands = [([self.program, f"--gtest_filter={chosen}", "--gtest_fail_fast", "--gtest_color=no"],
                     {"GTEST_TOTAL_SHARDS": str(PROCESSORS), "GTEST_SHARD_INDEX": str(shard)})
                    for shard in range(PROCESSORS)]
        return self.judged("unit tests", commands, r"\[  FAILED  \] ([^\s,]+)", r"\[ RUN      \] (\S+)")

    def other_tests(self):
        listed = subprocess.run(["ctest", "--test-dir", self.tree.build_folder, "--show-only=json-v1"], check=True,
                                capture_output=True, text=True).stdout
        names = [re.escape(test["name"]) for test in json.loads(listed)["tests"]
                 if str(self.program) not in test.get("command", [])]
        command = ["ctest", "--test-dir", self.tree.build_folder, "--stop-on-failure", "--timeout", "300",
                   "-j", str(PROCESSORS), "-R", "^(" + "|".join(names) + ")$"]
        return self.judged("other tests", [(command, {})], r"(\S+) \.*\**(?:Failed|Timeout|\S*Exception)")

    def step(self, name):
        return self.judged(name, [([f".ci/steps/{name}"], {})])

    def judged(self, name, commands, *expressions):
        """What failed, or nothing."""
        known, start = self.seconds.get(name), time.monotonic()
        # A mutation may make it slower, by chance or for ever. No single test takes longer than all of them do
        # unmutated, and each says when it begins.
        seconds, silence = (120 + 4 * known, 60 + known) if known is not None else (7200, 7200)
        status, output = run(commands, seconds, self.tree.folder, silence)
        if not status:
            self.seconds.setdefault(name, time.monotonic() - start)
            return ""
        found = next((names[-1] for names in (re.findall(each, output) for each in expressions) if names), name)
        return f"{found} ({'time over' if status == 'late' else 'crashed' if 'RUN' in output[-200:] else 'failed'})"

    def failure_unmutated(self, steps):
        """As far as this is not known."""
        runs = {"unit tests": lambda: self.unit_tests("*"), "other tests": self.other_tests,
                **{step: lambda step=step: self.step(step) for step in steps}}
        return next(filter(None, (test() for name, test in runs.items() if name not in self.seconds)), "")

    def failure(self, mutation, steps):
        likely = self.likely(mutation)
        return self.unit_tests(likely) or self.unit_tests(f"*-{likely}") or self.later(steps)

    def later(self, steps):
        status, _ = self.tree.build()
        if status:
            return "build of tools (failed)"
        return self.other_tests() or next(filter(None, map(self.step, steps)), "")

    def likely(self, mutation):
        """A filter: the tests in files of the source's name, those of its name, and the sweeps of its kernels."""
        stem = re.sub(r"Kernels$", "", pathlib.Path(mutation.path).name.split(".")[0])
        text = (self.tree.folder / mutation.path).read_text()
        suites = {stem} | set(re.findall(r"^ *\.([A-Za-z0-9]{5,})\w* = \w", text, re.MULTILINE))
        for path in self.tree.folder.glob(f"tests/*/{stem}*_test.cpp"):
            suites |= set(re.findall(r"^TEST(?:_[FP])?\((\w+),", path.read_text(), re.MULTILINE))
        return ":".join(f"*{suite}*" for suite in sorted(suites))
