#!/usr/bin/env python3
# SPDX-License-Identifier: Apache-2.0
"""Bring the language and territory sources up to a version of CLDR, or compare them with it; see README.md."""

import argparse
import re
import sys
import unicodedata
from pathlib import Path

from cldr import Cldr
from tables import DEVIATIONS, ENCODINGS, LANGUAGES, NO_NUMBER_SIGN, SPELLED_SYMBOLS, TERRITORIES

DAYS = ["sun", "mon", "tue", "wed", "thu", "fri", "sat"]
MONTHS = [str(month) for month in range(1, 13)]

# All keys in the order of the files. CLDR does not know the values of some, which stay as they are.
LANGUAGE_KEYS = [
    "id", "name", "default-territory", "default-codepage", "default-sort", "abbreviation", "own-name",
    *(f"day.{day}" for day in DAYS), *(f"abday.{day}" for day in DAYS),
    *(f"month.{month}" for month in MONTHS), *(f"abmonth.{month}" for month in MONTHS),
    "am", "pm", "special.upper", "special.lower",
]  # fmt: skip
TERRITORY_KEYS = [
    "id", "name", "abbreviation", "own-name", "decimal", "thousands", "list", "grouping", "fraction-digits",
    "currency", "currency-intl", "mon-decimal", "mon-thousands", "mon-grouping", "mon-digits", "mon-digits-intl",
    "positive-sign", "negative-sign", "positive", "negative", "time", "short-date", "long-date",
    "item58", "item82", "item83", "item84",
]  # fmt: skip

DIRECTIVES = {
    "EEEE": "%A", "cccc": "%A", "E": "%a", "EEE": "%a", "ccc": "%a",
    "MMMM": "%B", "LLLL": "%B", "MMM": "%b", "LLL": "%b", "MM": "%m", "M": "%#m",
    "dd": "%d", "d": "%#d", "y": "%Y", "yyyy": "%Y", "yy": "%y",
    "HH": "%H", "H": "%#H", "hh": "%I", "h": "%#I", "mm": "%M", "m": "%#M", "ss": "%S", "s": "%#S",
    "a": "%p", "B": "%p",  # there are no finer periods than the two halves of the day
}  # fmt: skip


class Unsupported(Exception):
    """CLDR says something that no rule expresses yet."""


def plain(text):
    """Without the blanks, quotes and signs that most code pages lack, and without marks of direction."""
    text = text.translate({0xA0: " ", 0x202F: " ", 0x2019: "'", 0x2212: "-", 0x200E: None, 0x200F: None, 0x61C: None})
    return unicodedata.normalize("NFC", text)


def format_of(pattern, number_sign):
    """A date or time pattern as a format with directives."""
    result = ""
    for match in re.finditer(r"'([^']*)'|([A-Za-z])\2*|.", pattern):
        part = match[0]
        if match[1] is not None:
            result += match[1].replace("%", "%%") or "'"
        elif match[2] is None:
            result += part.replace("%", "%%")
        elif part in DIRECTIVES:
            result += DIRECTIVES[part]
        else:
            raise Unsupported(f"the field {part} of {pattern!r}")
    return plain(result if number_sign else result.replace("%#", "%"))


def grouping_of(pattern):
    sizes = [len(group) for group in pattern.split(";")[0].split(".")[0].split(",")[1:]]
    return ";".join(str(size) for size in reversed(sizes)) + ";0" if sizes else "0"


def separator(text):
    text = plain(text)
    if len(text) != 1 or not text.isascii():
        raise Unsupported(f"the separator {text!r}")
    return f'"{text}"'


def encoding_of(locale):
    return ENCODINGS.get(locale) or ENCODINGS.get(locale.split("-")[0], "latin-1")


def can_encode(text, locale):
    try:
        text.encode(encoding_of(locale))
    except UnicodeEncodeError:
        return False
    return True


def symbol_of(cldr, locale, code):
    symbol = plain(cldr.currency_symbol(locale, code))
    return symbol if can_encode(symbol, locale) else SPELLED_SYMBOLS[code]


def amount_forms(pattern, symbol):
    """The positive and the negative form of an amount."""
    positive, _, negative = plain(pattern).partition(";")
    precedes = positive.startswith("¤")
    if re.sub(r"[#,0. ]", "", positive) != "¤" or not (precedes or positive.endswith("¤")):
        raise Unsupported(f"the amount {pattern!r}")
    # Symbols are set apart from digits unless they end in a sign of their own: "Q 5", but "C$5".
    neighbour = symbol[-1] if precedes else symbol[0]
    spaced = " " in positive or unicodedata.category(neighbour)[0] not in "SZ"

    def form(spaced, sign_place):
        return f"precedes {precedes:d} space {spaced:d} sign {sign_place}"

    if negative.startswith("¤-"):
        return form(spaced, 1), form(False, 4)
    # "¤ -5" has a blank on the far side of the sign, which no form has; the sign moves to the front.
    if negative in ("", "-" + positive, positive.replace("¤ ", "¤ -")):
        return form(spaced, 1), form(spaced, 1)
    raise Unsupported(f"the amount {pattern!r}")


def import_language(cldr, number):
    locale, own_code = LANGUAGES[number]
    calendar = cldr.gregorian(locale)
    # Names have the form that they take inside a full date; some languages decline months, or weekdays, there.
    date = cldr.pattern(locale, "dateFormats", "full")
    days = calendar["days"]["stand-alone" if "c" in date else "format"]
    months = calendar["months"]["stand-alone" if "L" in date else "format"]
    periods = calendar["dayPeriods"]["format"]["abbreviated"]
    values = {
        "abbreviation": locale.split("-")[0].upper(),
        "own-name": cldr.language_name(locale, own_code),
        "am": periods["am"],
        "pm": periods["pm"],
    }
    for prefix, width in (("", "wide"), ("ab", "abbreviated")):
        values.update((f"{prefix}day.{day}", days[width][day]) for day in DAYS)
        values.update((f"{prefix}month.{month}", months[width][month]) for month in MONTHS)
    return {key: plain(value) for key, value in values.items()}


def import_territory(cldr, number):
    locale, region = TERRITORIES[number]
    symbols = cldr.number_symbols(locale)
    decimal = separator(symbols["decimal"])
    code = cldr.currency(region)
    symbol = symbol_of(cldr, locale, code)
    positive, negative = amount_forms(cldr.currency_pattern(locale), symbol)
    digits = str(cldr.currency_digits(code))

    def date_format(kind, length):
        return format_of(cldr.pattern(locale, kind, length), number not in NO_NUMBER_SIGN)

    return {
        "abbreviation": cldr.alpha3(region),
        "own-name": plain(cldr.territory_name(locale, region)),
        "decimal": decimal,
        "thousands": separator(symbols["group"]),
        "list": '";"' if decimal == '","' else '","',
        "grouping": grouping_of(cldr.number_pattern(locale)),
        "currency": symbol,
        "currency-intl": code,
        "mon-decimal": separator(symbols.get("currencyDecimal", symbols["decimal"])),
        "mon-thousands": separator(symbols.get("currencyGroup", symbols["group"])),
        "mon-grouping": grouping_of(re.sub("[^#,0.;]", "", cldr.currency_pattern(locale))),
        "mon-digits": digits,
        "mon-digits-intl": digits,
        "negative-sign": f'"{plain(symbols["minusSign"])}"',
        "positive": positive,
        "negative": negative,
        "time": date_format("timeFormats", "medium"),
        "short-date": date_format("dateFormats", "short"),
        "long-date": date_format("dateFormats", "full"),
    }


class Kind:
    """Languages or territories."""

    def __init__(self, name, stem, keys, objects, read_cldr):
        self.name, self.stem, self.keys, self.objects, self.read_cldr = name, stem, keys, objects, read_cldr

    def path(self, data, number):
        return data / self.name / f"{self.stem}_{number:05}.txt"

    def comment(self, cldr, number, name):
        source = self.objects[number]
        if self.name == "language":
            return f"# language {number} {name}; texts from CLDR {cldr.version} locale {source[0]} (Unicode License v3)"
        return (
            f"# territory {number} {name}; CLDR {cldr.version} locale {source[0]}, region {source[1]} "
            "(Unicode License v3)"
        )


KINDS = [
    Kind("language", "la", LANGUAGE_KEYS, LANGUAGES, import_language),
    Kind("territory", "te", TERRITORY_KEYS, TERRITORIES, import_territory),
]


def read_source(path):
    """The values of a source by key; each is a list because some keys repeat."""
    values = {}
    for line in path.read_text(encoding="utf-8").splitlines():
        if line and not line.startswith("#"):
            key, _, value = line.partition(" = ")
            values.setdefault(key, []).append(value)
    return values


class Importer:
    def __init__(self, cldr, data):
        self.cldr = cldr
        self.data = data
        self.complaints = []

    def complain(self, path, message):
        self.complaints.append(f"{path}: {message}")

    def expected(self, kind, number):
        """What CLDR, the rules and the deviations make of an object."""
        values = kind.read_cldr(self.cldr, number)
        for deviating_kind, deviating_number, changes, _ in DEVIATIONS:
            if (deviating_kind, deviating_number) != (kind.name, number):
                continue
            for key, value in changes.items():
                if values[key] == value:
                    self.complain(kind.path(self.data, number), f"{key}: CLDR says {value} now; the deviation is void")
                values[key] = value
        for key, value in values.items():
            if not can_encode(value, kind.objects[number][0]):
                self.complain(kind.path(self.data, number), f"{key}: {value} is not in the usual code page")
        return values

    def objects(self):
        """The kind, number, present and expected values of every object that can be imported."""
        for kind in KINDS:
            known = {kind.path(self.data, number) for number in kind.objects}
            for path in sorted((self.data / kind.name).glob("*.txt")):
                if path not in known:
                    self.complain(path, "no CLDR locale is known for this object")
            for number in kind.objects:
                path = kind.path(self.data, number)
                if not path.exists():
                    self.complain(path, "there is no such file; begin one with id, name and defaults")
                    continue
                try:
                    yield kind, number, read_source(path), self.expected(kind, number)
                except (Unsupported, LookupError, OSError) as error:
                    self.complain(path, f"cannot be imported: {error}")

    def check(self):
        for kind, number, present, expected in self.objects():
            for key, value in expected.items():
                found = present.get(key, ["nothing"])
                if found != [value]:
                    self.complain(kind.path(self.data, number), f"{key} is {found[0]}, expected {value}")

    def write(self, output):
        for kind, number, present, expected in self.objects():
            values = present | {key: [value] for key, value in expected.items()}
            lines = [kind.comment(self.cldr, number, present["name"][0])]
            lines += [f"{key} = {value}" for key in kind.keys for value in values.get(key, [])]
            path = kind.path(output, number)
            path.parent.mkdir(parents=True, exist_ok=True)
            path.write_text("\n".join(lines) + "\n", encoding="utf-8")


def main():
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("cldr", type=Path, help="directory of the CLDR packages in JSON")
    parser.add_argument("--check", action="store_true", help="only list the differences")
    parser.add_argument("--data", type=Path, default=Path(__file__).resolve().parent.parent, help="the sources")
    parser.add_argument("--output", type=Path, help="where to write instead of the sources")
    arguments = parser.parse_args()
    try:
        importer = Importer(Cldr(arguments.cldr), arguments.data)
    except FileNotFoundError as error:
        parser.error(f"not a directory of CLDR packages: {error.filename} is missing")
    if arguments.check:
        importer.check()
    else:
        importer.write(arguments.output or arguments.data)
    print("\n".join(importer.complaints), end="\n" if importer.complaints else "")
    return 1 if importer.complaints else 0


if __name__ == "__main__":
    sys.exit(main())
