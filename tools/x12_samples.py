"""The X12 order classes as samples/ shows them: the segments of each as its partner sends them, and the records that
they are checked with. What kills or feeds the importers makes its orders from these."""

import json

from order_samples import SAMPLES

# Elements of a line, by its tag: the quantity, the cost and the product's number. Its own number is the first.
LINES = {"PO1": (2, 4, 7), "POC": (3, 6, 9)}
SKU = 9          # of a PO1
RETAIL = 3       # of a CTP
LOCATION = 4     # of an N1
PER_STORES = 10  # stores that an SDQ names


def replaced(segment, elements):
    """The segment with other elements, each as long as the old one."""
    parts = segment.split("*")
    for place, text in elements.items():
        parts[place] = str(text).ljust(len(parts[place])) if parts[place].endswith(" ") else str(text)
    return "*".join(parts)


class X12Class:
    columns = ()

    def __init__(self, folder):
        self.records = json.loads((folder / "records.json").read_text())
        self.document = {**self.records["EDIDoc"][0], "AckFolder": "outbox/"}
        self.prog_id = self.document["ProgId"]
        self.name = self.prog_id.partition(".")[2]
        self.partner = self.document["PartnerId"]
        self.text = (folder / "orders.x12").read_text()
        self.segments = [line.rstrip("~") for line in self.text.splitlines()]
        self.end = "\r\n" if "~" not in self.text else "~\r\n"
        self.isa, self.gs = self.segments[:2]
        # The first transaction of each set is what others are made from.
        self.typical = {}
        for at, segment in enumerate(self.segments):
            if segment.startswith("ST*"):
                last = next(place for place in range(at, len(self.segments)) if self.segments[place].startswith("SE*"))
                self.typical.setdefault(segment.split("*")[1], self.segments[at + 1:last])
        self.n1 = self._first("N1*").split("*")[LOCATION]
        self.warehouse = self.records["PartnerLocn"][-1]["PartnerLocnNo"] if self.n1 == "DTS" else self.n1

    def _first(self, tag, kind="850"):
        return next(segment for segment in self.typical[kind] if segment.startswith(tag))

    def heading(self, number, *, kind="850", purpose="00", type_code="SA", release="", location=None):
        """From the beginning to the N1, which is left out where `location` is empty."""
        elements = {1: purpose, 2: type_code, 3: number, 4: release}
        for segment in self.typical[kind]:
            if segment.startswith(("BEG*", "BCH*")):
                yield replaced(segment, elements)
            elif segment.startswith("N1*"):
                if location != "":
                    yield replaced(segment, {} if location is None else {LOCATION: location})
                return
            else:
                yield segment

    def line(self, sequence, product, stores, cost, retail, sku, *, kind="850", whole=False):
        """A line and what follows it; `stores` are pairs of a store and its quantity. `whole`: without them."""
        body = self.typical[kind]
        first = next(place for place, segment in enumerate(body) if segment[:3] in LINES)
        tag = body[first][:3]
        quantity, price, number = LINES[tag]
        elements = {1: sequence, quantity: sum(count for _, count in stores), price: f"{cost:.2f}", number: product}
        if tag == "PO1" and body[first].count("*") >= SKU:
            elements[SKU] = sku
        yield replaced(body[first], elements)
        for segment in body[first + 1:]:
            if segment.startswith("SDQ*"):
                break
            yield replaced(segment, {RETAIL: f"{retail:.2f}"} if segment.startswith("CTP*") else {})
        unit = self._first("SDQ*", kind).split("*")[1]
        for at in range(0, 0 if whole else len(stores), PER_STORES):
            yield "*".join(["SDQ", unit, "92", *(str(each) for pair in stores[at:at + PER_STORES] for each in pair)])

    def ship_to(self, store, location=None):
        """Where the goods for a store go, as it is stored."""
        location = self.n1 if location is None else location
        return store if location in ("", "DTS") else location

    def masters(self, products, stores, companies):
        """Products, each (number, cost, retail, sku), and locations for these companies, like those of the sample."""
        def like(kind, **changes):
            return {**self.records[kind][0], **changes}

        return {
            "PartnerLocn": [{"VendorId": company, "PartnerLocnNo": store, "Name": f"Store {store}"}
                            for company in companies for store in [*stores, self.warehouse]],
            "Product": [like("Product", ProductNo=number, InHouseProdNo=f"STYLE-{number}") for number, *_ in products],
            "ProductPrice": [like("ProductPrice", VendorId=company, ProductNo=number, Cost=cost, Retail=retail, SKU=sku)
                             for company in companies for number, cost, retail, sku in products],
        }


def x12_class(name):
    return next(each for each in x12_classes() if name in (each.prog_id, each.name))


def x12_classes():
    """Every class, in the order of their documents."""
    classes = [X12Class(path.parent) for path in SAMPLES.glob("*/orders.x12")]
    return sorted(classes, key=lambda each: each.document["EDIDocId"])
