"""Labels drawn through the drawing port against the same labels drawn with bare calls of Cairo."""

import json

from yardsticks import BENCH, Bench, run

# What is drawn, the part of the labels that it takes as long for, and the most that a label may take of the bare side's
# time. Cairo's own pictures are in colour.
KINDS = (("labels to PDF : bare Cairo", "pdf", 1, 1.5),
         ("grey PNG at 203 dpi : colour PNG", "png", 25, 0.2),
         ("labels to SVG : bare Cairo", "svg", 5, 1.5))


class DrawingBench(Bench):
    def prepare(self):
        """The program that draws makes its labels itself."""

    def draw(self, side, kind, count):
        out, _, _, _ = run(BENCH / "label_drawing", side, kind, count)
        return json.loads(out)["busy" if self.cpu else "seconds"]

    def measure(self):
        self.print_line("drawing", "ours", "bare", None)
        for name, kind, part, target in KINDS:
            count = self.sizes["labels"] // part
            self.compare(f"{count} {name}", lambda kind=kind, count=count: self.draw("device", kind, count),
                         lambda kind=kind, count=count: self.draw("bare", kind, count), target)
