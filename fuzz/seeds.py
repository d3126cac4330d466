"""Writes the inputs that fuzzing begins with: seeds.py FOLDER for the programs that read no class, seeds.py FOLDER CLASS
for a class. Order files and maps of odd shapes, made from the samples, the data of barcodes, and labels' packets, made
from the classes' layouts."""

import csv
import io
import pathlib
import re
import sys

from order_samples import order_class
from x12_samples import x12_class, x12_classes

# Where an order stands to one of its number: as it is, doubled, changed, cancelled, rejected, a blanket order.
SEQUELS = [{}, {"POPURPOSECODE": "07"}, {"POPURPOSECODE": "05"}, {"POPURPOSECODE": "01"}, {"POPURPOSECODE": "1"},
           {"POPURPOSECODE": "4"}, {"POPURPOSECODE": "4", "POVERSIONNO": "2"}, {"POTYPECODE": "231"},
           {"POTYPECODE": "231", "RESPONSETYPECODE": "27"}, {"POTYPECODE": "230"},
           {"POTYPECODE": "230", "POPURPOSECODE": "1"}, {"POTYPECODE": "BL"}, {"POTYPECODE": "BK"},
           {"STOREZONE": ""}, {"STOREZONE": "CO77"}, {"SHIPTOLOCPARTNERNO": "9999"}, {"PARTNEREDIADDR": "OTHEREDI"},
           {"INCOMINGPRODUCTNO": ""}]
# Purpose and type, likewise.
X12_SEQUELS = [("00", "SA"), ("07", "SA"), ("01", "SA"), ("05", "SA"), ("00", "BL"), ("00", "RL"), ("00", "BK")]
BARCODES = ["", "1234", "~20100393123450000012344", "\x1d4210363000\x1d901234", "~20110A-1~20121b", "12345-\x02", "1e10",
            "A1 B2", "-1.5\x01", "9312345678907", "0012345678905", "212222", "FNC1", "CODEA", "\x1c\x1e\x7f\xe9~20"]
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


def x12_files(of_class):
    segments, end = of_class.segments, of_class.end

    def written(changed, ends=end):
        return "".join(segment + ends for segment in changed)

    def with_each(tag, *others):
        """The segments of that tag followed by others."""
        return [each for segment in segments for each in (segment, *(others if segment.startswith(tag) else ()))]

    yield "orders", of_class.text
    yield "line_feeds", written(segments, end.replace("\r", ""))
    yield "one_line", written(segments, "~")
    yield "apostrophes", written(segments, "'\r\n")
    yield "apostrophes_one_line", written(segments, "'")
    yield "blank_lines", written(segments, "~\r\n \r\n~\r\n")
    yield "twice_no_end", (of_class.text + of_class.text).rstrip()
    yield "cut", of_class.text[:len(of_class.text) * 2 // 3]
    yield "cut_within_another", written(segments[:8]) + of_class.text
    yield "no_trailers", written(segment for segment in segments if not segment.startswith(("SE", "GE", "IEA")))
    yield "no_totals", written(segment for segment in segments if not segment.startswith("CTT"))
    yield "stores_twice", written(each for segment in segments
                                  for each in [segment] * (1 + segment.startswith("SDQ")))
    yield "no_stores", written(segment for segment in segments if not segment.startswith("SDQ"))
    yield "overlong_element", of_class.text.replace("*92*", "*" + "9" * 33000 + "*", 1)
    yield "changes", of_class.text.replace("GS*PO", "GS*PC").replace("ST*850", "ST*860")
    yield "two_groups", written(with_each("GE", *segments[1:-1]))
    yield "other_group", written(segments[:1]) + of_class.text.split("\n", 1)[1].replace("GS*PO", "GS*IN")
    yield "others", of_class.text.replace(of_class.document["PartnerEDIAddr"], "OTHEREDI") + of_class.text
    yield "marked", written(segment + "*FA DONE*" * segment.startswith("GS") for segment in segments)
    for number, (purpose, kind) in enumerate(X12_SEQUELS):
        sequel = of_class.text
        for tag in ("BEG", "BCH"):
            sequel = sequel.replace(f"{tag}*00*SA", f"{tag}*{purpose}*{kind}")
        yield f"sequel{number}", of_class.text + sequel.replace("ST*850*0", f"ST*850*{number}")


def segment_files(classes):
    for of_class in classes:
        for name, text in x12_files(of_class):
            if name in ("orders", "one_line", "apostrophes", "blank_lines"):
                yield f"{of_class.name}_{name}", text


def label_packets():
    """A format, a zero byte, a batch."""
    batch_head = "{B,10,N,1|E,1,0,1,1,0,1|"
    for layout in sorted(pathlib.Path("../src/labels").glob("*_layout.h")):
        records = re.findall(r'R"\((.*?)\)"', layout.read_text())
        header = next((record for record in records if record.startswith(",A,R,E,")), "")
        fields = [record for record in records if record[:2] in ("T,", "C,", "B,", "L,", "G,")]
        values = [re.sub("`(.*?)`", r"\1", record) for record in records if record[:1].isdigit()]
        if not fields:
            continue
        head = "{F,10" + header
        form, batch = head + "".join(fields) + "}", batch_head + "".join(values) + "}"
        name = layout.stem
        yield name, form + "\0" + batch
        yield name + "_halves", form[:len(form) // 2] + "\0" + batch[:len(batch) // 2]
        yield name + "_twice", form[:-1] + "".join(fields) + "}\0" + batch
        yield name + "_bars_and_quotes", form + "\0" + batch.replace("Name", 'Na|9,"m"|e')
        yield name + "_far", re.sub(r",(\d\d\d),", r",39\1,", form) + "\0" + batch
        yield name + "_white", form.replace(",O,L", ",w,R") + "\0" + batch
    lines = 'L,S,10,20,30,40,5,"11111111"|L,s,-1,2,3,4.5,0,|L,D,1,2,3,4,5,|G,99,555,320,0,0|X|'
    bars = "".join(f"B,{number},27,V,182,40,8,{density},152,8,L,0|" for number, density in enumerate("4689", 1))
    yield "lines_and_bars", (f'{{F,1,A,R,E,300.5,400,"X"|{lines}{bars}C,1,2,0,3,1,1,W,L,0,0,"a, b"|}}\0'
                             f'{batch_head}1,"~20100093123450000009015"|3,"~2014210363026~201900464"|}}')


def write(folder, files):
    folder.mkdir(parents=True, exist_ok=True)
    for name, text in files:
        (folder / name).write_bytes(text if isinstance(text, bytes) else text.encode("latin-1"))


def main():
    folder = pathlib.Path(sys.argv[1])
    if len(sys.argv) == 2:
        write(folder / "fuzz_segments", segment_files(x12_classes()))
        write(folder / "fuzz_bar_pattern", ((str(number), data) for number, data in enumerate(BARCODES)))
        write(folder / "fuzz_label_packets", label_packets())
    elif "ansix12" in sys.argv[2]:
        write(folder / "fuzz_x12_orders", x12_files(x12_class(sys.argv[2])))
    else:
        write(folder / "fuzz_csv_orders", order_files(order_class(sys.argv[2])))
        write(folder / "fuzz_map_file", maps(order_class(sys.argv[2])))


main()
