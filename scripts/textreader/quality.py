#!/usr/bin/env python3
"""Measures what the text reader alone reads on the development set of real photographs (../shared/realtext beside
the checkout, or REALTEXT_DIR), scored by the same rules as the set's score.py (found and precision of words of three
letters or more, per group), for one or more settings of the reader. A measurement, not a test: it compares settings
(detector long side, recogniser, thresholds) on the set as a whole.

  python3 scripts/textreader/quality.py [--build build] "--long-side 960" "--long-side 1280" ...

Each argument is one setting: options passed to build/bin/read_images. With none, the default setting alone."""
import argparse, json, os, subprocess, sys, time

HERE = os.path.dirname(os.path.abspath(__file__))
ROOT = os.path.dirname(os.path.dirname(HERE))


def load_scoring(data):
    sys.path.insert(0, data)
    import score  # the set's own scoring rules
    return score


def measure(score, data, manifest, program, setting):
    files = [os.path.join(data, e["file"]) for e in manifest]
    start = time.time()
    out = subprocess.run([program, *setting.split(), *files], capture_output=True, text=True, check=True).stdout
    wall = time.time() - start
    readings = {os.path.basename(r["file"]): r for r in map(json.loads, out.splitlines())}
    totals = {}
    for entry in manifest:
        reading = readings[entry["file"]]
        lines = [(score.rect_poly(line["rect"]), line["text"]) for line in reading["lines"]]
        found, truth, right, reported = score.score(entry, lines)
        for group in (entry["group"], "all"):
            t = totals.setdefault(group, [0, 0, 0, 0, 0.0, 0])
            for i, v in enumerate((found, truth, right, reported, reading["ms"], 1)):
                t[i] += v
    return totals, wall


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--build", default=os.path.join(ROOT, "build"))
    parser.add_argument("settings", nargs="*")
    args = parser.parse_args()
    data = os.environ.get("REALTEXT_DIR", os.path.join(os.path.dirname(ROOT), "shared", "realtext"))
    score = load_scoring(data)
    with open(os.path.join(data, "manifest.json")) as f:
        manifest = json.load(f)
    program = os.path.join(args.build, "bin", "read_images")
    print(f"{'setting':32} {'group':10} {'found':>7} {'precision':>9} {'ms/image':>9}")
    for setting in args.settings or [""]:
        totals, wall = measure(score, data, manifest, program, setting)
        for group in ("focused", "incidental", "document", "all"):
            found, truth, right, reported, ms, images = totals[group]
            print(f"{setting or 'default':32} {group:10} {found / max(truth, 1):7.3f} "
                  f"{right / max(reported, 1):9.3f} {ms / images:9.0f}")
        sys.stdout.flush()


if __name__ == "__main__":
    main()
