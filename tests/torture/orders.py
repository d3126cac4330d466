"""The supplier, the partner's order file, and what has to come of each order in it."""

import json
import random
from dataclasses import dataclass, field

PRODUCTS = [f"93123456{number:05}" for number in range(10001, 10009)]
STORES = ["0052", "0061", "0117", "0130", "0204"]
WAREHOUSE = "0900"
COSTS = {product: 10.5 + index for index, product in enumerate(PRODUCTS)}
RETAILS = {product: 19.95 + index for index, product in enumerate(PRODUCTS)}

MAP = ["INTCONTROLNO", "GRPCONTROLNO", "TRNCONTROLNO", "PARTNEREDIADDR", "COMPANYEDIADDR", "POPURPOSECODE",
       "POTYPECODE", "PONUMBER", "PODATE", "SUPPLIERNO", "CUSTCAT", "DEPTNO", "NOTBEFORE", "CANCAFTER", "ADDATE",
       "STOREZONE", "BUYINGLOCPARTNERNO", "SHIPTOLOCPARTNERNO", "SEQUENTIALLINENO", "PRODUCTQUALIFIER",
       "INCOMINGPRODUCTNO", "UNITMEASURECODE", "UNITPRICECODE", "UNITPRICE", "ORDERQUANTITY", "SKUPRODUCTKEYCODE",
       "RETAILUNITPRICE", "ALLOCATEQUANTITY", "CUSTOMERREF", "CUSTOMERNO", "STYLE", "COLOUR", "SIZE", "DESCRIPTION",
       "WEIGHT", "VOLUME", "BIN", "LINEREF"]

# What becomes of an order.
POSTED = "posted"        # in the store once, its lines in the backup
KEPT = "kept"            # in the file, byte for byte
DROPPED = "dropped"      # turned away for good: in neither

# One of each kind among this many orders; every other one is plain.
CYCLE = 25
KINDS = {3: ("unknown product", KEPT), 5: ("stored already", DROPPED), 7: ("other cost", KEPT),
         9: ("unknown store", KEPT), 11: ("line twice", KEPT), 13: ("foreign", KEPT),
         16: ("cancels nothing", DROPPED), 18: ("replaces", POSTED), 20: ("cancels", DROPPED),
         22: ("sent twice", POSTED), 24: ("half stored", POSTED)}


@dataclass
class Order:
    number: str
    kind: str
    fate: str
    controls: tuple
    lines: list = field(default_factory=list)   # (product, store, quantity, allocated)
    texts: list = field(default_factory=list)   # the lines as they stand in the file
    stored: bool = False                        # an older order of this number is in the store


@dataclass
class OrderFile:
    orders: list
    options: str = ""

    def content(self):
        return b"".join(text for order in self.orders for text in order.texts)

    def kept(self):
        return b"".join(text for order in self.orders if order.fate == KEPT for text in order.texts)

    def posted(self):
        return [order for order in self.orders if order.fate == POSTED]

    def owners(self):
        """The order of each line, as the backup holds it."""
        return {whole(text): order for order in self.orders for text in order.texts}


def whole(text):
    return text if text.endswith(b"\n") else text + b"\r\n"


def make_file(count, products, stores, *, plain=False, first_number=4500000000, seed=1, options=""):
    """`plain`: orders that post only, so that the file ends empty."""
    rng = random.Random(seed)
    orders = []
    for index in range(count):
        kind, fate = ("plain", POSTED) if plain else KINDS.get(index % CYCLE, ("plain", POSTED))
        order = Order(str(first_number + index), kind, fate, (f"{first_number % 1000000:09}", "481", f"{index:04}"))
        order.stored = kind in ("stored already", "replaces", "cancels", "half stored")
        fill(order, products, stores, rng)
        orders.append(order)
    # The partner's last line has no end.
    orders[-1].texts[-1] = orders[-1].texts[-1].rstrip(b"\r\n")
    return OrderFile(orders, options)


def fill(order, products, stores, rng):
    for sequence, product in enumerate(PRODUCTS[:products], 1):
        for store in STORES[:stores]:
            order.lines.append((product, store, rng.randint(1, 900), rng.randint(0, 9)))
            order.texts.append(line(order, sequence, len(order.lines)))
    if order.kind == "line twice":
        order.texts.append(line(order, products, len(order.lines)).replace(b"\r\n", b"R\r\n"))
    if order.kind == "sent twice":
        order.texts += [text.replace(b"\r\n", b"R\r\n") for text in order.texts]


def line(order, sequence, reference):
    product, store, quantity, allocated = order.lines[-1]
    cost = COSTS[product] + (1 if order.kind == "other cost" else 0)
    address = "OTHEREDI" if order.kind == "foreign" else "MGBEDI"
    purpose = {"replaces": "07", "cancels": "01", "cancels nothing": "01"}.get(order.kind, "00")
    if order.kind == "unknown product":
        product = "9399999999999"
    if order.kind == "unknown store":
        store = "9999"
    fields = dict.fromkeys(MAP, "")
    fields.update(zip(MAP, [*order.controls, address, "ACMEEDI", purpose, "SA", order.number, "20060306", "104455",
                            "REG", "310", "20060320", "20060403", "", "Z1"]))
    fields.update(BUYINGLOCPARTNERNO=store, SHIPTOLOCPARTNERNO=WAREHOUSE, SEQUENTIALLINENO=str(sequence),
                  PRODUCTQUALIFIER="EN", INCOMINGPRODUCTNO=product, UNITMEASURECODE="EA", UNITPRICECODE="WE",
                  UNITPRICE=f"{cost:.2f}", ORDERQUANTITY=str(quantity), SKUPRODUCTKEYCODE="SKU" + product[-4:],
                  RETAILUNITPRICE=f"{RETAILS.get(product, 1):.2f}", ALLOCATEQUANTITY=str(allocated),
                  LINEREF=str(reference))
    return ",".join(fields.values()).encode() + b"\r\n"


def records(file, prog_id, *, backup="backup/po.csv", documents=1):
    """The supplier's records, with the older orders that the file meets in the store."""
    data = {
        "System": {"UserId": "torture"},
        "Partner": [{"PartnerId": "MGB", "Name": "MGB Stores"}],
        "Vendor": [], "EDIDoc": [], "PartnerLocn": [],
        "Product": [{"ProductNo": product, "PartnerId": "MGB", "UOM": "EA", "Symbology": "EN"} for product in PRODUCTS],
        "ProductPrice": [], "Order": [], "OrderLine": [], "OrderLocn": [], "OrderLocnLine": [],
    }
    for document in range(1, documents + 1):
        vendor = f"ACME{document}"
        data["Vendor"].append({"VendorId": vendor, "Name": "Acme Apparel", "POBackupFile": backup})
        data["EDIDoc"].append({"EDIDocId": document, "ProgId": prog_id, "DocumentCode": "850", "PartnerId": "MGB",
                               "VendorId": vendor, "CompanyEDIAddr": "ACMEEDI", "PartnerEDIAddr": "MGBEDI",
                               "MapFolder": "maps/", "MapFile": "orders.map", "ValidateProduct": True,
                               "ValidateCost": True, "ValidateRetail": True, "Options": file.options})
        data["PartnerLocn"] += [{"VendorId": vendor, "PartnerLocnNo": store} for store in [*STORES, WAREHOUSE]]
        data["ProductPrice"] += [{"VendorId": vendor, "ProductNo": product, "Cost": COSTS[product],
                                  "Retail": RETAILS[product], "SKU": "SKU" + product[-4:]} for product in PRODUCTS]
    for order in file.orders:
        if order.stored:
            add_older(data, order)
    return json.dumps(data)


def add_older(data, order):
    """Half stored: this very order, as a program leaves it that dies under a store without transactions."""
    key = len(data["Order"]) + 1
    half = order.kind == "half stored"
    controls = order.controls if half else ("000000007", "7", "0007")
    data["Order"].append({"OrderId": key, "VendorId": "ACME1", "PartnerId": "MGB", "PONo": order.number,
                          "InterchangeCtl": controls[0], "GroupCtl": controls[1], "TransactionCtl": controls[2],
                          "Status": 9 if half else 0})
    data["OrderLine"].append({"LineId": key, "OrderId": key, "ProductNo": PRODUCTS[-1], "Quantity": 7, "Cost": 1.5})
    if half:
        return
    data["OrderLocn"].append({"LocnId": key, "OrderId": key, "VendorId": "ACME1", "BuyingLocn": STORES[-1]})
    data["OrderLocnLine"].append({"Id": key, "OrderId": key, "LineId": key, "LocnId": key,
                                  "ProductNo": PRODUCTS[-1], "BuyingLocn": STORES[-1], "Quantity": 7, "AllocateQty": 7})


def expected_store(file):
    """The lines, locations and location lines of every order that has to be in the store, by number."""
    store = {}
    for order in file.orders:
        if order.fate == POSTED:
            quantities = {}
            for product, _, quantity, _ in order.lines:
                quantities[product] = quantities.get(product, 0) + quantity
            store[order.number] = (
                sorted((product, float(quantity), COSTS[product]) for product, quantity in quantities.items()),
                sorted({(store_no, WAREHOUSE) for _, store_no, _, _ in order.lines}),
                sorted((store_no, product, float(quantity), float(allocated))
                       for product, store_no, quantity, allocated in order.lines))
        elif order.kind == "stored already":
            store[order.number] = ([(PRODUCTS[-1], 7.0, 1.5)], [(STORES[-1], "")],
                                   [(STORES[-1], PRODUCTS[-1], 7.0, 7.0)])
    return store
