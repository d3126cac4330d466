#!/usr/bin/env python3
"""Writes a CSV order file of any size for one class, its column map and the records that make every line pass its checks.

An order is about 40 lines: 6 to 10 products for 4 to 6 stores each. The same seed gives the same file.
"""
import argparse
import datetime
import json
import os
import random

from order_samples import order_class

COMPANY = "ACME"
ORDERS_PER_INTERCHANGE = 50
GARMENTS = ["CREW TEE", "POLO SHIRT", "RUGBY TOP", "DENIM SHORT", "WORK SOCK", "FLEECE HOOD", "TWILL CAP", "RAIN JACKET"]
COLOURS = ["NAVY", "BLACK", "WHITE", "RED", "OLIVE", "GREY MARLE"]


def with_check_digit(digits):
    weighted = sum(int(digit) * (3 if place % 2 else 1) for place, digit in enumerate(digits))
    return digits + str(-weighted % 10)


class Supplier:
    """What the partner sells and where: the same for every file of a seed."""

    def __init__(self, seed):
        chance = random.Random(f"supplier {seed}")
        self.stores = [f"{number:04d}" for number in sorted(chance.sample(range(1, 900), 120))]
        self.products = [self._product(chance, number) for number in range(2000)]

    @staticmethod
    def _product(chance, number):
        cents = chance.randrange(150, 9000)
        return {
            "ean": with_check_digit(f"93{number:05d}{chance.randrange(100_000):05d}"),
            "sku": str(20_000_000 + number * 29),
            "cost": f"{cents / 100:.2f}",
            "retail": f"{cents * 2.2 / 100:.2f}",
            "description": f"{chance.choice(GARMENTS)} {chance.choice(COLOURS)}",
            "weight": f"{chance.randrange(5, 300) / 100:.2f}",
            "volume": f"{chance.randrange(1, 90) / 1000:.3f}",
            "bin": f"{chance.choice('ABCDEF')}{chance.randrange(100):02d}",
        }

    def records(self, of_class):
        """As `data load` takes them; document 1 is the order file."""
        products = [(p["ean"], float(p["cost"]), float(p["retail"]), p["sku"]) for p in self.products]
        return {
            "Partner": of_class.records["Partner"],
            "Vendor": [{"VendorId": COMPANY, "Name": "Acme Apparel", "POBackupFile": "${workspace}/backup/po.csv"}],
            "EDIDoc": [{**of_class.document, "EDIDocId": 1, "VendorId": COMPANY, "MapFolder": "${workspace}/maps/",
                        "MapFile": "orders.map"}],
            **of_class.masters(products, self.stores, [COMPANY])}


def like(date, sample):
    """The date as the partner writes it."""
    return date.strftime("%Y/%m/%d" if "/" in sample else "%y%m%d" if len(sample) == 6 else "%Y%m%d")


# What differs from one line of a product to the next.
STORE, QUANTITY, REFERENCE = "\1", "\2", "\3"


def orders(of_class, supplier, seed):
    """The text of one order after another, without end, and its number of lines."""
    chance = random.Random(f"orders {seed}")
    number = 4_500_000_000
    count = 0
    while True:
        count += 1
        number += chance.randrange(1, 9)
        interchange, transaction = divmod(count - 1, ORDERS_PER_INTERCHANGE)
        ordered = datetime.date(2006, 1, 1) + datetime.timedelta(chance.randrange(360))
        head = {"INTCONTROLNO": f"{interchange + 1:09d}", "TRNCONTROLNO": f"{transaction + 1:04d}", "PONUMBER": number,
                "DEPTNO": chance.randrange(100, 999), "ALLOCATEQUANTITY": QUANTITY, "LINEREF": REFERENCE}
        for column, days in (("PODATE", 0), ("NOTBEFORE", 14), ("CANCAFTER", 28), ("ADDATE", 35)):
            head[column] = like(ordered + datetime.timedelta(days), of_class.typical.get(column, ""))
        if of_class.typical["GRPCONTROLNO"]:
            head["GRPCONTROLNO"] = interchange + 1
        stores = chance.sample(supplier.stores, chance.randrange(4, 7))
        texts = []
        for sequence, p in enumerate(chance.sample(supplier.products, chance.randrange(6, 11)), 1):
            fields = of_class.line(
                p["ean"], STORE, QUANTITY, float(p["cost"]), float(p["retail"]), p["sku"], **head,
                SEQUENTIALLINENO=sequence, DESCRIPTION=f'"{p["description"]}"', WEIGHT=p["weight"], VOLUME=p["volume"],
                BIN=p["bin"])
            texts.append(",".join(fields.values()) + "\n")
        # An order that carries its ship-to's address goes on to the next place when it is through with one.
        by_store = "HEADER5" in of_class.columns
        pairs = [(text, store) for store in stores for text in texts] if by_store else \
            [(text, store) for text in texts for store in stores]
        lines = [text.replace(STORE, store).replace(QUANTITY, str(chance.randrange(1, 120))).replace(REFERENCE, str(at))
                 for at, (text, store) in enumerate(pairs, 1)]
        yield "".join(lines), len(lines)


def write_orders(path, of_class, supplier, seed=1, size=None, count=None):
    """Ends at the first whole order at or past `size` bytes, or after `count` orders. Gives what was written."""
    written = {"bytes": 0, "orders": 0, "lines": 0}
    with open(path, "w", encoding="ascii", newline="", buffering=1 << 20) as file:
        for text, lines in orders(of_class, supplier, seed):
            written["bytes"] += file.write(text)
            written["orders"] += 1
            written["lines"] += lines
            if written["orders"] == count or (size is not None and written["bytes"] >= size):
                return written


def write_masters(folder, of_class, supplier):
    """orders.map and records.json."""
    with open(os.path.join(folder, "orders.map"), "w", encoding="ascii") as file:
        file.write("\n".join(of_class.columns) + "\n")
    with open(os.path.join(folder, "records.json"), "w", encoding="ascii") as file:
        json.dump(supplier.records(of_class), file, indent=1)


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("folder", help="takes orders.csv, orders.map and records.json")
    length = parser.add_mutually_exclusive_group(required=True)
    length.add_argument("--megabytes", type=float)
    length.add_argument("--orders", type=int)
    parser.add_argument("--class", dest="of_class", type=order_class, default="clsMGB850csv")
    parser.add_argument("--seed", type=int, default=1)
    options = parser.parse_args()
    supplier = Supplier(options.seed)
    os.makedirs(options.folder, exist_ok=True)
    write_masters(options.folder, options.of_class, supplier)
    size = None if options.megabytes is None else int(options.megabytes * 1e6)
    path = os.path.join(options.folder, "orders.csv")
    print(json.dumps(write_orders(path, options.of_class, supplier, options.seed, size, options.orders)))


if __name__ == "__main__":
    main()
