"""The CSV order classes as samples/ shows them: the columns of each, a line as its partner sends it, and the records
that such a line is checked with. What kills, feeds or times the importers makes its orders from these."""

import csv
import json
import pathlib

SAMPLES = pathlib.Path(__file__).resolve().parent.parent / "samples"
WAREHOUSE = "0900"
GST = 0.1


class OrderClass:
    def __init__(self, folder):
        self.columns = (folder / f"{folder.name}.map").read_text().splitlines()
        self.records = json.loads((folder / "records.json").read_text())
        self.document = self.records["EDIDoc"][0]
        self.prog_id = self.document["ProgId"]
        self.name = self.prog_id.partition(".")[2]
        self.partner = self.document["PartnerId"]
        with open(folder / "orders.csv", newline="") as file:
            self.lines = [dict(zip(self.columns, row)) for row in csv.reader(file)]
        self.typical = self.lines[0]
        self.inners = [inner for inner in self.records.get("ProductInner", [])
                       if inner["ProductNo"] == self.records["Product"][0]["ProductNo"]]
        self.by_gtin = any(inner["InnerEAN"] == self.typical["INCOMINGPRODUCTNO"] for inner in self.inners)
        self.quantity_column = "TRADEDQUANTITY" if "TRADEDQUANTITY" in self.columns else "ORDERQUANTITY"
        # Units in what a line counts.
        self.units = int(self.typical["CARTONSOUTER"]) if self.typical.get("PACKUOM") == "CT" else 1
        self.taxed = "UNITPRICEEXGST" in self.columns

    def ordered_as(self, product):
        return self.inners[0]["InnerEAN"][0] + product if self.by_gtin else product

    def stored_cost(self, cost):
        return round(cost * (1 + GST), 4) if self.taxed else cost

    def ship_to(self, store):
        """Where the goods for a store go, as it is stored."""
        return WAREHOUSE if self.typical["BUYINGLOCPARTNERNO"] and self.typical["SHIPTOLOCPARTNERNO"] != "DTS" else store

    def line(self, product, store, quantity, cost, retail, sku, **others):
        """The fields of a line, by column; those that the class doesn't have are left out."""
        direct = self.typical["SHIPTOLOCPARTNERNO"] == "DTS"
        fields = {
            "INCOMINGPRODUCTNO": self.ordered_as(product), self.quantity_column: quantity,
            "BUYINGLOCPARTNERNO": store if self.typical["BUYINGLOCPARTNERNO"] else "",
            "SHIPTOLOCPARTNERNO": "DTS" if direct else self.ship_to(store), "SKUPRODUCTKEYCODE": sku,
            "UNITPRICE": f"{cost:.2f}", "RETAILUNITPRICE": f"{retail:.2f}", "UNITPRICEEXGST": f"{cost:.2f}",
            "UNITPRICEINCGST": f"{cost * (1 + GST):.4f}", "GSTAMOUNT": f"{cost * GST:.4f}", **others}
        return {column: str(fields.get(column, value)) for column, value in self.typical.items()}

    def masters(self, products, stores, companies):
        """Products, each (number, cost, retail, sku), and locations for these companies, like those of the sample."""
        def like(kind, **changes):
            return {**self.records[kind][0], **changes}

        def price(company, number, cost, retail, sku):
            tax = {"GSTAmount": round(cost * GST, 4)} if self.taxed else {}
            return like("ProductPrice", VendorId=company, ProductNo=number, Cost=cost, Retail=retail, SKU=sku, **tax)

        indirect = any("DeliverToCode" in store for store in self.records["PartnerLocn"])
        through = {"DeliverToCode": WAREHOUSE} if indirect else {}
        return {
            "PartnerLocn": [{"VendorId": company, "PartnerLocnNo": store, "Name": f"Store {store}", **through}
                            for company in companies for store in [*stores, WAREHOUSE]],
            "Product": [like("Product", ProductNo=number, InHouseProdNo=f"STYLE-{number}") for number, *_ in products],
            "ProductPrice": [price(company, *product) for company in companies for product in products],
            "ProductInner": [{**inner, "ProductNo": number, "InnerEAN": inner["InnerEAN"][0] + number}
                             for number, *_ in products for inner in self.inners],
            "PackType": self.records.get("PackType", []),
        }


def order_classes():
    """Every class, in the order of their documents."""
    classes = [OrderClass(path.parent) for path in SAMPLES.glob("*/orders.csv")]
    return sorted(classes, key=lambda each: each.document["EDIDocId"])


def order_class(prog_id):
    for each in order_classes():
        if prog_id in (each.prog_id, each.name):
            return each
    raise SystemExit(f"no class {prog_id} but {', '.join(each.name for each in order_classes())}")
