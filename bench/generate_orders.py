#!/usr/bin/env python3
"""Writes a CSV order file of any size, its column map and the records that make every line pass its checks.

An order is about 40 lines: 6 to 10 products for 4 to 6 stores each. The same seed gives the same file.
"""
import argparse
import datetime
import json
import os
import random

COLUMNS = """INTCONTROLNO GRPCONTROLNO TRNCONTROLNO PARTNEREDIADDR COMPANYEDIADDR POPURPOSECODE POTYPECODE PONUMBER PODATE
SUPPLIERNO CUSTCAT DEPTNO NOTBEFORE CANCAFTER ADDATE STOREZONE BUYINGLOCPARTNERNO SHIPTOLOCPARTNERNO SEQUENTIALLINENO
PRODUCTQUALIFIER INCOMINGPRODUCTNO UNITMEASURECODE UNITPRICECODE UNITPRICE ORDERQUANTITY SKUPRODUCTKEYCODE
RETAILUNITPRICE ALLOCATEQUANTITY CUSTOMERREF CUSTOMERNO STYLE COLOUR SIZE DESCRIPTION WEIGHT VOLUME BIN
LINEREF""".split()

PARTNER_ADDRESS, COMPANY_ADDRESS = "9377700000014", "9377700000021"
DEPOT = "0900"
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

    def records(self):
        """As `data load` takes them; document 1 is the order file."""
        document = {
            "EDIDocId": 1, "ProgId": "PartnerKit.clsMGB850csv", "DocumentCode": "850", "PartnerId": "MGB",
            "VendorId": "ACME", "CompanyEDIAddr": COMPANY_ADDRESS, "PartnerEDIAddr": PARTNER_ADDRESS,
            "MapFolder": "${workspace}/maps/", "MapFile": "orders.map",
            "ValidateProduct": True, "ValidateCost": True, "ValidateRetail": True}
        return {
            "Partner": [{"PartnerId": "MGB", "Name": "MGB Stores", "State": "VIC"}],
            "Vendor": [{"VendorId": "ACME", "Name": "Acme Apparel", "POBackupFile": "${workspace}/backup/po.csv"}],
            "EDIDoc": [document],
            "PartnerLocn": [{"VendorId": "ACME", "PartnerLocnNo": store, "Name": f"Store {store}", "State": "VIC"}
                            for store in [*self.stores, DEPOT]],
            "Product": [{"ProductNo": p["ean"], "PartnerId": "MGB", "Description": p["description"], "UOM": "EA",
                         "Symbology": "EN"} for p in self.products],
            "ProductPrice": [{"VendorId": "ACME", "ProductNo": p["ean"], "Cost": float(p["cost"]),
                              "Retail": float(p["retail"]), "SKU": p["sku"]} for p in self.products]}


def orders(supplier, seed):
    """The text of one order after another, without end, and its number of lines."""
    chance = random.Random(f"orders {seed}")
    number = 4_500_000_000
    count = 0
    while True:
        count += 1
        number += chance.randrange(1, 9)
        interchange, transaction = divmod(count - 1, ORDERS_PER_INTERCHANGE)
        ordered = datetime.date(2006, 1, 1) + datetime.timedelta(chance.randrange(360))
        not_before, cancel_after, advertised = (
            f"{ordered + datetime.timedelta(days):%Y%m%d}" for days in (14, 28, 35))
        head = (f"{interchange + 1:09d},{interchange + 1},{transaction + 1:04d},{PARTNER_ADDRESS},{COMPANY_ADDRESS},00,SA,"
                f"{number},{ordered:%Y%m%d},104455,REG,{chance.randrange(100, 999)},{not_before},{cancel_after},"
                f"{advertised},Z1")
        stores = chance.sample(supplier.stores, chance.randrange(4, 7))
        lines = []
        for sequence, p in enumerate(chance.sample(supplier.products, chance.randrange(6, 11)), 1):
            for store in stores:
                quantity = chance.randrange(1, 120)
                lines.append(f"{head},{store},{DEPOT},{sequence},EN,{p['ean']},EA,WE,{p['cost']},{quantity},{p['sku']},"
                             f"{p['retail']},{quantity},,,,,,\"{p['description']}\",{p['weight']},{p['volume']},"
                             f"{p['bin']},{len(lines) + 1}\n")
        yield "".join(lines), len(lines)


def write_orders(path, supplier, seed=1, size=None, count=None):
    """Ends at the first whole order at or past `size` bytes, or after `count` orders. Gives what was written."""
    written = {"bytes": 0, "orders": 0, "lines": 0}
    with open(path, "w", encoding="ascii", newline="", buffering=1 << 20) as file:
        for text, lines in orders(supplier, seed):
            written["bytes"] += file.write(text)
            written["orders"] += 1
            written["lines"] += lines
            if written["orders"] == count or (size is not None and written["bytes"] >= size):
                return written


def write_masters(folder, supplier):
    """orders.map and records.json."""
    with open(os.path.join(folder, "orders.map"), "w", encoding="ascii") as file:
        file.write("\n".join(COLUMNS) + "\n")
    with open(os.path.join(folder, "records.json"), "w", encoding="ascii") as file:
        json.dump(supplier.records(), file, indent=1)


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("folder", help="takes orders.csv, orders.map and records.json")
    length = parser.add_mutually_exclusive_group(required=True)
    length.add_argument("--megabytes", type=float)
    length.add_argument("--orders", type=int)
    parser.add_argument("--seed", type=int, default=1)
    options = parser.parse_args()
    supplier = Supplier(options.seed)
    os.makedirs(options.folder, exist_ok=True)
    write_masters(options.folder, supplier)
    size = None if options.megabytes is None else int(options.megabytes * 1e6)
    print(json.dumps(write_orders(os.path.join(options.folder, "orders.csv"), supplier, options.seed, size, options.orders)))


if __name__ == "__main__":
    main()
