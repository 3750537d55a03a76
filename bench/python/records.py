#!/usr/bin/env python3
"""records.py [COUNT [REPEATS]]: reading a result into dictionaries, by the module and by way of JSON.

Needs the module, lyra and zor_generate in build/release (or the folder of ZOR_BUILD_DIR). Processor time of each way, in
a process of its own, by turns; the median counts. Exit code 1 when the answers differ or the module takes more than 1.5
times as long as `lyra convert --to json` and json.load together.
"""

import os
import pathlib
import resource
import statistics
import subprocess
import sys
import tempfile

BUILD = pathlib.Path(os.environ.get("ZOR_BUILD_DIR", pathlib.Path(__file__).resolve().parents[2] / "build/release"))
TARGET = 1.5

BY_MODULE = "import zorlyra; rows = zorlyra.read({document!r}).to_records()"
BY_JSON = "import json; rows = json.load(open({json!r}))['interferences']"
COMPARED = (
    "import json, zorlyra; "
    "sys.exit(zorlyra.read({document!r}).to_records(as_written=True) != json.load(open({json!r}))['interferences'])"
)
PEAK = "; import resource; print(resource.getrusage(resource.RUSAGE_SELF).ru_maxrss // 1024)"


def processor_time(command, **options):
    """Seconds of processor time of a command, and what it prints."""
    before = resource.getrusage(resource.RUSAGE_CHILDREN)
    printed = subprocess.run(command, check=True, **options).stdout
    after = resource.getrusage(resource.RUSAGE_CHILDREN)
    return after.ru_utime - before.ru_utime + after.ru_stime - before.ru_stime, printed


def python(code):
    return [sys.executable, "-c", f"import sys; sys.path.insert(0, {str(BUILD / 'python')!r}); {code}"]


def main():
    count, repeats = [int(word) for word in sys.argv[1:]] + [100000, 5][len(sys.argv) - 1 :]
    with tempfile.TemporaryDirectory() as folder:
        document, json = f"{folder}/result.xml", f"{folder}/result.json"
        with open(document, "wb") as file:
            subprocess.run([BUILD / "bin/zor_generate", str(count)], stdout=file, check=True)
        names = {"document": document, "json": json}
        times = {"module": [], "convert": [], "load": []}
        for _ in range(repeats):
            seconds, peak = processor_time(python(BY_MODULE.format(**names) + PEAK), stdout=subprocess.PIPE)
            times["module"].append(seconds)
            with open(json, "wb") as file:
                times["convert"].append(
                    processor_time([BUILD / "bin/lyra", "convert", "--to", "json", document], stdout=file)[0])
            seconds, peak_of_json = processor_time(python(BY_JSON.format(**names) + PEAK), stdout=subprocess.PIPE)
            times["load"].append(seconds)
        same = subprocess.run(python(COMPARED.format(**names)), check=False).returncode == 0
    median = {name: statistics.median(each) for name, each in times.items()}
    ratio = median["module"] / (median["convert"] + median["load"])
    print(f"{count} interferences, median of {repeats}, processor time")
    print(f"module: {median['module']:.2f} s, {int(peak)} MB at most")
    print(f"lyra convert --to json: {median['convert']:.2f} s; json.load: {median['load']:.2f} s, {int(peak_of_json)} MB at most")
    print(f"ratio {ratio:.2f} (at most {TARGET}): {'kept' if ratio <= TARGET else 'NOT kept'}")
    print("answers: " + ("the same" if same else "DIFFERENT"))
    return 0 if same and ratio <= TARGET else 1


if __name__ == "__main__":
    sys.exit(main())
