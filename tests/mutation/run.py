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
import subprocess
import sys
import tempfile
import time

# The labels of tests, what is quick first, and how many run at once for each processor: most of the time they wait.
STAGES = [({"unit"}, 4), ({"contract", "session", "faults"}, 8)]
LABELS = set().union(*(labels for labels, _ in STAGES))
# Of these programs, the tests that reach a mutant share one process, but for those that take longer, in seconds.
SHARING = {"unit_tests"}
LONG = 0.5


@dataclasses.dataclass
class Test:
    name: str
    label: str
    command: list
    folder: str
    environment: dict
    passed: bool = True
    seconds: float = 0
    reached: frozenset = frozenset()


def find_tests(build):
    shown = subprocess.run(["ctest", "--test-dir", build, "--show-only=json-v1"], capture_output=True, check=True)
    tests = []
    for test in json.loads(shown.stdout)["tests"]:
        properties = {one["name"]: one["value"] for one in test.get("properties", [])}
        labels = LABELS.intersection(properties.get("LABELS", []))
        if not labels:
            continue
        environment = dict(one.split("=", 1) for one in properties.get("ENVIRONMENT", []))
        tests.append(Test(test["name"], labels.pop(), test["command"], properties["WORKING_DIRECTORY"], environment))
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
        test.passed = run(test, test.command, 120, VANTEL_MUTANTS_REACHED=file.name)
        test.seconds = time.monotonic() - start
        octets = file.read().rstrip(b"\0")
    test.reached = frozenset(number for number, octet in enumerate(octets) if octet)


def find_all_reached(tests, kept, build, jobs):
    """Of a program that is as it was, and the libraries, what is kept is taken."""
    known = json.loads(kept.read_text()) if kept.exists() else {}
    libraries = max(path.stat().st_mtime for path in build.rglob("*.so"))
    built = {test.name: [os.stat(test.command[0]).st_mtime, libraries] for test in tests}
    unknown = []
    for test in tests:
        if known.get(test.name, [0])[0] == built[test.name]:
            _, test.seconds, reached = known[test.name]
            test.reached = frozenset(reached)
        else:
            unknown.append(test)
    with concurrent.futures.ThreadPoolExecutor(jobs) as pool:
        list(pool.map(find_reached, unknown))
    kept.write_text(json.dumps(
        {test.name: [built[test.name], test.seconds, sorted(test.reached)] for test in tests if test.passed}))
    failed = [test.name for test in tests if not test.passed]
    if failed:
        print(f"run: left out, as they fail without a mutant: {' '.join(failed)}", file=sys.stderr)
    return [test for test in tests if test.passed]


def batches(tests):
    """What to run, in order: each a test, or those of a program that share a process, and the command."""
    ordered = sorted(tests, key=lambda test: test.seconds)
    shared = [test for test in ordered if pathlib.Path(test.command[0]).name in SHARING and test.seconds < LONG]
    if shared:
        names = ":".join(test.name for test in shared)
        command = [shared[0].command[0], "--gtest_fail_fast", f"--gtest_filter={names}"]
        yield shared[0], command, 10 + 5 * sum(test.seconds for test in shared)
    for test in ordered:
        if test not in shared:
            yield test, test.command, 10 + 5 * test.seconds


def outcome(mutant, tests):
    """The test that caught it, "lived" or "unreached"."""
    reaching = [test for test in tests if mutant["number"] in test.reached]
    for test, command, timeout in batches(reaching):
        # On a busy machine a test that waits may fail for that reason: twice is none.
        tries = 1 if test.label == "unit" else 2
        if not any(run(test, command, timeout, VANTEL_MUTANT=str(mutant["number"])) for _ in range(tries)):
            return test.label
    return "lived" if reaching else "unreached"


def key(mutant, seen):
    """The same as long as its line is, wherever that is."""
    parts = tuple(mutant[part] for part in ("file", "text", "kind", "was", "becomes"))
    seen[parts] += 1
    mutant["of alike"] = seen[parts]
    return json.dumps(parts + (seen[parts],))


def shown(mutant, place=""):
    """Those of equal lines of a file are told apart by their number."""
    number = f" ({mutant['of alike']})" if mutant["of alike"] > 1 else ""
    return f"{mutant['file']}{place}: {mutant['text']} | {mutant['was']} -> {mutant['becomes'] or 'nothing'}{number}"


def judged_by(path):
    """The mutants of the list: lines that are no comment and no reason, which is indented."""
    return {line for line in path.read_text().splitlines() if line and not line.startswith(("#", " "))}


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
    if not chosen:
        sys.exit("run: nothing is changed there")
    judged = judged_by(given.judged)
    for line in sorted(judged - {shown(mutant) for mutant in mutants}):
        print(f"run: judged, and no longer there: {line}", file=sys.stderr)
    todo = [mutant for mutant in chosen
            if known.get(mutant["key"], "lived") in ("lived", "unreached") and shown(mutant) not in judged]

    if todo:
        tests = find_all_reached(find_tests(given.build), given.results.with_name("reached.json"), given.build, jobs)
        with given.results.open("a") as results:
            for labels, each in STAGES:
                stage = [test for test in tests if test.label in labels]
                run_stage(todo, stage, jobs * each, known, results)
                todo = [mutant for mutant in todo if known[mutant["key"]] in ("lived", "unreached")]
    sys.exit(report(chosen, known, judged))


def run_stage(mutants, tests, jobs, known, results):
    """What no test of a stage reaches may have lived through the one before."""
    pool = concurrent.futures.ThreadPoolExecutor(jobs)
    try:
        running = {pool.submit(outcome, mutant, tests): mutant for mutant in mutants}
        for done, future in enumerate(concurrent.futures.as_completed(running), 1):
            key = running[future]["key"]
            if future.result() != "unreached" or known.get(key) != "lived":
                known[key] = future.result()
                results.write(json.dumps({"key": key, "outcome": known[key]}) + "\n")
                results.flush()
            if done % 100 == 0:
                print(f"{done} of {len(mutants)}", file=sys.stderr)
    finally:
        pool.shutdown(cancel_futures=True)


def report(mutants, known, judged):
    """Prints the survivors and the score of each file, and returns the exit status."""
    counts = collections.defaultdict(collections.Counter)
    status = 0
    for mutant in mutants:
        result = known.get(mutant["key"], "lived")
        if result in ("lived", "unreached") and shown(mutant) in judged:
            result = "judged"
        if result in ("lived", "unreached"):
            status = 1
            print(result + ": " + shown(mutant, f":{mutant['line']}"))
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
