"""The X12 importers against their yardsticks: a file of one interchange, its orders like those of the CSV files."""

import datetime
import json
import random
import shutil

import generate_orders
from order_samples import SAMPLES
from yardsticks import BENCH, PROGRAM, Bench, Failure, run

CLASS = "PartnerKit.clsMGB850ansix12"
WAREHOUSE = "0900"

# Parses a file with node-x12 and tells the seconds.
NODE = """
const {X12Parser} = require('node-x12'), text = require('fs').readFileSync(process.argv[1], 'utf8');
const start = process.hrtime.bigint();
new X12Parser(true).parse(text);
console.log(Number(process.hrtime.bigint() - start) / 1e9);
"""


def six(date):
    return date.strftime("%y%m%d")


def orders(supplier, seed):
    """The segments of one order after another, without end."""
    chance = random.Random(f"x12 {seed}")
    number, count = 4_500_000_000, 0
    while True:
        count += 1
        number += chance.randrange(1, 9)
        day = datetime.date(2006, 1, 1) + datetime.timedelta(chance.randrange(360))
        segments = [f"ST*850*{count:04d}", f"BEG*00*SA*{number}**{six(day)}", f"REF*DP*{chance.randrange(100, 999)}"]
        segments += [f"DTM*{qualifier}*{six(day + datetime.timedelta(days))}"
                     for qualifier, days in (("001", 28), ("037", 14), ("015", 35))]
        segments.append(f"N1*ST**92*{WAREHOUSE}")
        stores = chance.sample(supplier.stores, chance.randrange(4, 7))
        products = chance.sample(supplier.products, chance.randrange(6, 11))
        for sequence, p in enumerate(products, 1):
            quantities = [chance.randrange(1, 120) for _ in stores]
            segments.append(f"PO1*{sequence}*{sum(quantities)}*EA*{p['cost']}*WE*EN*{p['ean']}*SK*{p['sku']}")
            segments.append(f"CTP**RTL*{p['retail']}")
            segments.append("SDQ*EA*92*" + "*".join(f"{store}*{q}" for store, q in zip(stores, quantities)))
        segments.append(f"CTT*{len(products)}")
        segments.append(f"SE*{len(segments) + 1}*{count:04d}")
        yield segments


def write(path, documents, supplier, size=None, count=None, padding=0):
    """One interchange of whole orders, up to `size` bytes or `count` orders, each with `padding` more segments."""
    company, partner = documents["CompanyEDIAddr"], documents["PartnerEDIAddr"]
    with open(path, "w", encoding="ascii", newline="", buffering=1 << 20) as file:
        def put(*segments):
            return file.write("".join(f"{segment}~\r\n" for segment in segments))

        written = put(f"ISA*00*{'':10}*00*{'':10}*ZZ*{partner:15}*ZZ*{company:15}*060308*1015*U*00200*000000001*0*P*>",
                      f"GS*PO*{partner}*{company}*060308*1015*1*X*002040VICS")
        for done, segments in enumerate(orders(supplier, 1)):
            if done == count or (size is not None and written >= size):
                break
            written += put(*segments[:-2], *["REF*ZZ*9"] * padding, *segments[-2:])
        put(f"GE*{done}*1", "IEA*1*000000001")


def write_records(path, supplier):
    """As `data load` takes them; document 1 is the order file, of document 2 no file is archived. Nothing is acknowledged:
    that waits for the disk."""
    sample = json.loads((SAMPLES / "mgb850x12" / "records.json").read_text())
    document = {**sample["EDIDoc"][0], "EDIDocId": 1, "VendorId": generate_orders.COMPANY, "AckFolder": ""}
    company, partner = {"VendorId": generate_orders.COMPANY}, {"PartnerId": document["PartnerId"]}
    path.write_text(json.dumps({
        "Partner": sample["Partner"],
        "Vendor": [{**company, "Name": "Acme Apparel"}],
        "EDIDoc": [document, {**document, "EDIDocId": 2, "MapFolder": "/dev/null/"}],
        "PartnerLocn": [{**company, "PartnerLocnNo": store, "Name": f"Store {store}"}
                        for store in [*supplier.stores, WAREHOUSE]],
        "Product": [{**partner, "ProductNo": p["ean"], "UOM": "EA", "Symbology": "EN"} for p in supplier.products],
        "ProductPrice": [{**company, "ProductNo": p["ean"], "Cost": float(p["cost"]), "Retail": float(p["retail"]),
                          "SKU": p["sku"]} for p in supplier.products],
    }))
    return document


class X12Bench(Bench):
    def prepare(self):
        document = write_records(self.folder / "records.json", self.supplier)
        run(PROGRAM, "new", self.workspace)
        run(PROGRAM, "--workspace", self.workspace, "data", "load", self.folder / "records.json")
        shutil.copy(self.store, self.folder / "empty.db")

        def make(name, **length):
            write(self.folder / name, document, self.supplier, **length)
            return self.folder / name

        self.large = make("large.x12", size=self.sizes["bytes"])
        self.small = make("small.x12", size=self.sizes["bytes"] // 50)
        self.few = make("few.x12", count=self.sizes["orders"])
        self.short = make("short.x12", count=100, padding=self.sizes["segments"] // 1000)
        self.long = make("long.x12", count=100, padding=self.sizes["segments"] // 100)

    def emptied(self, inbox):
        return not inbox.exists()

    def list(self, file, document=2):
        shutil.rmtree(self.workspace / "archive", ignore_errors=True)
        out, _, _, _ = run(BENCH / "list", CLASS, self.workspace, document, file)
        told = json.loads(out)
        self.memory = told["memory"]
        return told["busy" if self.cpu else "seconds"]

    def tokenise(self):
        _, elapsed, busy, _ = run(BENCH / "tokenise", self.large, "~", "*")
        return busy if self.cpu else elapsed

    def tokenise_and_copy(self):
        copy = self.folder / "copy.x12"
        copy.unlink(missing_ok=True)
        _, elapsed, busy, _ = run("cp", self.large, copy)
        return self.tokenise() + (busy if self.cpu else elapsed)

    def node(self):
        out, _, _, _ = run("node", "-e", NODE, self.small)
        return float(out)

    def memory_of(self, file):
        self.list(file)
        return self.memory

    def measure(self):
        megabytes, small = self.sizes["bytes"] / 1e6, self.sizes["bytes"] / 50e6
        self.print_line("clsMGB850ansix12", "ours", "bare", None)
        self.compare(f"listing of {megabytes:.0f} MB : tokeniser", lambda: self.list(self.large), self.tokenise, 1.6)
        self.compare("  and its archive copy : tokeniser and cp", lambda: self.list(self.large, 1),
                     self.tokenise_and_copy, 1.6)
        try:
            self.node()
        except (Failure, OSError):
            print(f"listing of {small:.1f} MB : node-x12{'':10}not measured: node-x12 is not installed")
        else:
            self.compare(f"listing of {small:.1f} MB : node-x12", lambda: self.list(self.small), self.node, 0.05)
        few, many = self.memory_of(self.short), self.memory_of(self.long)
        self.print_line(f"memory of {self.sizes['segments'] / 1e6:g} million segments : a tenth",
                        f"{many / 1e6:.1f} MB", f"{few / 1e6:.1f} MB", 1.05, many / few)
        self.compare(f"process of {self.sizes['orders']} orders : bare inserts", self.process_few, self.bare_insert,
                     2.0)
