"""The kinds of order that a partner's file holds, and what each class makes of them."""

from dataclasses import dataclass, field

from file_rules import rules_of

# What becomes of an order.
POSTED = "posted"        # in the store once, its lines in the backup
FAULTY = "faulty"        # the same, but stored at Status 9, its faults to be settled there
KEPT = "kept"            # in the file, byte for byte
DROPPED = "dropped"      # turned away for good: in neither
CARRIED_OUT = "carried out"  # in the file or not: the next run finds nothing left to do for it

# An older order of the number in the store.
ORDER = "order"
PACKED = "packed"        # one with a packing job
CHANGEABLE = "changeable"  # the same, whose dates may still be changed
BLANKET = "blanket"
HALF = "half"            # this very order, as a program leaves it that dies under a store without transactions
OTHER_HALF = "other half"


@dataclass(frozen=True)
class Kind:
    name: str
    fate: str
    changes: dict = field(default_factory=dict)   # columns that have another value than usual
    older: str = ""
    outlives: bool = False                        # the older order is there at the end, as it was


PLAIN = Kind("plain", POSTED)
UNKNOWN_PRODUCT = Kind("unknown product", KEPT)
OTHER_COST = Kind("other cost", KEPT)
UNKNOWN_LOCATION = Kind("unknown location", KEPT, {"SHIPTOLOCPARTNERNO": "9999"})
LINE_TWICE = Kind("line twice", KEPT)
FOREIGN = Kind("foreign", KEPT, {"PARTNEREDIADDR": "OTHEREDI"})
SENT_TWICE = Kind("sent twice", POSTED)
BLANK_LINE = Kind("blank line", POSTED)
HALF_STORED = Kind("half stored", POSTED, {}, HALF)
STORED_ALREADY = Kind("stored already", DROPPED, {}, ORDER, True)


def purpose(code, **others):
    return {"POPURPOSECODE": code, **others}


def order_type(code, **others):
    return {"POTYPECODE": code, **others}


REPLACES = Kind("replaces", POSTED, purpose("07"), ORDER)
REPLACES_IN_VAIN = Kind("replaces in vain", KEPT, purpose("07", SHIPTOLOCPARTNERNO="9999"), ORDER, True)
REPLACES_PACKED = Kind("replaces a packed one", DROPPED, purpose("07"), PACKED, True)
CHANGES = Kind("changes", POSTED, purpose("05"), ORDER)
CANCELS = Kind("cancels", DROPPED, purpose("01"), ORDER)
CANCELS_NOTHING = Kind("cancels nothing", DROPPED, purpose("01"))
CANCELS_IN_FILE = (Kind("cancels", KEPT, purpose("01"), ORDER), Kind("cancels nothing", KEPT, purpose("01")))

COMMON = (FOREIGN, LINE_TWICE, SENT_TWICE, BLANK_LINE)
FAULTS = (UNKNOWN_PRODUCT, OTHER_COST, UNKNOWN_LOCATION)
REPLACEMENTS = (STORED_ALREADY, REPLACES, REPLACES_IN_VAIN, REPLACES_PACKED)
STORES = (*COMMON, *FAULTS, HALF_STORED, *REPLACEMENTS, CHANGES, CANCELS, CANCELS_NOTHING)
BY_GTIN = (
    *COMMON, *FAULTS, HALF_STORED,
    Kind("stored already", KEPT, {}, ORDER, True),
    Kind("rejection of an order", KEPT, {"RESPONSETYPECODE": "27"}, ORDER, True),
    Kind("changes", POSTED, order_type("231"), ORDER),
    Kind("changes a packed one", KEPT, order_type("231"), PACKED, True),
    Kind("changes nothing", POSTED, order_type("231")),
    Kind("rejected", KEPT, order_type("231", RESPONSETYPECODE="27"), ORDER),
    Kind("rejects nothing", KEPT, {"RESPONSETYPECODE": "27"}),
)
CUSTOMERS = {"STOREZONE": "CO77"}
TAKEN_BACK = {"INCOMINGPRODUCTNO": "", "ORDERQUANTITY": "0"}

KINDS = {
    "clsMGB850csv": STORES,
    "clsMYERDropShipPOcsv": STORES,
    "clsGHPL850csv": (*COMMON, *FAULTS, HALF_STORED, *REPLACEMENTS,
                      Kind("changes", DROPPED, purpose("05"), ORDER, True)),
    "clsTarget850csv": (*COMMON, *FAULTS, HALF_STORED, *REPLACEMENTS,
                        Kind("blanket", DROPPED, order_type("BL")),
                        Kind("release of a blanket", POSTED, order_type("RL"), BLANKET)),
    "clsMGBBT850csv": (*COMMON, *FAULTS, HALF_STORED, *REPLACEMENTS, CHANGES, *CANCELS_IN_FILE,
                       # Of the number of the order before it, which a failing disk may leave to the next run.
                       Kind("sent anew", DROPPED, {"SHIPTOLOCPARTNERNO": "9999"}),
                       Kind("customer's", POSTED, CUSTOMERS),
                       Kind("customer's line twice", POSTED, CUSTOMERS),
                       Kind("customer's change", POSTED, order_type("230", **CUSTOMERS), ORDER),
                       # One that a killed run carried out finds nothing the next time, so it is left out here.
                       Kind("customer's cancellation of nothing", POSTED,
                            order_type("230", POPURPOSECODE="1", **CUSTOMERS)),
                       Kind("taken back", DROPPED, {**TAKEN_BACK, **CUSTOMERS}),
                       Kind("a stored one taken back", DROPPED, order_type("230", **TAKEN_BACK, **CUSTOMERS), ORDER)),
    # Its orders are acknowledged, so that those with faults of products are stored. A half stored one looks like these.
    "clsKMart850csv": (*COMMON, UNKNOWN_LOCATION, *REPLACEMENTS, CHANGES, *CANCELS_IN_FILE,
                       Kind("unknown product", FAULTY),
                       Kind("other cost", FAULTY),
                       Kind("sent after a faulty one", POSTED, {}, OTHER_HALF),
                       Kind("blanket", DROPPED, order_type("BK")),
                       Kind("no release", POSTED, order_type("SA")),
                       Kind("through the warehouse", POSTED, {"SHIPTOLOCPARTNERNO": ""})),
    "clsOfficeworks850csv": (*COMMON, *FAULTS, HALF_STORED, STORED_ALREADY,
                             Kind("other pack", KEPT, {"UNITSINNERPACK": "25"}),
                             Kind("changes", POSTED, purpose("4"), ORDER),
                             Kind("changes a packed one", DROPPED, purpose("4"), PACKED, True),
                             Kind("cancels the balance", DROPPED, purpose("4", POVERSIONNO="2"), ORDER),
                             Kind("cancels the balance of nothing", DROPPED, purpose("4", POVERSIONNO="2")),
                             Kind("cancels", DROPPED, purpose("1"), ORDER),
                             Kind("cancels nothing", DROPPED, purpose("1")),
                             Kind("blanket", DROPPED, order_type("BK"))),
    "clsCMLFLFPOcsv": BY_GTIN,
    "clsTargetBulkPOcsv": (*BY_GTIN, Kind("other inner", KEPT, {"UNITSINNERPACK": "36"})),
    "clsColesEIDCPOcsv": (*COMMON, UNKNOWN_PRODUCT, OTHER_COST, HALF_STORED,
                          Kind("replaces", POSTED, {}, ORDER),
                          Kind("replaces in vain", KEPT, {"GSTRATE": "12"}, ORDER, True),
                          Kind("replaces a packed one", DROPPED, {}, PACKED, True),
                          CANCELS, CANCELS_NOTHING),
}


def number_of(class_name, fields):
    """The number that an order is listed and stored under."""
    number, rules = fields["PONUMBER"], rules_of(class_name)
    if "short-numbers" in rules and len(number) <= 8:
        return f"{number} #{fields['SHIPTOLOCPARTNERNO']}"
    if "releases" in rules and fields["POTYPECODE"] == "RL":
        return f"{number} REL# {fields['POVERSIONNO']}"
    return number
