"""The partner's order file in X12: interchanges of several groups, ours and others', and what has to be left of it."""

import random
from dataclasses import dataclass

import orders
import x12_verdict
from file_rules import rules_of
from kinds import KEPT, PLAIN
from x12_kinds import KINDS, NOT_LISTED, STAYS_WITH
from x12_samples import replaced

DONE = "*FA DONE*"
OTHER_ADDRESS = "OTHEREDI"


class Transaction(orders.Order):
    """`texts` are its segments, from ST to SE, without their ends."""

    def segments(self):
        return [text.encode() for text in self.texts]

    @property
    def listed_as(self):
        return None if self.kind in NOT_LISTED else "/".join(self.controls)


@dataclass
class Group:
    number: str
    gs: str
    transactions: list
    ge: str


@dataclass
class Interchange:
    end: str     # of its segments, as they come
    isa: str
    groups: list  # each a Group, or the text of one that holds no orders
    iea: str


class X12File(orders.OrderFile):
    def __init__(self, trade, parts, options=""):
        """`parts` are Interchanges, or texts of those that are another's."""
        self.parts = parts
        super().__init__(trade, [order for group in self.groups() for order in group.transactions], options)

    def commits_of_listing(self):
        """An acknowledgement takes two numbers."""
        return 2 * len(self.groups())

    def followed_by(self, other):
        return X12File(self.trade, self.parts + other.parts)

    def groups(self):
        return [group for part in self.parts if isinstance(part, Interchange)
                for group in part.groups if isinstance(group, Group)]

    def content(self):
        # The partner's last segment has no line end.
        return "".join(self._as_sent(part) for part in self.parts).rstrip("\r\n").encode()

    @staticmethod
    def _as_sent(part):
        if isinstance(part, str):
            return part
        text = part.isa + part.end
        for group in part.groups:
            if isinstance(group, str):
                text += group
                continue
            segments = [group.gs, *(segment for each in group.transactions for segment in each.texts), group.ge]
            text += "".join(segment + part.end for segment in segments)
        return text + part.iea + part.end

    def left(self, listed, stays):
        """What a run leaves that listed the transactions of these controls: of one that is done an empty pair, which
        the next run sweeps away. None when nothing stays."""
        text, anything = "", False
        for part in self.parts:
            if isinstance(part, str):
                text, anything = text + part, True
                continue
            inner = []
            for group in part.groups:
                if isinstance(group, str):
                    inner.append(group)
                    anything = True
                    continue
                segments = []
                for order in group.transactions:
                    if stays(order):
                        segments += order.texts
                        anything = True
                    elif order.listed_as in listed:
                        segments += [order.texts[0], order.texts[-1]]
                if segments:
                    inner.append(self._written([group.gs + DONE, *segments, group.ge]))
            if inner:
                text += "".join([self._written([part.isa]), *inner, self._written([part.iea])])
        return text.encode() if anything else None

    def _written(self, segments):
        return "".join(segment + self.trade.order_class.end for segment in segments)


class X12Trade(orders.Trade):
    verdict = x12_verdict
    backs_up = False

    def __init__(self, order_class):
        super().__init__(order_class, KINDS[order_class.name])
        rules = rules_of(order_class.name)
        self.archives = "no-archive" not in rules
        self.leaves_temporary = "leaves-temporary" in rules
        self.bare_ends = "bare-ends" in rules
        self.stays_with = STAYS_WITH.get(order_class.name)
        lines_only = "whole-lines" in rules
        self.own_ends = ["\r\n", "\n"] if lines_only else ["~\r\n", "~", "~\n"]
        if rules & {"apostrophe-ends", "cuts-apostrophes"}:
            self.own_ends.append("'\r\n")
        self.other_ends = ["\r\n\r\n", "\r"] if lines_only else ["~", "~\r\n\r\n", "\n", "~\n\n"]

    def make_file(self, count=None, products=2, stores=2, *, plain=False, first_number=45000000, seed=1, options=""):
        """`count`: as many as show every kind. `plain`: orders that post only, and nothing else in the file."""
        in_group = 5 if count else 3
        parts, index, total = [], 0, count or self.cycle
        while index < total:
            number = f"{first_number + len(parts):09}"
            part = Interchange(self.own_ends[len(parts) % len(self.own_ends)],
                               replaced(self.order_class.isa, {13: number}), [], f"IEA*2*{number}")
            for _ in range(2):
                size = min(in_group, total - index)
                if size:
                    controls = (number, f"{first_number // 1000}{481 + 2 * len(parts) + len(part.groups)}")
                    part.groups.append(self.make_group(controls, [
                        self.make_order(controls, place, self.kind_at(place, plain), first_number, products, stores,
                                        seed) for place in range(index, index + size)]))
                index += size
            parts.append(part)
        return X12File(self, parts if plain else self.among_others(parts), options)

    def kind_at(self, index, plain):
        place, other = divmod(index % self.cycle, 2)
        return self.kinds[place] if other and not plain else PLAIN

    def make_order(self, group, index, kind, first_number, products, stores, seed):
        order = Transaction("", kind, (*group, f"{index + 1:04}"))
        order.number = str(first_number + index - (kind.name == "sent anew"))
        # One that is sent anew has the same lines, for it may be posted where the first one fails.
        rng = random.Random(f"{seed} {order.number}")
        changes = dict(kind.changes)
        code = changes.pop("set", "850")
        body = changes.pop("body", None) or [*self.body(order, code, changes, products, stores, rng)]
        if "release" in kind.changes:
            order.number += f" REL# {kind.changes['release']}"
        order.texts = [f"ST*{code}*{order.controls[2]}", *body, f"SE*{len(body) + 2}*{order.controls[2]}"]
        return order

    def body(self, order, code, changes, products, stores, rng):
        of_class = self.order_class
        last_store, whole = changes.pop("store", None), changes.pop("whole", False)
        without = changes.pop("without", ())
        location = changes.setdefault("location", of_class.warehouse if whole else None)
        yield from of_class.heading(order.number, kind=code, **changes)
        wanted = orders.PRODUCTS[:products]
        if order.kind.name == "product twice":
            wanted[-1] = wanted[0]
        for sequence, product in enumerate(wanted, 1):
            places = orders.STORES[:stores]
            if last_store:
                places[-1] = last_store
            cost = orders.OTHER_COST if order.kind.name == "other cost" else orders.COSTS[product]
            retail, sku = orders.RETAILS[product], "SKU" + product[-4:]
            if order.kind.name.endswith("unknown product"):
                product = product.replace("93", "99", 1)
            pairs = [(place, rng.randint(1, 900)) for place in places]
            yield from of_class.line(sequence, product, pairs, cost, retail, sku, kind=code, whole=whole)
            if whole:
                pairs = [(location, sum(quantity for _, quantity in pairs))]
            order.lines += [(product, place, of_class.ship_to(place, location), float(quantity), float(quantity), cost)
                            for place, quantity in pairs]
        if "CTT" not in without:
            yield f"CTT*{products}"

    def make_group(self, controls, transactions):
        changes = any("set*860" in f"set*{order.texts[0][3:6]}" for order in transactions)
        gs = replaced(self.order_class.gs, {1: "PC" if changes else "PO", 6: controls[1]})
        return Group(controls[1], gs, transactions, f"GE*{len(transactions)}*{controls[1]}")

    def among_others(self, parts):
        """Others' interchanges between ours, and groups without orders in some of ours."""
        mixed = []
        for number, part in enumerate(parts):
            end = self.other_ends[number % len(self.other_ends)]
            if number % 3 == 1:
                part.groups.insert(number // 3 % 3, self.other_group(number, end))
            if number % 4 == 0:
                mixed.append(self.other_interchange(number, end))
            mixed.append(part)
        return mixed

    def other_group(self, number, end):
        gs = replaced(self.order_class.gs, {1: "IN", 6: 9000 + number})
        return "".join(text + end for text in (gs, "ST*810*0001", "BIG*060307*4711", "SE*3*0001", f"GE*1*{9000 + number}"))

    def other_interchange(self, number, end):
        control = f"{900 + number:09}"
        isa = replaced(self.order_class.isa, {6: OTHER_ADDRESS, 13: control})
        return "".join(text + end for text in (
            isa, replaced(self.order_class.gs, {6: 9}), "ST*850*0001", "BEG*00*SA*4711**060307", "CTT*0", "SE*4*0001",
            "GE*1*9", f"IEA*1*{control}"))
