#!/usr/bin/env python3
"""Measures what the tests see: puts single faults into the sources, one at a time, and runs the tests on each.

  tools/faults.py                     every fault of tools/faults.txt that has no result yet
  tools/faults.py NAME...             these faults, or those of these families, again
  tools/faults.py --ring RING NAME... in another ring than their own: native or windows64
  tools/faults.py --check             only whether every fault still finds its text
  tools/faults.py --table             the results as a Markdown table

It works on a copy of the checkout, build/faults/tree, and keeps its results in build/faults/results.tsv. A test program
that dies, or does not end in time, has caught the fault; a fault that does not compile is none.
"""
import argparse
import os
import pathlib
import re
import shutil
import signal
import subprocess
import sys
from collections import namedtuple

TOP = pathlib.Path(__file__).resolve().parent.parent
WORK = TOP / "build/faults"
TREE = WORK / "tree"
RESULTS = WORK / "results.tsv"
TIME_LIMIT = 900  # Seconds, for a build or one kind of tests: many times what they take.

# Natively without sanitizers and optimisation: most of the time goes into building.
PLAIN = "-DTALUTIL_SANITIZE=OFF -DCMAKE_CXX_FLAGS_DEBUG=-O0"
WINE = "use_wine64; start_wine; "
BUILDS = {
    "native": f"cmake --preset asan {PLAIN} && cmake --build --preset asan -j2",
    "windows64": WINE + "cmake --preset windows64 && cmake --build --preset windows64 -j2",
}
CHECKS = {
    "native": {
        "unit tests": "build/asan/tests/unit_tests",
        "tests/faults": "build/asan/tests/fault_tests",
        "tests/cli": "tests/cli/run.sh build/asan/talutil",
        "tests/archives/exchange": "tests/archives/exchange.sh build/asan/talutil",
        "docs/TALUtil.idl": "build/asan/talutil idl | diff docs/TALUtil.idl -",
        "docs/reference.md": "build/asan/talutil reference | diff docs/reference.md -",
    },
    "windows64": {
        "tests/hosts": "tests/hosts/run.sh windows64",
        "unit tests": WINE + f"WINE_TIMEOUT={TIME_LIMIT} wine 'Z:\\build\\windows64\\tests\\unit_tests.exe'",
    },
}

Fault = namedtuple("Fault", "name family file ring before after")


def read_faults():
    blocks = re.split(r"^\[", (TOP / "tools/faults.txt").read_text(), flags=re.MULTILINE)[1:]
    faults = []
    for block in blocks:
        heading, *lines = block.rstrip("\n").split("\n")
        parts = re.fullmatch(r"(\S+)\] (\S+) (\S+) (native|windows64)", heading)
        if not parts or any(line[:1] not in ("-", "+", "") for line in lines):
            sys.exit(f"tools/faults.txt: [{heading}: write [name] family file ring, then lines that begin with - or +")
        before, after = ("\n".join(line[1:] for line in lines if line.startswith(mark)) for mark in "-+")
        faults.append(Fault(*parts.groups(), before, after))
    return faults


def place_of(fault, top):
    """The file of a fault, by its last name alone, since files move; a text when the fault has no place any more."""
    found = list((top / "src").rglob(fault.file))
    if len(found) != 1:
        return f"{fault.name}: there are {len(found)} files {fault.file} below src"
    count = found[0].read_text().count(fault.before)
    return found[0] if count == 1 else f"{fault.name}: its text stands {count} times in {fault.file}"


def copy_tree():
    listing = subprocess.check_output(["git", "ls-files", "-z", "-co", "--exclude-standard"], cwd=TOP, text=True)
    wanted = {TREE / name: TOP / name for name in listing.split("\0") if (TOP / name).is_file()}
    for target, source in wanted.items():
        if not target.exists() or target.read_bytes() != source.read_bytes():
            target.parent.mkdir(parents=True, exist_ok=True)
            shutil.copy(source, target)  # With the time of now, so that it is built anew.
    for path in TREE.rglob("*"):
        if path.is_file() and path not in wanted and TREE / "build" not in path.parents:
            path.unlink()


def run(command):
    """Runs a shell command in the copy; gives its status, None when it took too long, and its output."""
    with open(WORK / "output.log", "w+b") as log:  # A file, so that a server that stays behind holds up nobody.
        process = subprocess.Popen(["bash", "-c", f"set -o pipefail; . tools/environment.sh; {command}"], cwd=TREE,
                                   stdin=subprocess.DEVNULL, stdout=log, stderr=log, start_new_session=True,
                                   env=os.environ | {"TALUTIL_BUILD": str(TREE / "build")})
        try:
            process.wait(TIME_LIMIT)
        except subprocess.TimeoutExpired:
            os.killpg(process.pid, signal.SIGKILL)
        log.seek(0)
        return process.returncode, log.read().decode(errors="replace").replace("\r", "")


def failures_in(status, output):
    found = re.findall(r"^\[  FAILED  \] ([^\s,]+)|^FAILED:? (.*)", output, re.MULTILINE)
    names = list(dict.fromkeys((test or check)[:100] for test, check in found if not test.isdigit()))
    if names:
        return "; ".join(names[:3]) + (f" and {len(names) - 3} more" if len(names) > 3 else "")
    last = re.findall(r"^\[ RUN      \] (\S+)", output, re.MULTILINE) or output.splitlines() or [""]
    return ("not in time" if status is None else f"status {status}") + f" at {last[-1]}"


def outcome_in(ring):
    status, output = run(BUILDS[ring])
    if status != 0:
        return "does not compile", "; ".join(re.findall(r"error: .*", output))[:300]
    for what, command in CHECKS[ring].items():
        status, output = run(command)
        if status != 0 and ring == "windows64":  # Wine's server stumbles at times: twice is no accident.
            status, output = run(command)
        if status != 0:
            return "caught", f"{what}: {failures_in(status, output)}"
    return ("not caught",)


def measure(faults, ring):
    if (outcome := outcome_in(ring)) != ("not caught",):
        sys.exit(f"{ring}, without any fault: {': '.join(outcome)}")
    for fault in faults:
        path = place_of(fault, TREE)
        original = path.read_text()
        try:
            path.write_text(original.replace(fault.before, fault.after))
            outcome = outcome_in(ring)
        finally:
            path.write_text(original)
        print(f"{fault.name} ({ring}): {': '.join(outcome)}", flush=True)
        with RESULTS.open("a") as results:  # The last line of a fault counts.
            results.write("\t".join([fault.name, ring, ": ".join(outcome)]) + "\n")


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--ring", choices=CHECKS)
    parser.add_argument("--check", action="store_true")
    parser.add_argument("--table", action="store_true")
    parser.add_argument("names", nargs="*")
    options = parser.parse_args()
    faults = read_faults()
    if unknown := set(options.names) - {part for fault in faults for part in fault[:2]}:
        sys.exit(f"tools/faults.txt has no fault or family {', '.join(sorted(unknown))}")
    WORK.mkdir(parents=True, exist_ok=True)
    RESULTS.touch()
    results = {tuple(fields[:2]): fields[2] for fields in (line.split("\t") for line in RESULTS.open())}
    if options.table:
        print("| Fault | Family | File | Outcome |\n|---|---|---|---|")
        for fault in faults:
            found = [f"{ring}: {results[fault.name, ring].strip()}" for ring in CHECKS if (fault.name, ring) in results]
            print(f"| {fault.name} | {fault.family} | {fault.file} | {'; '.join(found).replace('|', '/')} |")
        return
    refused = [place for place in (place_of(fault, TOP) for fault in faults) if isinstance(place, str)]
    print(*refused, sep="\n", end="\n" if refused else "", file=sys.stderr)
    if not options.check:
        copy_tree()
        for ring in [options.ring] if options.ring else CHECKS:
            chosen = [fault for fault in faults if ring == (options.ring or fault.ring) and
                      not isinstance(place_of(fault, TOP), str) and
                      ({fault.name, fault.family} & set(options.names) if options.names
                       else (fault.name, ring) not in results)]
            if chosen:
                measure(chosen, ring)
    sys.exit(1 if refused else 0)


main()
