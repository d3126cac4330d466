"""Ship notices: a hundred cartons of five lines a shipment, compiled by the program, against a bare program that reads the
same rows and writes the same bytes."""

import filecmp
import json
import os
import random
import shutil
import sqlite3

from yardsticks import BENCH, PROGRAM, Bench, Failure, run

NOW = "2006-03-08T10:15:00"
PACKS, LINES = 100, 5         # of a shipment, of a pack
PRODUCTS, STORES = 25, 10     # of an order
COLUMNS = ("SUPPLIERNO CUSTOMERCODE SHIPNOTENO SHIPNOTEDATE SHIPNOTETIME SHIPNOTETYPECODE SHIPNOTESTATUS COMPANYCODE "
           "PARTNERSUPPLIERNO CONSIGNMENTNOTENO BOOKINGNO SCHEDULEDATE DELIVERYDATE SHIPTOCODE SHIPPACKCODE "
           "SHIPMENTWEIGHT SHIPMENTVOLUME ORDERNO ORDERDATE PACKERID ORDERSTATUSCODE BUYSTORECODE DELREFERENCE "
           "ORDERPACKCODE INVOICENO CONTAINERNO PACKAGETYPECODE PACKWEIGHT PACKLENGTH PACKWIDTH PACKHEIGHT "
           "INHOUSEPRODNO APN INNERSPERPACK UNITSPERPACK QUANTITYSHIPPED COST LINEREF").split()
MASTERS = {
    "Partner": [{"PartnerId": "MGB", "Name": "MGB Stores", "LastASNNo": 1000}],
    "Vendor": [{"VendorId": "ACME", "Name": "Acme Apparel"}],
    "EDIDoc": [{"EDIDocId": 1, "ProgId": "PartnerKit.clsMGB856csv", "DocumentCode": "856", "PartnerId": "MGB",
                "VendorId": "ACME", "CompanyEDIAddr": "ACMETOYS", "PartnerEDIAddr": "MGBSTORES", "MapFile": "asn.map"}],
    "PackType": [{"PackTypeId": "CARTON", "ShipPackCode": "CTN30", "PackageTypeCode": "P02", "Length": 40.5,
                  "Width": 30, "Height": 20}],
}


def product_number(product):
    return f"93{product:011d}"


class Cartons:
    """The rows of so many shipments, an order each, by table."""

    def __init__(self, shipments):
        self.chance = random.Random("notices")
        self.rows = {}
        for store in range(STORES):
            self.add("PartnerLocn", VendorId="ACME", PartnerLocnNo=f"{store + 1:04d}", Name=f"Store {store + 1}")
        for product in range(PRODUCTS * 8):
            self.add("Product", ProductNo=product_number(product), PartnerId="MGB", InHouseProdNo=f"TOY{product:05d}")
        self.products = [product_number(product) for product in range(PRODUCTS * 8)]
        for shipment in range(1, shipments + 1):
            self.add_shipment(shipment)

    def add(self, kind, **members):
        rows = self.rows.setdefault(kind, (list(members), []))[1]
        rows.append(tuple(members.values()))
        return len(rows)

    def add_shipment(self, shipment):
        self.add("Shipment", Id=shipment, Status=3, ConNoteNo=f"CN{shipment:06d}", BookingNo=f"BK{shipment:06d}",
                 ScheduleDate="2006-03-09", DeliveryDate="2006-03-20", Weight=123.25, Volume=1.5)
        order = self.add("Order", OrderId=shipment, VendorId="ACME", PartnerId="MGB", PONo=f"45{shipment:08d}",
                         PODate="2006-03-01", CompanyCode="CC8", PartnerSupplierNo="77001")
        job = self.add("Job", JobId=shipment, OrderId=order, PackerId=f"PK{shipment % 7}")
        products = self.chance.sample(self.products, PRODUCTS)
        first = (order - 1) * PRODUCTS
        for place, product in enumerate(products, 1):
            self.add("OrderLine", LineId=first + place, OrderId=order, LineNo=str(place), ProductNo=product,
                     Quantity=240, Cost=self.chance.randrange(400, 8000) / 100)
        for store in range(1, STORES + 1):
            self.add_slip(shipment, order, job, store, products)

    def add_slip(self, shipment, order, job, store, products):
        slip = (order - 1) * STORES + store
        code = f"{store:04d}"
        self.add("OrderLocn", LocnId=slip, OrderId=order, VendorId="ACME", BuyingLocn=code)
        self.add("PSlip", Id=slip, JobId=job, OrderLocnId=slip, StoreCode=code)
        for place, product in enumerate(products, 1):
            line = (slip - 1) * PRODUCTS + place
            self.add("OrderLocnLine", Id=line, OrderId=order, LineId=(order - 1) * PRODUCTS + place, LocnId=slip,
                     ProductNo=product, BuyingLocn=code, Quantity=24, PackedQty=24)
            self.add("PSlipLine", LineId=line, PSlipId=slip, OrderLocnLineId=line, APN=product, LineRef=str(place),
                     OrderQty=24, PackedQty=24)
        for number in range(PACKS // STORES):
            pack = (slip - 1) * (PACKS // STORES) + number + 1
            self.add("Pack", Id=pack, PSlipId=slip, OrderId=order, ShipmentId=shipment, PackTypeId="CARTON", Status=4,
                     VendorId="ACME", ShipToCode="0900", BuyStoreCode=code, InvoiceNo=f"INV{shipment}",
                     SSCC=f"00393{pack:015d}", CartonCount=1, Weight=7.25)
            for place in range(LINES):
                at = (number * LINES + place) % PRODUCTS
                self.add("PackLine", PackId=pack, PSlipLineId=(slip - 1) * PRODUCTS + at + 1, APN=products[at],
                         Quantity=12)

    def store(self, path):
        connection = sqlite3.connect(path)
        with connection:
            for kind, (names, rows) in self.rows.items():
                marks = ",".join("?" * len(names))
                connection.executemany(f"INSERT INTO tb{kind}({','.join(names)}) VALUES({marks})", rows)
        connection.execute("PRAGMA wal_checkpoint(TRUNCATE)")
        connection.close()


class NoticesBench(Bench):
    def prepare(self):
        run(PROGRAM, "new", self.workspace)
        MASTERS["EDIDoc"][0]["MapFolder"] = f"{self.workspace / 'maps'}/"
        (self.folder / "records.json").write_text(json.dumps(MASTERS))
        run(PROGRAM, "--workspace", self.workspace, "data", "load", self.folder / "records.json")
        (self.workspace / "maps" / "asn.map").write_text("\n".join(COLUMNS))
        shutil.copy(self.store, self.folder / "empty.db")
        self.output = self.workspace / "outbox" / "asn.csv"
        self.wanted = self.folder / "wanted.csv"
        many = self.sizes["shipments"]
        for shipments in (many, many // 10):
            shutil.copy(self.folder / "empty.db", self.folder / f"{shipments}.db")
            Cartons(shipments).store(self.folder / f"{shipments}.db")

    def packed(self, shipments):
        """The workspace with so many shipments that wait."""
        for left in [*self.workspace.glob("partnerkit.db*"), *self.workspace.glob("outbox/*")]:
            left.unlink()
        shutil.copy(self.folder / f"{shipments}.db", self.store)
        os.sync()

    def compile(self, shipments):
        self.packed(shipments)
        _, elapsed, busy, memory = run(PROGRAM, "--workspace", self.workspace, "--now", NOW, "process", "1", self.output)
        self.memory = memory
        if self.output.read_bytes().count(b"\n") != shipments * PACKS * LINES:
            raise Failure("not every pack was compiled")
        if shipments == self.sizes["shipments"] and not self.wanted.exists():
            shutil.copy(self.output, self.wanted)
        return busy if self.cpu else elapsed

    def compile_each(self, shipments):
        return self.compile(shipments) / (shipments * PACKS)

    def bare(self, form):
        self.packed(self.sizes["shipments"])
        out, _, _, _ = run(BENCH / "bare_notice", form, self.store, self.output)
        if not filecmp.cmp(self.output, self.wanted, shallow=False):
            raise Failure("the bare program has written other bytes")
        return json.loads(out)["busy" if self.cpu else "seconds"]

    def measure(self):
        many = self.sizes["shipments"]
        few = many // 10
        self.print_line("clsMGB856csv", "ours", "bare", None)
        self.compare(f"{many} notices : the same bytes", lambda: self.compile(many), lambda: self.bare("read"), 2.5)
        self.compare("  and their stamps", lambda: self.compile(many), lambda: self.bare("stamp"), 2.5)
        self.compare(f"a pack of {many} shipments : of {few}", lambda: self.compile_each(many),
                     lambda: self.compile_each(few), 1.15, "us")
