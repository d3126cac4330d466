"""Labels in the format language against bare writing, and how the cost of a label grows with its run."""

import json

from yardsticks import BENCH, Bench, Failure, run

PROGRAM = BENCH / "label_batches"


class LabelBench(Bench):
    def prepare(self):
        self.bytes = set()

    def seconds(self, *arguments):
        out, _, _, _ = run(PROGRAM, *arguments)
        told = json.loads(out)
        return told["bytes"], told["busy" if self.cpu else "seconds"]

    def side(self, *arguments):
        written, seconds = self.seconds(*arguments)
        self.bytes.add(written)
        if len(self.bytes) > 1:
            raise Failure("the two sides made different packets")
        return seconds

    def label_of(self, count):
        return self.seconds("run", count)[1] / count

    def measure(self):
        count = self.sizes["cartons"]
        few = count // 4
        self.print_line("clsCMLSCM", "ours", "bare", None)
        self.compare(f"{count} batch packets : fwrite", lambda: self.side("packets", count),
                     lambda: self.side("fwrite", count, self.folder / "packets"), 3.0)
        self.compare(f"a label of {count} : of {few}", lambda: self.label_of(count), lambda: self.label_of(few), 1.15,
                     "us")
