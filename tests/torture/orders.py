"""The supplier, the partner's order file, and what has to come of each order in it."""

import json
import random
from dataclasses import dataclass, field

import kinds
import verdict
from kinds import FAULTY, KEPT, POSTED
from file_rules import rules_of
from order_samples import WAREHOUSE

PRODUCTS = [f"93123456{number:05}" for number in range(10001, 10009)]
STORES = ["0052", "0061", "0117", "0130", "0204"]
COSTS = {product: 10.5 + index for index, product in enumerate(PRODUCTS)}
RETAILS = {product: 19.95 + index for index, product in enumerate(PRODUCTS)}
OTHER_COST = 99.0
BLANK = b"\r\n"


@dataclass
class Order:
    number: str
    kind: kinds.Kind
    controls: tuple
    lines: list = field(default_factory=list)   # (product, store, ship-to, quantity, allocated, cost), as stored
    texts: list = field(default_factory=list)   # the lines as they stand in the file

    @property
    def fate(self):
        return self.kind.fate

    def segments(self):
        """What of it is found in the file, however its lines end."""
        return [text.rstrip(b"\r\n") for text in self.texts]

    def is_stored(self):
        return self.fate in (POSTED, FAULTY)


class OrderFile:
    def __init__(self, trade, orders, options=""):
        self.trade = trade
        self.orders = orders
        self.options = options

    def content(self):
        return b"".join(text for text, _ in self.pieces())

    def kept(self, besides=()):
        """What stays, `besides` orders that have these numbers."""
        return b"".join(text for text, stays in self.pieces(besides) if stays)

    def pieces(self, besides=()):
        """Every line, and whether it stays in the file."""
        for order in self.orders:
            for number, text in enumerate(order.texts):
                if number == 1 and order.kind is kinds.BLANK_LINE:
                    yield BLANK, not self.trade.drops_blank_lines
                yield text, order.fate == KEPT or order.number in besides

    @staticmethod
    def commits_of_listing():
        return 0

    def followed_by(self, other):
        """The same file with the other behind it."""
        self.orders[-1].texts[-1] = verdict.whole(self.orders[-1].texts[-1])
        return OrderFile(self.trade, self.orders + other.orders)

    def posted(self):
        return [order for order in self.orders if order.is_stored()]

    def owners(self):
        """The order of each line, as the backup holds it."""
        return {verdict.whole(text): order for order in self.orders for text in order.texts}

    def expected_store(self):
        """Status, lines, locations and location lines of every order that has to be in the store, by number."""
        store = {}
        for order in self.orders:
            if order.is_stored():
                lines = summed(((product, cost), quantity) for product, _, _, quantity, _, cost in order.lines)
                parts = summed(((place, product), quantity, allocated)
                               for product, place, _, quantity, allocated, _ in order.lines)
                store[order.number] = (
                    9 if order.fate == FAULTY else 0,
                    sorted((product, quantity, cost) for (product, cost), (quantity,) in lines.items()),
                    sorted({(place, ship_to) for _, place, ship_to, *_ in order.lines}),
                    sorted((*key, *quantities) for key, quantities in parts.items()))
            elif order.kind.outlives:
                store[order.number] = (0, [(PRODUCTS[-1], 7.0, 1.5)], [(STORES[-1], "")],
                                       [(STORES[-1], PRODUCTS[-1], 7.0, 7.0)])
        return store


class Trade:
    """One class, and the supplier who gets its orders."""

    verdict = verdict
    backs_up = True

    def __init__(self, order_class, its_kinds=None):
        self.order_class = order_class
        self.kinds = its_kinds or kinds.KINDS[order_class.name]
        self.cycle = 2 * len(self.kinds) + 1
        rules = rules_of(order_class.name)
        self.drops_blank_lines = "drops-blank-lines" in rules
        # So an order that a killed run has posted stays in the file: the next run turns it away as stored already.
        self.keeps_turned_away = "keeps-turned-away" in rules
        self.answers_orders = any(kind.fate == FAULTY for kind in self.kinds)

    def make_file(self, count=None, products=2, stores=2, *, plain=False, first_number=45000000, seed=1, options=""):
        """`count`: as many as show every kind. `plain`: orders that post only, so that the file ends empty."""
        rng = random.Random(seed)
        orders = []
        for index in range(count or self.cycle):
            place, other = divmod(index % self.cycle, 2)
            kind = self.kinds[place] if other and not plain else kinds.PLAIN
            group = "481" if self.order_class.typical["GRPCONTROLNO"] else ""
            order = Order("", kind, (f"{first_number:09}", group, f"{index:04}"))
            again = kind.name == "sent anew"
            self.fill(order, str(first_number + index - again), products, stores, rng)
            orders.append(order)
        # The partner's last line has no end.
        orders[-1].texts[-1] = orders[-1].texts[-1].rstrip(b"\r\n")
        return OrderFile(self, orders, options)

    def fill(self, order, number, products, stores, rng):
        for sequence, product in enumerate(PRODUCTS[:products], 1):
            for store in STORES[:stores]:
                self.add_line(order, number, sequence, product, store, rng.randint(1, 900), rng.randint(0, 9))
        if order.kind.name.endswith("line twice"):
            self.add_line(order, number, products, product, store, 5, 3)
        if order.kind is kinds.SENT_TWICE:
            order.texts += [text.replace(b"\r\n", b",again\r\n") for text in order.texts]

    def add_line(self, order, number, sequence, product, store, quantity, allocated):
        of_class = self.order_class
        changes = order.kind.changes
        cost = OTHER_COST if order.kind.name == "other cost" else COSTS[product]
        retail, sku = RETAILS[product], "SKU" + product[-4:]
        if order.kind.name == "unknown product":
            product = product.replace("93", "99", 1)
        controls = dict(zip(("INTCONTROLNO", "GRPCONTROLNO", "TRNCONTROLNO"), order.controls))
        fields = of_class.line(product, store, quantity, cost, retail, sku, **{
            **controls, "PONUMBER": number, "SEQUENTIALLINENO": sequence, "ALLOCATEQUANTITY": allocated,
            "LINEREF": len(order.lines) + 1, **changes})
        order.number = kinds.number_of(of_class.name, fields)
        order.lines.append((product, store, of_class.ship_to(store), float(quantity * of_class.units), float(allocated),
                            of_class.stored_cost(cost)))
        order.texts.append(",".join(f'"{text}"' if "," in text else text for text in fields.values()).encode() + BLANK)

    def records(self, file, *, backup="backup/po.csv", documents=1):
        """The supplier's records, with the older orders that the file meets in the store."""
        of_class = self.order_class
        products = [(product, COSTS[product], RETAILS[product], "SKU" + product[-4:]) for product in PRODUCTS]
        vendors = [f"ACME{number}" for number in range(1, documents + 1)]
        data = {"System": {"UserId": "torture"}, "Partner": of_class.records["Partner"], "Vendor": [], "EDIDoc": [],
                **of_class.masters(products, STORES, vendors),
                "Order": [], "OrderLine": [], "OrderLocn": [], "OrderLocnLine": [], "Job": []}
        for number, vendor in enumerate(vendors, 1):
            data["Vendor"].append({"VendorId": vendor, "Name": "Acme Apparel", "POBackupFile": backup})
            document = {**of_class.document, "EDIDocId": number, "VendorId": vendor, "MapFolder": "maps/",
                        "MapFile": "orders.map", "Options": file.options}
            data["EDIDoc"].append(document)
            if self.answers_orders:
                data["EDIDoc"].append({**document, "EDIDocId": documents + number, "DocumentCode": "855"})
        for order in file.orders:
            if order.kind.older:
                self.add_older(data, order)
        return json.dumps(data)

    def add_older(self, data, order):
        key = len(data["Order"]) + 1
        older = order.kind.older
        controls = order.controls if older == kinds.HALF else ("000000007", "7", "0007")
        half = older in (kinds.HALF, kinds.OTHER_HALF)
        data["Order"].append({"OrderId": key, "VendorId": "ACME1", "PartnerId": self.order_class.partner,
                              "PONo": order.number, "InterchangeCtl": controls[0], "GroupCtl": controls[1],
                              "TransactionCtl": controls[2], "Status": 9 if half else 0,
                              "TypeCode": "BL" if older == kinds.BLANKET else "SA"})
        data["OrderLine"].append({"LineId": key, "OrderId": key, "ProductNo": PRODUCTS[-1], "Quantity": 7, "Cost": 1.5})
        if older == kinds.CHANGEABLE:
            data["Order"][-1]["ChangeFlag"] = "1"
        if older in (kinds.PACKED, kinds.CHANGEABLE):
            data["Job"].append({"JobId": key, "OrderId": key})
        if half:
            return
        data["OrderLocn"].append({"LocnId": key, "OrderId": key, "VendorId": "ACME1", "BuyingLocn": STORES[-1]})
        data["OrderLocnLine"].append({"Id": key, "OrderId": key, "LineId": key, "LocnId": key, "Quantity": 7,
                                      "ProductNo": PRODUCTS[-1], "BuyingLocn": STORES[-1], "AllocateQty": 7})


def summed(entries):
    """Adds up the quantities of entries that are alike in all but these, which stand behind the key."""
    sums = {}
    for key, *quantities in entries:
        sums[key] = [sum(pair) for pair in zip(sums.get(key, [0.0] * len(quantities)), quantities)]
    return sums
