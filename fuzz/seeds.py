"""Writes the inputs that fuzzing a class begins with: seeds.py CLASS FOLDER. Order files and maps of odd shapes, made
from the class's sample."""

import csv
import io
import pathlib
import sys

from order_samples import order_class

# Where an order stands to one of its number: as it is, doubled, changed, cancelled, rejected, a blanket order.
SEQUELS = [{}, {"POPURPOSECODE": "07"}, {"POPURPOSECODE": "05"}, {"POPURPOSECODE": "01"}, {"POPURPOSECODE": "1"},
           {"POPURPOSECODE": "4"}, {"POPURPOSECODE": "4", "POVERSIONNO": "2"}, {"POTYPECODE": "231"},
           {"POTYPECODE": "231", "RESPONSETYPECODE": "27"}, {"POTYPECODE": "230"},
           {"POTYPECODE": "230", "POPURPOSECODE": "1"}, {"POTYPECODE": "BL"}, {"POTYPECODE": "BK"},
           {"STOREZONE": ""}, {"STOREZONE": "CO77"}, {"SHIPTOLOCPARTNERNO": "9999"}, {"PARTNEREDIADDR": "OTHEREDI"},
           {"INCOMINGPRODUCTNO": ""}]
ODD_QUANTITIES = ["1e308", "99999999999", "-5", "", "1,5"]


def text_of(lines, **style):
    text = io.StringIO()
    csv.writer(text, **{"lineterminator": "\r\n", **style}).writerows(line.values() for line in lines)
    return text.getvalue()


def changed(lines, number, changes):
    """Columns that the class doesn't have are left out."""
    return [{name: f"{number:04}" if name == "TRNCONTROLNO" else changes.get(name, value)
             for name, value in line.items()} for line in lines]


def order_files(of_class):
    lines = of_class.lines
    first = [line for line in lines if line["PONUMBER"] == lines[0]["PONUMBER"]]
    plain = text_of(lines)
    yield "orders", plain
    yield "twice_no_end", (plain + plain).rstrip()
    yield "cr_only", text_of(lines, lineterminator="\r")
    yield "quoted", text_of(lines, quoting=csv.QUOTE_ALL) + '"'
    yield "blank_lines", plain.replace("\r\n", "\r\n\r\n  \r\n")
    yield "utf16", plain.encode("utf-16")
    yield "envelopes", "".join(f"ISA*00\r\n{line}\r\nIEA*1\r\n" for line in plain.splitlines())
    for number, sequel in enumerate(SEQUELS, 10):
        yield f"sequel{number}", text_of(changed(first, 7, {}) + changed(first, number, sequel))
    yield "odd_quantities", "".join(
        text_of(changed(first, number, {of_class.quantity_column: quantity, "PONUMBER": f"45\0{number}\xe9"}))
        for number, quantity in enumerate(ODD_QUANTITIES))
    styles = [{**line, "STYLE": "TEE", "COLOUR": "NAVY", "SIZE": "S"} for line in lines]
    yield "styles", text_of(styles)


def maps(of_class):
    columns = of_class.columns
    yield "plain", "\n".join(columns)
    yield "blanks_cr", "\r".join(f"  {column} " for column in columns)
    yield "named_twice", "\n".join(columns + columns)
    yield "one_missing", "\n".join(columns[1:])
    yield "other_order", "\n".join(reversed(columns))
    yield "spare_columns", "\n\nSPARE\n".join(columns)


def main():
    of_class = order_class(sys.argv[1])
    for program, seeds in (("fuzz_csv_orders", order_files), ("fuzz_map_file", maps)):
        folder = pathlib.Path(sys.argv[2]) / program
        folder.mkdir(parents=True, exist_ok=True)
        for name, text in seeds(of_class):
            (folder / name).write_bytes(text if isinstance(text, bytes) else text.encode("latin-1"))


main()
