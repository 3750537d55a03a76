#!/usr/bin/env python3
"""planned.py SHARES INPUT…: what `lyra --plan` expects of shares, beside what they take.

An INPUT is a model, of which `lyra detect` is measured, or RESULT:MODEL, of which `lyra publish` is. Needs lyra in
build/release (or the folder of ZOR_BUILD_DIR). Processor time of all processes of a share, with the model in the cache,
which is one of this run's own. Exit code 1 when the shares of one work together take more than twice or less than half of
what was expected.
"""

import json
import os
import pathlib
import resource
import subprocess
import sys
import tempfile

LYRA = pathlib.Path(os.environ.get("ZOR_BUILD_DIR", pathlib.Path(__file__).resolve().parents[2] / "build/release")) / "bin/lyra"
FACTOR = 2


def run(*words):
    """Seconds of processor time of a run, and what it prints."""
    before = resource.getrusage(resource.RUSAGE_CHILDREN)
    printed = subprocess.run([LYRA, *words], check=True, stdout=subprocess.PIPE, text=True).stdout
    after = resource.getrusage(resource.RUSAGE_CHILDREN)
    return after.ru_utime - before.ru_utime + after.ru_stime - before.ru_stime, printed


def measure(words, shares, folder):
    run(*words, "--plan", "--shares", "1", "--json")  # the model is in the cache then
    planning, printed = run(*words, "--plan", "--shares", str(shares), "--json")
    plan = json.loads(printed)
    taken = []
    for number in range(1, shares + 1):
        target = f"{folder}/{number}"
        taken.append(run(*words, "--jobs", "1", "--shard", f"{number}/{shares}", "-o", target)[0])
    gathering, _ = run("gather", *(f"{folder}/{number}" for number in range(1, shares + 1)), "-o", f"{folder}/all")
    return plan, planning, taken, gathering


def main():
    shares, inputs = int(sys.argv[1]), sys.argv[2:]
    print("| Work | Items | Planned | Taken | Taken by planned | Share by share | Longest by mean | Plan | Gathering |")
    print("|---|---|---|---|---|---|---|---|---|")
    is_kept = True
    for name in inputs:
        result, _, model = name.rpartition(":")
        words = ["publish", result, "--model", model] if result else ["detect", model, "--clearance", "3"]
        with tempfile.TemporaryDirectory() as folder:
            os.environ["XDG_CACHE_HOME"] = f"{folder}/cache"
            plan, planning, taken, gathering = measure(words, shares, folder)
        planned = [share["seconds"] for share in plan["shares"]]
        ratio = sum(taken) / sum(planned)
        is_kept = is_kept and 1 / FACTOR <= ratio <= FACTOR
        each = ", ".join(f"{took / expected:.2f}" for took, expected in zip(taken, planned))
        print(f"| `{words[0]}` {pathlib.Path(model).stem} | {plan['items']} | {sum(planned):.1f} s | {sum(taken):.1f} s | {ratio:.2f} | "
              f"{each} | {max(taken) * shares / sum(taken):.2f} | {planning:.1f} s | {gathering:.1f} s |", flush=True)
    return 0 if is_kept else 1


if __name__ == "__main__":
    sys.exit(main())
