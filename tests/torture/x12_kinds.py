"""The kinds of transaction that a partner's X12 file holds, and what each class makes of them. `changes` name how one
departs from the usual: arguments of `X12Class.heading`, and

    store    in the place of the last store
    whole    without stores: all goes to the location of the N1
    without  tags that are left out
    body     segments in the place of an order"""

from kinds import (BLANKET, CARRIED_OUT, CHANGEABLE, DROPPED, FAULTY, HALF, KEPT, ORDER, OTHER_COST, OTHER_HALF, PACKED,
                   POSTED, UNKNOWN_PRODUCT, Kind)

NOT_LISTED = (Kind("another set", KEPT, {"set": "855", "body": ["BAK*00*AC*4711"]}),
              Kind("without a beginning", KEPT, {"body": ["REF*DP*340", "CTT*0"]}))


def purpose(code, **others):
    return {"purpose": code, **others}


def order_type(code, **others):
    return {"type_code": code, **others}


def change(code, **others):
    return {"set": "860", "purpose": code, **others}


COMMON = (
    *NOT_LISTED,
    Kind("unknown store", KEPT, {"store": "9999"}),
    Kind("unknown ship-to", KEPT, {"location": "9998"}),
    Kind("product twice", KEPT),
    Kind("store twice", KEPT, {"store": "0052"}),
    Kind("cut short", KEPT, {"without": ("CTT",)}),
    Kind("sent anew", DROPPED),  # of the number of the order before it
    Kind("without stores", POSTED, {"whole": True}),
    Kind("stored already", DROPPED, {}, ORDER, True),
    Kind("replaces", POSTED, purpose("07"), ORDER),
    Kind("replaces in vain", KEPT, purpose("07", store="9999"), ORDER, True),
    Kind("replaces a packed one", DROPPED, purpose("07"), PACKED, True),
    Kind("after a half stored one", POSTED, {}, OTHER_HALF))
FAULTS = (UNKNOWN_PRODUCT, OTHER_COST, Kind("half stored", POSTED, {}, HALF))
TO_STORES = Kind("to each store", POSTED, {"location": ""})

KINDS = {
    "clsMGB850ansix12": (*COMMON, *FAULTS, TO_STORES,
                         Kind("cancels", CARRIED_OUT, purpose("01"), ORDER),
                         Kind("cancels nothing", KEPT, purpose("01")),
                         Kind("cancels a packed one", CARRIED_OUT, purpose("01"), PACKED)),
    "clsTarget850ansix12": (*COMMON, *FAULTS,
                            Kind("blanket", POSTED, order_type("BL")),
                            Kind("release of a blanket", POSTED, order_type("RL"), BLANKET)),
    "clsGHPL850ansix12": (*COMMON, *FAULTS, TO_STORES),
    # Its orders are acknowledged, so that those with faults of products are stored. A half stored one looks like these.
    "clsKMart850ansix12": (*COMMON, TO_STORES,
                           Kind("unknown product", FAULTY),
                           Kind("other cost", FAULTY),
                           Kind("blanket", POSTED, order_type("BK")),
                           Kind("release", POSTED, order_type("RL", release="2")),
                           Kind("changes", POSTED, change("05"), ORDER),
                           Kind("change of an unknown product", KEPT, change("05"), ORDER, True),
                           Kind("changes the dates of a packed one", DROPPED, change("05"), CHANGEABLE, True),
                           Kind("changes a packed one", KEPT, change("05"), PACKED, True),
                           Kind("cancels", CARRIED_OUT, change("01"), ORDER),
                           Kind("cancels nothing", DROPPED, change("01")),
                           Kind("cancels a packed one", DROPPED, change("01"), PACKED, True)),
}

# What the log has of an order that was carried out and stays in the file.
STAYS_WITH = {"clsMGB850ansix12": "doesn't exist", "clsKMart850ansix12": "Cancel Request"}
