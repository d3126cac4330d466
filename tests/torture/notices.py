"""Ship notices under torture: a workspace of packed cartons, and what has to hold once a plain run has followed the runs
that were struck."""

import collections
import json
import pathlib
import re
import shutil
import signal
import sqlite3
import tempfile
import threading

import told
import verdict
from workspace import must

NAME = "clsMGB856csv"
COLUMNS = ("CONTAINERNO", "SHIPNOTENO", "CONSIGNMENTNOTENO", "ORDERNO", "APN", "QUANTITYSHIPPED")
PRODUCTS = ("9312345000012", "9312345000029", "9312345000036")
EARLIER = b"what was sent last week"  # its last line has no end
INVENTORY = "outbox/stock.csv"
TOLD_OF = {"stored": "SELECT Id, OrderNo FROM tbASN", "column": 3}
WAITING = "SELECT COUNT(*) FROM tbPack WHERE Status < 8"

# shipments, orders of each, packs of each of these; where the notices go; what stands there from an earlier week.
SCENARIOS = {
    "large": {"size": (5, 3, 24), "output": "outbox/asn*.csv"},
    "small": {"size": (2, 2, 2), "output": "outbox/asn*.csv"},
    "single": {"size": (2, 2, 2), "output": "outbox/asn.csv", "earlier": True},
}


class NoticeClass:
    """Stands among the classes that the harness is asked for."""

    name = NAME


class Packed:
    """The cartons, and the text that each is to have in notices and inventory, but for the notice's number."""

    def __init__(self, size):
        self.lines = {}       # by SSCC
        self.inventory = {}
        self.orders = {}      # the SSCCs of each
        shipments, orders, packs = size
        self.records = {
            "System": {"UserId": "torture"},
            "Partner": [{"PartnerId": "MGB", "Name": "MGB Stores", "Translator": "GENTRAN", "LastASNNo": 1000,
                         "ASNExtension": "TL2Compatible", "InventoryFile": INVENTORY}],
            "Vendor": [{"VendorId": "ACME", "Name": "Acme Apparel"}],
            "EDIDoc": [{"EDIDocId": 1, "ProgId": "PartnerKit." + NAME, "DocumentCode": "856", "PartnerId": "MGB",
                        "VendorId": "ACME", "CompanyEDIAddr": "ACMETOYS", "PartnerEDIAddr": "MGBSTORES",
                        "MapFolder": "maps/", "MapFile": "asn.map"}],
            "PartnerLocn": [{"VendorId": "ACME", "PartnerLocnNo": "0900", "Name": "Altona"}],
            "Product": [{"ProductNo": product, "PartnerId": "MGB", "InHouseProdNo": "IN" + product[-3:]}
                        for product in PRODUCTS],
            **{kind: [] for kind in ("Order", "OrderLine", "OrderLocn", "OrderLocnLine", "Job", "PSlip", "PSlipLine",
                                     "Shipment", "Pack", "PackLine")}}
        for shipment in range(1, shipments + 1):
            self.records["Shipment"].append({"Id": shipment, "ConNoteNo": f"CN{shipment}", "CarrierCode": "TOLL",
                                             "DeliveryDate": "2006-03-20"})
            for _ in range(orders):
                self.add_order(shipment, packs)

    def add_order(self, shipment, packs):
        records, order = self.records, len(self.records["Order"]) + 1
        records["Order"].append({"OrderId": order, "VendorId": "ACME", "PartnerId": "MGB", "PONo": f"PO{order}"})
        records["OrderLine"].append({"LineId": order, "OrderId": order, "LineNo": str(order), "ProductNo": PRODUCTS[0],
                                     "Cost": 1.5})
        records["OrderLocn"].append({"LocnId": order, "OrderId": order, "VendorId": "ACME", "BuyingLocn": "0512"})
        records["OrderLocnLine"].append({"Id": order, "OrderId": order, "LineId": order, "LocnId": order,
                                         "ProductNo": PRODUCTS[0], "BuyingLocn": "0512", "LineRef": f"LL{order}"})
        records["Job"].append({"JobId": order, "OrderId": order, "PackerId": "PK1"})
        records["PSlip"].append({"Id": order, "JobId": order, "OrderLocnId": order})
        records["PSlipLine"].append({"LineId": order, "PSlipId": order, "OrderLocnLineId": order, "OrderQty": 9})
        for _ in range(packs):
            self.add_pack(shipment, order)

    def add_pack(self, shipment, order):
        pack = len(self.records["Pack"]) + 1
        sscc = f"00393{pack:015}"
        self.records["Pack"].append({"Id": pack, "PSlipId": order, "OrderId": order, "ShipmentId": shipment, "Status": 4,
                                     "VendorId": "ACME", "ShipToCode": "0900", "BuyStoreCode": "0512", "SSCC": sscc,
                                     "CartonCount": 1})
        self.orders.setdefault(order, []).append(sscc)
        self.lines[sscc], self.inventory[sscc] = [], []
        for product in PRODUCTS[:1 + pack % 3]:
            self.records["PackLine"].append({"PackId": pack, "PSlipLineId": order, "APN": product, "Quantity": pack})
            self.lines[sscc].append(f"{sscc},%s,CN{shipment},PO{order},{product},{pack},\r\n")
            self.inventory[sscc].append(
                f'"MGBSTORES","%09d",20060308,1015,"CN{shipment}",20060320,20060320,"0512","PO{order}","",'
                f'"IN{product[-3:]}","{product}",9,{pack},{pack},"S","","","PK1","{order}","LL{order}","TOLL"\r\n')


    def notice(self, number, packs):
        lines = "".join(line % number for sscc in packs for line in self.lines[sscc])
        return f"HEADER,MGBSTORES\r\n{lines}".encode()

    def stock(self, number, packs):
        return "".join(line % int(number) for sscc in packs for line in self.inventory[sscc]).encode()


class NoticeScenario:
    """A prepared workspace; the runs start in it."""

    def __init__(self, program, root, name, size, output, earlier=False):
        self.name = name
        self.output = output
        self.earlier = EARLIER if earlier else b""
        self.packed = Packed(size)
        self.prepared = pathlib.Path(root) / f"prepared-{name}"
        must(program.run(root, "new", str(self.prepared)))
        (self.prepared / "records.json").write_text(json.dumps(self.packed.records))
        must(program.run(self.prepared, "data", "load", "records.json"))
        (self.prepared / "records.json").unlink()
        (self.prepared / "maps" / "asn.map").write_text("\n".join(COLUMNS))
        if earlier:
            (self.prepared / output).write_bytes(EARLIER)
            (self.prepared / INVENTORY).write_bytes(EARLIER)

    def copy(self, root):
        folder = pathlib.Path(tempfile.mkdtemp(prefix=f"{self.name}-", dir=root))
        shutil.copytree(self.prepared, folder, dirs_exist_ok=True)
        return folder


class NoticeTrade:
    """What the harness asks of a class's trade."""

    backs_up = True

    def __init__(self, _):
        self.verdict = self

    @staticmethod
    def struck_violations(scenario, folder, struck):
        return verdict.struck_violations(scenario, folder, struck) + reader_violations(scenario, folder)

    @staticmethod
    def violations(scenario, folder, program, last, *, earlier=()):
        """`last` is the plain run, `earlier` are the runs before it."""
        found = verdict.run_violations(last, ("No Packs found to process.",))
        if last.status in (0, 1):
            found += store_violations(scenario, folder, [scenario.output])
            found += verdict.log_violations(folder, program)
            found += told.violations(folder, [*earlier, last], **TOLD_OF)
        return found


def ended(text):
    return text + b"\r\n" if text else text


def reader_violations(scenario, folder):
    """What a reader of the outbox finds at this moment: no file that was made is less than a whole notice of a stored or a
    pending record. Files that were there grow, and are taken up where they stood."""
    if scenario.earlier:
        return []
    connection = sqlite3.connect(folder / verdict.DATABASE)
    try:
        numbers = {number for number, in connection.execute(
            "SELECT ASNNo FROM tbASN UNION SELECT ASNNo FROM tbPendingNotice")}
    finally:
        connection.close()
    packed = scenario.packed
    found = []
    for path in (folder / "outbox").glob(pathlib.Path(scenario.output).name):
        number = path.stem.removeprefix("asn")
        wholes = [packed.notice(number, packs) for packs in packed.orders.values()] if number in numbers else []
        if path.read_bytes() not in wholes:
            found.append(f"a reader finds {path.name}, which is no whole notice")
    stock = folder / INVENTORY
    wholes = tuple(packed.stock(number, packs) for number in numbers for packs in packed.orders.values())
    if stock.exists() and not (wholes and stock.read_bytes().startswith(wholes)):
        found.append(f"a reader finds {stock.name}, which is less than one notice's")
    return found


def store_violations(scenario, folder, outputs):
    connection = sqlite3.connect(folder / verdict.DATABASE)
    try:
        sound = connection.execute("PRAGMA integrity_check").fetchone()[0]
        if sound != "ok":
            return [f"the database is damaged: {sound}"]
        stored = connection.execute("SELECT Id, ASNNo, ShipmentId, OrderId FROM tbASN ORDER BY Id").fetchall()
        packs = connection.execute("SELECT SSCC, ASNId, Status, ShipmentId, OrderId FROM tbPack ORDER BY Id").fetchall()
        shipped = connection.execute("SELECT MIN(Status) FROM tbShipment").fetchone()[0]
        pending = connection.execute("SELECT FileName FROM tbPendingNotice").fetchall()
    finally:
        connection.close()
    found = [] if shipped == 8 else [f"a shipment has Status {shipped}"]
    found += [f"a notice for {name} is still pending" for name, in pending]
    waiting = sum(status < 8 for _, _, status, *_ in packs)
    if waiting:
        found.append(f"{waiting} packs still wait")
    numbers = collections.Counter(number for _, number, *_ in stored)
    if max(numbers.values(), default=0) > 1:
        found.append(f"numbers were given twice: {numbers.most_common(3)}")
    pairs = {key: (shipment, order) for key, _, shipment, order in stored}
    strays = [sscc for sscc, key, _, *pair in packs if pairs.get(key) != tuple(pair)]
    if strays:
        found.append(f"packs are stamped with notices that are not theirs or not stored: {strays[:5]}")
    holders = {key: [sscc for sscc, of, *_ in packs if of == key] for key in pairs}
    if found or any(not held for held in holders.values()):
        return found or ["a stored notice has no packs"]
    return file_violations(scenario, folder, stored, holders, outputs)


def file_violations(scenario, folder, stored, holders, outputs):
    """The files hold each stored notice once, in the order in which they were stored, and nothing else."""
    notices, inventory = {}, ended(scenario.earlier)
    for key, number, *_ in stored:
        notices[number] = scenario.packed.notice(number, holders[key])
        inventory += scenario.packed.stock(number, holders[key])
    found = []
    for output in outputs:
        if "*" in output:
            paths = {number: folder / output.replace("*", number) for number in notices}
            present = [number for number, path in paths.items() if path.exists()]
            found += [f"{paths[number].name} is not the notice" for number in present
                      if paths[number].read_bytes() != notices[number]]
            for number in present:
                del notices[number]
        else:
            found += single_violations(scenario, folder / output, notices)
    if notices:
        found.append(f"notices are in no file: {sorted(notices)[:5]}")
    if verdict.read(folder / INVENTORY) != inventory:
        found.append(f"the inventory is {len(verdict.read(folder / INVENTORY))} bytes instead of {len(inventory)}")
    names = re.compile("|".join(re.escape(output).replace(r"\*", r"\d+") for output in (*outputs, INVENTORY)))
    strange = [name for name in verdict.new_files(scenario, folder) if not names.fullmatch(name)]
    # What stands under a name that a notice could have, and is none's.
    empty = [path.name for path in (folder / "outbox").iterdir() if path.stat().st_size == 0]
    numbers = {number for _, number, *_ in stored}
    foreign = [path.name for path in (folder / "outbox").glob("asn[0-9]*.csv")
               if "outbox/asn*.csv" in outputs and path.name[3:-4] not in numbers]
    if strange or empty or foreign:
        found.append(f"left over: {sorted({*strange, *empty, *foreign})}")
    return found


def single_violations(scenario, path, notices):
    """Takes out of `notices` those that the file holds."""
    content = verdict.read(path)
    earlier = ended(scenario.earlier)
    if not content.startswith(earlier):
        return [f"{path.name} has lost what it held before, or has it on a line with what came then"]
    content = content[len(earlier):]
    for number in list(notices):
        if content.startswith(notices[number]):
            content = content[len(notices.pop(number)):]
    return [f"{path.name} holds what is no stored notice: {content[:80]}"] if content else []


# --- Two programs on one store

def together(program, scenario, folder, outputs, kill_after=None):
    """One program for each output, run at once until nothing waits; the first ones may be killed meanwhile."""
    found, ended = [], []
    for turn in range(12):
        runs = [program.start(folder, "process", "1", output) for output in outputs]
        timers = [threading.Timer(kill_after * (index + 1), run.kill) for index, run in enumerate(runs)
                  if kill_after and turn == 0]
        for timer in timers:
            timer.start()
        readers = [threading.Thread(target=lambda run=run: ended.append(program.finish(run))) for run in runs[1:]]
        for reader in readers:
            reader.start()
        ended.append(program.finish(runs[0]))
        for thread in readers + timers:
            thread.join()
        bad = [run.returncode for run in runs if run.returncode not in (0, 1, -signal.SIGKILL)]
        if bad:
            found.append(f"a run ends with status {bad[0]}")
        connection = sqlite3.connect(folder / verdict.DATABASE)
        waiting = connection.execute(WAITING).fetchone()[0]
        connection.close()
        if waiting == 0 and turn > 0:
            break
    # What killed runs left is taken up by the next.
    for output in outputs:
        program.process(folder, name=output)
    found += told.violations(folder, ended, **TOLD_OF)
    return found + store_violations(scenario, folder, sorted(set(outputs))) + verdict.log_violations(folder, program)


# name, the outputs, when the programs are killed
TOGETHER = (
    ("two programs for one output", ("outbox/asn*.csv",) * 2, None),
    ("two programs for two outputs", ("outbox/a.csv", "outbox/b.csv"), None),
    *((f"two programs killed after {moment} s for {what}", outputs, moment) for moment in (0.01, 0.02, 0.03)
      for what, outputs in (("one output", ("outbox/asn.csv",) * 2), ("two outputs", ("outbox/a.csv", "outbox/b.csv")))),
)


def run(program, scenario, root, names=()):
    """Yields each case's name, its workspace and what was found."""
    for name, outputs, kill_after in TOGETHER:
        if not names or name in names:
            folder = scenario.copy(root)
            yield name, folder, together(program, scenario, folder, outputs, kill_after)
