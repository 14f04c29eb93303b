#!/usr/bin/env python3
# SPDX-License-Identifier: Apache-2.0
"""Derives ../collation/root.txt from allkeys_CLDR.txt, the root collation of the Unicode Common Locale Data Repository.

    python3 collation.py common/uca/allkeys_CLDR.txt > ../collation/root.txt

A character has up to two weight sets of primary, secondary and tertiary weight. The secondary weights of marks that
follow a letter in its decomposition become one number for the whole sequence, so that an accented letter needs one set.
"""

import re
import sys
import unicodedata
from collections import defaultdict

TABULATED = "00-06 09-0E 10 11 1E-27 30-33 FB FE FF"
ALGORITHMIC = "AC-D7 34-9F A0-A4 E0-FA 07 08 0F 12-1D 28-2F A5-AB FC FD D8-DF"
CAPITALS = {0x08, 0x09, 0x0A, 0x0B, 0x0C, 0x1D}  # tertiary weights of capital letters
COMMON_SECONDARY = 0x20
IMPLICIT = range(0xFB40, 0xFBC0)  # primary weights that begin the two elements of an ideograph


def pages(text):
    for part in text.split():
        first, _, last = part.partition("-")
        yield from range(int(first, 16), int(last or first, 16) + 1)


def read_elements(path):
    """The collation elements (variable, primary, secondary, tertiary) of each single character."""
    table = {}
    tabulated = set(pages(TABULATED))
    for line in open(path, encoding="utf-8"):
        match = re.match(r"([0-9A-F]{4})\s*;\s*((?:\[[^]]*\])+)", line)
        if match and int(match[1], 16) >> 8 in tabulated:
            table[int(match[1], 16)] = [
                (mark == "*", *(int(level, 16) for level in levels.split(".")))
                for mark, levels in re.findall(r"\[([.*])([^]]*)\]", match[2])
            ]
    return table


def weight_sets(elements):
    """[primary, secondary sequence, tertiary]; an ideograph's primary is ("ideograph", character)."""
    sets = []
    rest = iter(e for e in elements if not e[0])
    for _, primary, secondary, tertiary in rest:
        if primary in IMPLICIT:
            character = (primary - IMPLICIT[0] & 0x3F) << 15 | next(rest)[1] & 0x7FFF
            primary = ("ideograph", character)
        if primary:
            sets.append([primary, (secondary or COMMON_SECONDARY,), tertiary])
        elif secondary and sets:
            sets[-1][1] += (secondary,)
        elif secondary:
            sets.append([0, (secondary,), tertiary])
    return sets


def written(character):
    c = chr(character)
    plain = unicodedata.category(c)[0] in "LNPS" and unicodedata.bidirectional(c) not in ("R", "AL", "AN")
    plain = plain and unicodedata.normalize("NFC", c) == c and c not in "\\:=-/&<[]#"
    plain = plain and not 0x0590 <= character <= 0x08FF and character < 0xD800 and not unicodedata.combining(c)
    return c if plain else f"\\u{character:04X}"


class Root:
    def __init__(self, table):
        self.table = table
        self.specials = {}
        self.sets = {}
        for character, elements in table.items():
            ignorable = all(variable or not secondary for variable, _, secondary, _ in elements)
            if ignorable and (elements[0][0] or not any(e[1] for e in elements)):
                self.specials[character] = tuple(e[1] for e in elements)
            else:
                self.sets[character] = weight_sets(elements)[:2]
        used = [s for sets in self.sets.values() for s in sets]
        self.secondary_ranks = {s: i + 1 for i, s in enumerate(sorted({s[1] for s in used}))}
        self.tertiary_ranks = {t: i + 1 for i, t in enumerate(sorted({s[2] for s in used}))}
        self.steps = self.find_steps()

    def find_steps(self):
        """Characters that would weigh the same are told apart by steps behind the tertiary weight, unless they are
        canonically equivalent (None)."""
        groups = defaultdict(list)
        for character, sets in self.sets.items():
            groups[repr(sets)].append(character)
        steps = {}
        for members in groups.values():
            forms = {}
            for c in sorted(members, key=lambda c: ([e[1:] for e in self.table[c]], c)):
                form = unicodedata.normalize("NFD", chr(c))
                steps[c] = None if form in forms else len(forms)
                forms.setdefault(form, c)
        return steps

    def weights(self, character, number):
        _, secondary, tertiary = self.sets[character][number]
        step = self.steps[character] if number == len(self.sets[character]) - 1 else 0
        text = f"{self.secondary_ranks[secondary]}.{self.tertiary_ranks[tertiary]}"
        return text + (f"+{step}" if step else "")

    def member(self, character):
        return f"{written(character)} " + ("=" if self.steps[character] is None else self.weights(character, 0))

    def special_lines(self):
        previous, row = None, []
        for c in sorted(self.specials, key=lambda c: (self.specials[c], c)):
            form = unicodedata.normalize("NFD", chr(c))
            row.append(("= " if form == previous else "") + written(c))
            previous = form
        for i in range(0, len(row), 16):
            yield "s " + " ".join(row[i : i + 16])

    def order(self, character):
        _, secondary, tertiary = self.sets[character][0]
        step = self.steps[character]
        return (secondary, tertiary, step if step is not None else self.equal_step(character), step is None)

    def equal_step(self, character):
        form = unicodedata.normalize("NFD", chr(character))
        same = [c for c in self.sets if self.sets[c] == self.sets[character] and self.steps[c] is not None]
        return next(self.steps[c] for c in same if unicodedata.normalize("NFD", chr(c)) == form)

    def lines(self):
        yield from self.special_lines()
        single = defaultdict(list)
        expansions = []
        for character, sets in sorted(self.sets.items()):
            if len(sets) == 2 or isinstance(sets[0][0], tuple):
                expansions.append(character)
            else:
                single[sets[0][0]].append(character)
        members = {p: sorted(characters, key=self.order) for p, characters in single.items()}
        for character in members.pop(0):
            yield "m " + self.member(character)
        for primary in sorted(members):
            yield "p " + " ".join(self.member(c) for c in members[primary])
        for character in expansions:
            yield f"x {written(character)} " + " ".join(
                f"{self.base(s[0], members)}:{self.weights(character, i)}"
                for i, s in enumerate(self.sets[character])
            )

    @staticmethod
    def base(primary, members):
        if primary == 0:
            return "-"
        return written(primary[1]) if isinstance(primary, tuple) else written(members[primary][0])


def main():
    root = Root(read_elements(sys.argv[1]))
    print("# root collation; order from CLDR 41 allkeys_CLDR.txt (Unicode License v3)")
    print(f"tabulated {TABULATED}\nalgorithmic {ALGORITHMIC}")
    print("capitals", *(rank for tertiary, rank in root.tertiary_ranks.items() if tertiary in CAPITALS))
    for line in root.lines():
        print(line)


if __name__ == "__main__":
    main()
