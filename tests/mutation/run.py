#!/usr/bin/python3
"""Runs the tests that reach each mutant, until one fails, and lists the mutants that all of them let live.

usage: run.py BUILD LIST JUDGED RESULTS [--share K/N] [FILE]...
  BUILD     where the tests were built with the mutants
  LIST      the mutants, as mutate.py lists them
  JUDGED    survivors that are no fault of the tests, each with its reason
  RESULTS   what was found out before; what is found out is added
  --share   every N-th mutant, from the K-th on
  FILE      mutants of these files alone
The exit status is 1 if a mutant lived that is not judged.
"""
import argparse
import collections
import concurrent.futures
import dataclasses
import json
import os
import pathlib
import re
import subprocess
import sys
import tempfile
import time

# In this order: what is quick comes first.
PROGRAMS = [
    "unit_tests", "memory_tests", "allocation_tests", "process_tests", "system_calls_tests", "contract_tests",
    "session_tests", "fault_tests"
]
# Of these, the tests that reach a mutant share one process.
SHARING = {"unit_tests"}


@dataclasses.dataclass
class Test:
    name: str
    program: str
    command: list
    folder: str
    environment: dict
    seconds: float = 0
    reached: frozenset = frozenset()


def find_tests(build):
    shown = subprocess.run(["ctest", "--test-dir", build, "--show-only=json-v1"], capture_output=True, check=True)
    tests = []
    for test in json.loads(shown.stdout)["tests"]:
        program = pathlib.Path(test.get("command", [""])[0]).name
        if program not in PROGRAMS:
            continue
        properties = {one["name"]: one["value"] for one in test.get("properties", [])}
        environment = dict(one.split("=", 1) for one in properties.get("ENVIRONMENT", []))
        tests.append(Test(test["name"], program, test["command"], properties["WORKING_DIRECTORY"], environment))
    return tests


def run(test, command, timeout, **environment):
    """Whether it passed, in time."""
    process = subprocess.Popen(
        command, cwd=test.folder, env={**os.environ, **test.environment, **environment}, stdin=subprocess.DEVNULL,
        stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL, start_new_session=True)
    try:
        return process.wait(timeout) == 0
    except subprocess.TimeoutExpired:
        return False
    finally:
        try:
            os.killpg(process.pid, 9)
        except ProcessLookupError:
            pass
        process.wait()


def find_reached(test):
    """Runs a test without a mutant, and notes which of them it reaches."""
    with tempfile.NamedTemporaryFile() as file:
        file.truncate(1 << 20)
        start = time.monotonic()
        passed = run(test, test.command, 120, VANTEL_MUTANTS_REACHED=file.name)
        test.seconds = time.monotonic() - start
        octets = pathlib.Path(file.name).read_bytes()
    test.reached = frozenset(number for number, octet in enumerate(octets) if octet)
    return passed


def find_all_reached(tests, jobs):
    with concurrent.futures.ThreadPoolExecutor(jobs) as pool:
        failed = [test.name for test, passed in zip(tests, pool.map(find_reached, tests)) if not passed]
    if failed:
        print(f"run: left out, as they fail without a mutant: {' '.join(failed)}", file=sys.stderr)
    return [test for test in tests if test.name not in failed]


def batches(tests):
    """What to run, in order: each a test, or those of a program that share a process, and the command."""
    for program in PROGRAMS:
        own = sorted((test for test in tests if test.program == program), key=lambda test: test.seconds)
        if program in SHARING and own:
            names = ":".join(test.name for test in own)
            yield own[0], [own[0].command[0], "--gtest_fail_fast", f"--gtest_filter={names}"], 10 + 5 * sum(
                test.seconds for test in own)
        else:
            for test in own:
                yield test, test.command, 10 + 5 * test.seconds


def outcome(mutant, tests):
    """The test that caught it, "lived" or "unreached"."""
    reaching = [test for test in tests if mutant["number"] in test.reached]
    for test, command, timeout in batches(reaching):
        if not run(test, command, timeout, VANTEL_MUTANT=str(mutant["number"])):
            return test.program
    return "lived" if reaching else "unreached"


def key(mutant, seen):
    """The same as long as its line is, wherever that is."""
    parts = tuple(mutant[part] for part in ("file", "text", "kind", "was", "becomes"))
    seen[parts] += 1
    return json.dumps(parts + (seen[parts],))


def shown(mutant):
    return f"{mutant['file']}:{mutant['line']}: {mutant['kind']}: {mutant['was']} -> {mutant['becomes'] or 'nothing'}"


def judged_by(path):
    """Pairs of a pattern for a mutant as it is shown, without its line number, and the file it is of."""
    judged = set()
    for line in path.read_text().splitlines():
        if line and not line.startswith(("#", " ")):
            judged.add(line)
    return judged


def main():
    parser = argparse.ArgumentParser()
    for name in ("build", "list", "judged", "results"):
        parser.add_argument(name, type=pathlib.Path)
    parser.add_argument("--share", default="1/1")
    parser.add_argument("files", nargs="*")
    given = parser.parse_args()
    part, parts = map(int, given.share.split("/"))
    jobs = os.cpu_count()

    mutants = [json.loads(line) for line in given.list.read_text().splitlines()]
    seen = collections.Counter()
    for mutant in mutants:
        mutant["key"] = key(mutant, seen)
    known = {}
    if given.results.exists():
        for line in given.results.read_text().splitlines():
            result = json.loads(line)
            known[result["key"]] = result["outcome"]
    chosen = [mutant for index, mutant in enumerate(mutants) if index % parts == part - 1]
    if given.files:
        chosen = [mutant for mutant in chosen if mutant["file"] in given.files]
    todo = [mutant for mutant in chosen if known.get(mutant["key"], "lived") in ("lived", "unreached")]

    if todo:
        tests = find_all_reached(find_tests(given.build), jobs)
        with given.results.open("a") as results, concurrent.futures.ThreadPoolExecutor(jobs) as pool:
            running = {pool.submit(outcome, mutant, tests): mutant for mutant in todo}
            for done, future in enumerate(concurrent.futures.as_completed(running), 1):
                mutant = running[future]
                known[mutant["key"]] = future.result()
                results.write(json.dumps({"key": mutant["key"], "outcome": future.result()}) + "\n")
                results.flush()
                if done % 100 == 0:
                    print(f"{done} of {len(todo)}", file=sys.stderr)
    sys.exit(report(chosen, known, judged_by(given.judged)))


def report(mutants, known, judged):
    """Prints the survivors and the score of each file, and returns the exit status."""
    counts = collections.defaultdict(collections.Counter)
    status = 0
    for mutant in mutants:
        result = known[mutant["key"]]
        name = re.sub(r":\d+:", ":", shown(mutant), count=1)
        if result in ("lived", "unreached"):
            result = "judged" if name in judged else result
        if result in ("lived", "unreached"):
            status = 1
            print(f"{result}: {shown(mutant)}")
        state = result if result in ("lived", "unreached", "judged") else "caught"
        for of in (mutant["file"], mutant["file"].split("/")[0] + "/", "all"):
            counts[of][state] += 1
    print(f"\n{'file':44} mutants caught judged lived unreached  score")
    for of, count in sorted(counts.items()):
        total = sum(count.values())
        columns = [total] + [count[state] for state in ("caught", "judged", "lived", "unreached")]
        score = 100 * (count["caught"] + count["judged"]) / total
        print(f"{of:44} {columns[0]:7} {columns[1]:6} {columns[2]:6} {columns[3]:5} {columns[4]:9} {score:5.1f} %")
    return status


main()
