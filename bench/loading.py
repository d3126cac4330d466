"""Prices of a million products loaded by `data load`, against a bare program that inserts the same rows."""

import json
import os
import random
import shutil

from yardsticks import BENCH, PROGRAM, Bench, Failure, run

MEMORY = 60e6


def write_prices(path, count):
    chance = random.Random("prices")
    with path.open("w") as file:
        file.write('{"ProductPrice": [')
        for number in range(0, 613 * count, 613):
            cost = chance.randrange(400, 8000)
            price = {"VendorId": "ACME", "ProductNo": f"9312{number:09d}", "SKU": f"{number % 10**7:07d}",
                     "Cost": cost / 100, "Retail": cost // 50 + 0.95, "TaxRate": "10", "DeptNo": f"{cost % 40 + 300}"}
            file.write(("" if file.tell() < 20 else ",") + "\n" + json.dumps(price))
        file.write("\n]}\n")


class LoadBench(Bench):
    def prepare(self):
        run(PROGRAM, "new", self.workspace)
        shutil.copy(self.store, self.folder / "empty.db")
        self.memory = 0
        many = self.sizes["records"]
        for records in (many, many // 10):
            write_prices(self.folder / f"{records}.json", records)

    def empty(self):
        for left in self.workspace.glob("partnerkit.db*"):
            left.unlink()
        shutil.copy(self.folder / "empty.db", self.store)
        os.sync()

    def load(self, records):
        self.empty()
        file = self.folder / f"{records}.json"
        out, elapsed, busy, memory = run(PROGRAM, "--workspace", self.workspace, "--json", "data", "load", file)
        if json.loads(out)["loaded"] != {"ProductPrice": records}:
            raise Failure("not every record was loaded")
        self.memory = max(self.memory, memory)
        if records == self.sizes["records"] and not (self.folder / "full.db").exists():
            shutil.copy(self.store, self.folder / "full.db")
        return busy if self.cpu else elapsed

    def load_each(self, records):
        return self.load(records) / records

    def bare(self):
        self.empty()
        out, _, _, _ = run(BENCH / "bare_load", self.folder / "full.db", self.store, "tbProductPrice")
        told = json.loads(out)
        if told["rows"] != self.sizes["records"]:
            raise Failure("the bare program has inserted other rows")
        return told["busy" if self.cpu else "seconds"]

    def measure(self):
        many = self.sizes["records"]
        few = many // 10
        self.print_line("data load", "ours", "bare", None)
        self.compare(f"{many} prices : bare inserts", lambda: self.load(many), self.bare, 3.0)
        self.print_line("  its memory : 60 MB", f"{self.memory / 1e6:.1f} MB", "60.0 MB", 1.0, self.memory / MEMORY)
        self.compare(f"a price of {many} : of {few}", lambda: self.load_each(many), lambda: self.load_each(few), 1.15, "us")
