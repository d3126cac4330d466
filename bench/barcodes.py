"""Barcode patterns against libzint's."""

import json

from yardsticks import BENCH, Bench, Failure, run

PROGRAM = BENCH / "barcode"


class BarcodeBench(Bench):
    def prepare(self):
        self.dark = set()

    def side(self, which):
        out, _, _, _ = run(PROGRAM, which, self.sizes["barcodes"])
        told = json.loads(out)
        self.dark.add(told["dark"])
        if len(self.dark) > 1:
            raise Failure("the two sides made different barcodes")
        return told["busy" if self.cpu else "seconds"]

    def measure(self):
        name = f"{self.sizes['barcodes']} barcodes : libzint"
        self.print_line("GS1-128", "ours", "bare", None)
        if not PROGRAM.exists():
            print(f"{name:<44}not measured: libzint was not there when bench/barcode was to be built")
            return
        self.compare(name, lambda: self.side("ours"), lambda: self.side("libzint"), 1 / 6)
