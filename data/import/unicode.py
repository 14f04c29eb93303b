#!/usr/bin/env python3
# SPDX-License-Identifier: Apache-2.0
"""Derives data/unicode/*.txt from the Unicode Character Database and compares, or with --write replaces, them.

  unicode.py UCD_15_DIR UNICODE_2_1_9_DIR [--write]

UCD_15_DIR holds UnicodeData.txt, PropList.txt, Scripts.txt and IndicSyllabicCategory.txt of Unicode 15.0 (Debian:
unicode-data). UNICODE_2_1_9_DIR is the unpacked npm package @unicode/unicode-2.1.9, which Node.js reads.
"""
import json
import pathlib
import subprocess
import sys

OUTPUT = pathlib.Path(__file__).resolve().parent.parent / "unicode"

TYPE_TABLES = [(0x0000, 0x06F9), (0x0901, 0x0EDD), (0x10A0, 0x11F9), (0x1E00, 0x21FF),
               (0x22F2, 0x27BE), (0x3000, 0x33FE), (0xFB00, 0xFBD2), (0xFD3E, 0xFFFF)]
LOWER_TABLES = [(0x0100, 0x01FE), (0x0200, 0x0275), (0x0380, 0x03EE),
                (0x0400, 0x04F8), (0x1E00, 0x1EF8), (0x1F00, 0x1FFC)]
UPPER_TABLES = [(0x0100, 0x01FF), (0x0200, 0x0292), (0x03A0, 0x03F1),
                (0x0430, 0x04F9), (0x1E00, 0x1EF9), (0x1F00, 0x1FF3)]
H2F_TABLES = [(0x00A0, 0x00AF), (0xFF60, 0xFFEE)]
F2H_TABLES = [(0x2500, 0x25CB), (0x3000, 0x30FC), (0x3130, 0x3164), (0xFFE0, 0xFFE6)]

# Runs of decimal digits: first, last, value of the first.
DIGIT_RUNS = [(0x0030, 0x0039, 0), (0x00B2, 0x00B3, 2), (0x00B9, 0x00B9, 1), (0x0660, 0x0669, 0), (0x06F0, 0x06F9, 0),
              (0x0966, 0x096F, 0), (0x09E6, 0x09EF, 0), (0x0A66, 0x0A6F, 0), (0x0AE6, 0x0AEF, 0), (0x0B66, 0x0B6F, 0),
              (0x0BE7, 0x0BEF, 1), (0x0C66, 0x0C6F, 0), (0x0CE6, 0x0CEF, 0), (0x0D66, 0x0D6F, 0), (0x0E50, 0x0E59, 0),
              (0x0ED0, 0x0ED9, 0), (0x0F20, 0x0F29, 0), (0x2070, 0x2070, 0), (0x2074, 0x2079, 4), (0x2080, 0x2089, 0),
              (0xFF10, 0xFF19, 0)]
DIGITS = {c: value + c - first for first, last, value in DIGIT_RUNS for c in range(first, last + 1)}

DIRECTIONS = {"Left_To_Right": "L", "Right_To_Left": "R", "European_Number": "EN", "European_Separator": "ES",
              "European_Terminator": "ET", "Arabic_Number": "AN", "Common_Separator": "CS", "Paragraph_Separator": "B",
              "Segment_Separator": "S", "White_Space": "WS", "Other_Neutral": "ON"}
CASED_NUMBERS = [("upper", 0x2160, 0x216F), ("lower", 0x2170, 0x217F), ("upper", 0x24B6, 0x24CF),
                 ("lower", 0x24D0, 0x24E9)]
# Dependent vowels of scripts that the syllabic categories leave out or class otherwise: Hebrew, Arabic, Thai, Lao.
VOWEL_MARKS = {*range(0x05B0, 0x05BC), *range(0x064B, 0x0651), 0x0670, 0x0E31, *range(0x0E34, 0x0E3A), 0x0EB1,
               *range(0x0EB4, 0x0EBA), 0x0EBB}
VOICE_MARKS = {0x309B, 0x309C}
PROLONGED_SOUND_MARK = 0x30FC
HALF_WIDTH_KATAKANA_MARKS = {0xFF70, 0xFF9E, 0xFF9F}


def ucd_property(path):
    """{value: set of characters} of a file of lines "FIRST..LAST ; VALUE"."""
    sets = {}
    for line in path.read_text(encoding="utf-8").splitlines():
        fields = [field.strip() for field in line.split("#")[0].split(";")]
        if len(fields) < 2:
            continue
        first, _, last = fields[0].partition("..")
        characters = range(int(first, 16), min(int(last or first, 16), 0xFFFF) + 1)
        sets.setdefault(fields[1], set()).update(characters)
    return sets


def ucd_decompositions(path, kind):
    """{character: what it decomposes to} for one kind of compatibility decomposition."""
    rows = (line.split(";") for line in path.read_text(encoding="utf-8").splitlines())
    return {int(row[0], 16): int(row[5].split()[1], 16) for row in rows if row[5].startswith(f"<{kind}> ")}


class Unicode219:
    SCRIPT = """
      const load = name => require(process.argv[1] + "/" + name + "/code-points.js");
      const names = group => require(process.argv[1] + "/index.js")[group];
      const sets = group => Object.fromEntries(names(group).map(name => [name, load(group + "/" + name)]));
      console.log(JSON.stringify({
        category: sets("General_Category"), direction: sets("Bidi_Class"),
        diacritic: load("Binary_Property/Diacritic"),
        lower: [...load("Simple_Case_Mapping/Lowercase")], upper: [...load("Simple_Case_Mapping/Uppercase")]}));
      """

    def __init__(self, package):
        output = subprocess.run(["node", "-e", self.SCRIPT, str(package.resolve())], check=True, capture_output=True)
        data = json.loads(output.stdout)
        self.category = {name: set(characters) for name, characters in data["category"].items()}
        self.direction = {c: DIRECTIONS[name] for name, members in data["direction"].items() for c in members}
        self.diacritic = set(data["diacritic"])
        self.lower = dict(data["lower"])
        self.upper = dict(data["upper"])

    def is_a(self, c, *categories):
        return any(c in self.category[name] for name in categories)


class Types:
    """The type of a character as its line in ctype.txt states it; empty when it has none."""

    def __init__(self, ucd, old):
        self.old = old
        self.properties = ucd_property(ucd / "PropList.txt")
        self.scripts = ucd_property(ucd / "Scripts.txt")
        self.syllabic = ucd_property(ucd / "IndicSyllabicCategory.txt")
        self.narrow = ucd_decompositions(ucd / "UnicodeData.txt", "narrow")
        self.wide = ucd_decompositions(ucd / "UnicodeData.txt", "wide")

    def classes(self, c):
        is_a = self.old.is_a
        cased = {name for name, first, last in CASED_NUMBERS if first <= c <= last}
        facts = [("alpha", is_a(c, "Letter")),
                 ("upper", is_a(c, "Uppercase_Letter", "Titlecase_Letter") or "upper" in cased),
                 ("lower", is_a(c, "Lowercase_Letter", "Titlecase_Letter") or "lower" in cased),
                 ("digit", c in DIGITS),
                 ("xdigit", c in self.properties["Hex_Digit"]),
                 ("punct", is_a(c, "Punctuation", "Symbol")),
                 ("space", c in self.properties["White_Space"]),
                 ("blank", is_a(c, "Space_Separator") or c == 0x09),
                 ("cntrl", is_a(c, "Control")),
                 ("ascii", c < 0x80)]
        return " ".join(name for name, holds in facts if holds)

    def forms(self, c):
        is_a = self.old.is_a
        both_kana = c in VOICE_MARKS or c == PROLONGED_SOUND_MARK
        dependent = self.syllabic["Vowel_Dependent"] | (self.syllabic["Vowel"] & self.old.category["Mark"])
        facts = [("nonspacing", is_a(c, "Nonspacing_Mark", "Enclosing_Mark")),
                 ("diacritic", c in self.properties["Diacritic"] or c in self.old.diacritic),
                 ("vowel", c in dependent or c in VOWEL_MARKS),
                 ("symbol", is_a(c, "Symbol")),
                 ("katakana", c in self.scripts["Katakana"] or both_kana or c in HALF_WIDTH_KATAKANA_MARKS),
                 ("hiragana", c in self.scripts["Hiragana"] or both_kana),
                 ("halfwidth", c in self.narrow),
                 ("fullwidth", c in self.wide),
                 ("ideograph", c in self.properties["Ideographic"]),
                 ("kashida", c == 0x0640)]
        return " ".join(name for name, holds in facts if holds)

    def line(self, c):
        if self.old.is_a(c, "Unassigned", "Surrogate", "Private_Use"):
            return ""
        return f"{self.classes(c)} ; {self.old.direction[c]} ; {self.forms(c)}".rstrip()


def ctype_lines(types):
    yield ("# character-type words of the eight Ctype tables: range ; group 1 ; group 2 (bidirectional class) ; "
           "group 3")
    yield ("# Unicode 2.1.9 General_Category and Bidi_Class; White_Space, Hex_Digit, Ideographic, Diacritic, Script "
           "from UCD 15.0")
    for number, (first, last) in enumerate(TYPE_TABLES, 1):
        yield f"table {number} {first:04X} {last:04X}"
        start = first
        for c in range(first, last + 1):
            if c < last and types.line(c + 1) == types.line(c):
                continue
            if types.line(c):
                name = f"{start:04X}" if start == c else f"{start:04X}..{c:04X}"
                yield f"{name} ; {types.line(c)}"
            start = c + 1


def mapping_lines(name, tables, mapping):
    for number, (first, last) in enumerate(tables, 1):
        yield f"table {name}{number} {first:04X} {last:04X}"
        for c in range(first, last + 1):
            if mapping.get(c, c) != c:
                yield f"{c:04X} {mapping[c]:04X}"


def case_lines(old):
    yield "# simple case mappings of Unicode 2.1.9 inside the twelve case tables: CODE lower|upper MAPPED"
    yield from mapping_lines("lower ", LOWER_TABLES, old.lower)
    yield from mapping_lines("upper ", UPPER_TABLES, old.upper)


def width_lines(types):
    yield ("# width mappings: full-width <-> half-width (UCD <wide>/<narrow> decompositions; "
           "U+FF9E/U+FF9F pair with U+309B/U+309C)")
    half_to_full = {plain: wide for wide, plain in types.wide.items()} | types.narrow
    full_to_half = types.wide | {plain: narrow for narrow, plain in types.narrow.items()}
    # The code pages hold the spacing voice marks, not the combining ones of the decompositions.
    half_to_full |= {0xFF9E: 0x309B, 0xFF9F: 0x309C}
    full_to_half |= {0x309B: 0xFF9E, 0x309C: 0xFF9F}
    yield from mapping_lines("H2F", H2F_TABLES, half_to_full)
    yield from mapping_lines("F2H", F2H_TABLES, full_to_half)


def digit_lines():
    yield f"# LXDigits: {len(DIGITS)} pairs"
    for c, value in sorted(DIGITS.items()):
        yield f"{c:04X} {0x30 + value:04X}"


def main():
    if len(sys.argv) not in (3, 4) or sys.argv[3:] not in ([], ["--write"]):
        sys.exit(__doc__)
    old = Unicode219(pathlib.Path(sys.argv[2]))
    types = Types(pathlib.Path(sys.argv[1]), old)
    files = {"ctype.txt": ctype_lines(types), "case.txt": case_lines(old), "width.txt": width_lines(types),
             "digits.txt": digit_lines()}
    different = 0
    for name, lines in files.items():
        text = "\n".join(lines) + "\n"
        if sys.argv[3:]:
            (OUTPUT / name).write_text(text, encoding="ascii", newline="\n")
        elif text != (OUTPUT / name).read_text(encoding="ascii"):
            print(f"{name} differs")
            different = 1
    return different


if __name__ == "__main__":
    sys.exit(main())
