#!/usr/bin/env python3
"""Times the program against bare yardsticks on this machine and prints their ratios, for the model class and the slowest
of the others.

Each ratio is taken in one go: the two sides run in turn, the median of each counts. Other work on the machine distorts the
figures; --cpu compares processor time instead of elapsed time, which suffers less but leaves out the waiting for the disk.
Exit status: 0 all ratios within their targets, 1 one is over, 2 the measuring could not be done.
"""
import argparse
import os
import pathlib
import shutil
import signal
import sys
import tempfile

import order_samples
from barcodes import BarcodeBench
from drawing import DrawingBench
from labels import LabelBench
from loading import LoadBench
from notices import NoticesBench
from x12 import X12Bench
from yardsticks import BUILD, Bench, Failure

# Bytes of disk for each byte of the large file (the file, two copies, its backup), and for each order posted (several
# databases of 5 KB an order and more).
LARGE_FILE_COPIES = 5
BYTES_PER_ORDER = 60_000

MODEL, SLOWEST = "clsMGB850csv", "clsColesEIDCPOcsv"
# The load comes first: the peak memory of a program counts what this one held as it started it, and the drawing makes
# that a lot.
OTHERS = {"load": LoadBench, "x12": X12Bench, "barcode": BarcodeBench, "drawing": DrawingBench, "labels": LabelBench,
          "notices": NoticesBench}

FULL = {"runs": 3, "bytes": 150_000_000, "orders": 2_000, "many": 20_000, "segments": 10_000_000,
        "barcodes": 1_000_000, "labels": 5_000, "cartons": 100_000, "shipments": 1_000, "records": 1_000_000}
SURVEY = {"runs": 3, "bytes": 15_000_000, "orders": 500, "many": 1_500, "segments": 1_000_000,
          "barcodes": 100_000, "labels": 500, "cartons": 10_000, "shipments": 300, "records": 100_000}
QUICK = {"runs": 1, "bytes": 3_000_000, "orders": 60, "many": 200, "segments": 100_000,
         "barcodes": 10_000, "labels": 50, "cartons": 1_000, "shipments": 20, "records": 1_000}


def check_space(sizes):
    wanted = sizes["bytes"] * LARGE_FILE_COPIES + sizes["many"] * BYTES_PER_ORDER
    free = shutil.disk_usage(BUILD).free
    if free < wanted:
        raise Failure(f"{BUILD}: {wanted // 1_000_000} MB of free disk are needed, there are {free // 1_000_000}")


def main():
    parser = argparse.ArgumentParser(prog="./pk bench", description=__doc__,
                                     formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--quick", action="store_true", help="small sizes, once each: shows that it runs, not how fast")
    parser.add_argument("--class", dest="named", help="one CSV class instead, or all, these at a smaller size, or load,"
                        " x12, barcode, drawing, labels, notices")
    parser.add_argument("--cpu", action="store_true", help="compare processor time")
    parser.add_argument("--runs", type=int, help="how often each side runs (%d)" % FULL["runs"])
    options = parser.parse_args()
    sizes = dict(QUICK if options.quick else SURVEY if options.named == "all" else FULL)
    csv_classes = [] if options.named in OTHERS else order_samples.order_classes() if options.named == "all" else \
        [order_samples.order_class(name) for name in ([options.named] if options.named else [MODEL, SLOWEST])]
    kinds = [(Bench, of_class) for of_class in csv_classes]
    kinds += [(kind, None) for name, kind in OTHERS.items() if options.named in (None, name)]
    if options.runs:
        sizes["runs"] = options.runs
    signal.signal(signal.SIGTERM, lambda *_: sys.exit(2))  # so that the files go
    load, cores = os.getloadavg()[0], os.cpu_count() or 1
    if load > cores / 4:
        print(f"bench: {load:.1f} processes keep the {cores} processors of this machine busy; the figures suffer",
              file=sys.stderr)
    over = False
    try:
        check_space(sizes)
        for kind, of_class in kinds:
            with tempfile.TemporaryDirectory(prefix="bench-", dir=BUILD) as folder:
                bench = kind(pathlib.Path(folder), of_class, sizes, options.cpu)
                bench.prepare()
                bench.measure()
            over |= bench.over
    except (Failure, OSError) as failure:
        print(f"bench: {failure}", file=sys.stderr)
        return 2
    # Small sizes measure the start of the programs, so nothing is over then.
    return 1 if over and not options.quick else 0


if __name__ == "__main__":
    sys.exit(main())
