"""The flag word: the bits of module/runtime/text/flags.h, by name."""

NAMES = (
    "Property Reference Method Class Abstract Aggregate Aggregation Association Composition Counter Delete DN "
    "EmbeddedObject Exception Expensive Experimental Gauge IfDeleted In Indication Invisible Key Large "
    "OctetString Out Read Required Static Terminal Weak Write EmbeddedInstance"
).split()

BITS = {name.lower(): 1 << bit for bit, name in enumerate(NAMES)}

PROPERTY, REFERENCE, METHOD, CLASS = (BITS[name] for name in ("property", "reference", "method", "class"))
ASSOCIATION, INDICATION, KEY, IN, OUT = (
    BITS[name] for name in ("association", "indication", "key", "in", "out")
)
KINDS = {"property": PROPERTY, "reference": REFERENCE, "method": METHOD}
