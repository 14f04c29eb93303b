# SPDX-License-Identifier: Apache-2.0
"""Facts about one locale, read from the JSON packages of the Unicode Common Locale Data Repository."""

import json
from functools import lru_cache
from pathlib import Path


class Cldr:
    """A directory that holds the packages cldr-core, cldr-dates-full, cldr-numbers-full and cldr-localenames-full."""

    def __init__(self, directory):
        self.directory = Path(directory)
        self.version = self._load("cldr-core/package.json")["version"].split(".")[0]

    @lru_cache(maxsize=None)
    def _load(self, path):
        return json.loads((self.directory / path).read_text(encoding="utf-8"))

    def _supplemental(self, name):
        return self._load(f"cldr-core/supplemental/{name}.json")["supplemental"][name]

    def _main(self, package, locale, name):
        return self._load(f"cldr-{package}-full/main/{locale}/{name}.json")["main"][locale]

    def gregorian(self, locale):
        """The calendar of day and month names, day periods and date and time patterns."""
        return self._main("dates", locale, "ca-gregorian")["dates"]["calendars"]["gregorian"]

    def pattern(self, locale, kind, length):
        """A date or time pattern; kind is "dateFormats" or "timeFormats"."""
        pattern = self.gregorian(locale)[kind][length]
        return pattern if isinstance(pattern, str) else pattern["_value"]

    def language_name(self, locale, language):
        return self._main("localenames", locale, "languages")["localeDisplayNames"]["languages"][language]

    def territory_name(self, locale, region):
        return self._main("localenames", locale, "territories")["localeDisplayNames"]["territories"][region]

    def alpha3(self, region):
        return self._supplemental("codeMappings")[region]["_alpha3"]

    def number_symbols(self, locale):
        return self._main("numbers", locale, "numbers")["numbers"]["symbols-numberSystem-latn"]

    def number_pattern(self, locale):
        return self._main("numbers", locale, "numbers")["numbers"]["decimalFormats-numberSystem-latn"]["standard"]

    def currency_pattern(self, locale):
        return self._main("numbers", locale, "numbers")["numbers"]["currencyFormats-numberSystem-latn"]["standard"]

    def currency(self, region):
        """The code of the legal tender; the first one where there are several."""
        for entry in self._supplemental("currencyData")["region"][region]:
            for code, facts in entry.items():
                if "_to" not in facts and facts.get("_tender") != "false":
                    return code
        raise LookupError(f"{region} has no currency")

    def currency_symbol(self, locale, code):
        names = self._main("numbers", locale, "currencies")["numbers"]["currencies"][code]
        symbol = names.get("symbol", code)
        return names.get("symbol-alt-narrow", code) if symbol == code else symbol

    def currency_digits(self, code):
        fractions = self._supplemental("currencyData")["fractions"]
        return int(fractions.get(code, fractions["DEFAULT"])["_digits"])
