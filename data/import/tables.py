# SPDX-License-Identifier: Apache-2.0
"""What the importer cannot know from CLDR: which locale stands for an object, and where the data differs on purpose."""

# Language id -> CLDR locale, and the code under which that locale names the language itself.
LANGUAGES = {
    1: ("en", "en"),
    2: ("de", "de"),
    3: ("fr", "fr"),
    4: ("es", "es"),
    5: ("it", "it"),
    6: ("pt-PT", "pt"),
    7: ("no", "no"),
    8: ("sv", "sv"),
    9: ("da", "da"),
    10: ("fi", "fi"),
    11: ("ja", "ja"),
    12: ("fr-CA", "fr-CA"),
    13: ("zh-Hant", "zh-Hant"),
    14: ("zh", "zh-Hans"),
    21: ("cs", "cs"),
    22: ("nl", "nl"),
    23: ("et", "et"),
    25: ("el", "el"),
    27: ("hu", "hu"),
    28: ("ko", "ko"),
    29: ("lv", "lv"),
    30: ("lt", "lt"),
    31: ("pl", "pl"),
    33: ("ru", "ru"),
    39: ("tr", "tr"),
}

# Territory id -> CLDR locale and region.
TERRITORIES = {
    32: ("es-AR", "AR"),
    36: ("en-AU", "AU"),
    40: ("de-AT", "AT"),
    56: ("nl-BE", "BE"),
    57: ("fr-BE", "BE"),
    68: ("es-BO", "BO"),
    76: ("pt", "BR"),
    124: ("en-CA", "CA"),
    125: ("fr-CA", "CA"),
    152: ("es-CL", "CL"),
    156: ("zh", "CN"),
    158: ("zh-Hant", "TW"),
    170: ("es-CO", "CO"),
    188: ("es-CR", "CR"),
    203: ("cs", "CZ"),
    208: ("da", "DK"),
    218: ("es-EC", "EC"),
    222: ("es-SV", "SV"),
    233: ("et", "EE"),
    246: ("fi", "FI"),
    250: ("fr", "FR"),
    276: ("de", "DE"),
    300: ("el", "GR"),
    320: ("es-GT", "GT"),
    348: ("hu", "HU"),
    372: ("en-IE", "IE"),
    380: ("it", "IT"),
    392: ("ja", "JP"),
    410: ("ko", "KR"),
    428: ("lv", "LV"),
    442: ("lt", "LT"),
    484: ("es-MX", "MX"),
    528: ("nl", "NL"),
    554: ("en-NZ", "NZ"),
    558: ("es-NI", "NI"),
    578: ("no", "NO"),
    591: ("es-PA", "PA"),
    600: ("es-PY", "PY"),
    604: ("es-PE", "PE"),
    616: ("pl", "PL"),
    620: ("pt-PT", "PT"),
    643: ("ru", "RU"),
    724: ("es", "ES"),
    752: ("sv", "SE"),
    756: ("de-CH", "CH"),
    757: ("fr-CH", "CH"),
    792: ("tr", "TR"),
    826: ("en-GB", "GB"),
    840: ("en", "US"),
    858: ("es-UY", "UY"),
    862: ("es-VE", "VE"),
}

# The encoding of the usual code page, by CLDR locale or its language; Latin-1 for all others. Traditional Chinese has
# no Python encoding for its page, but the texts are in the common part of both.
ENCODINGS = {
    "cs": "iso8859-2",
    "el": "iso8859-7",
    "hu": "iso8859-2",
    "ja": "euc_jp",
    "ko": "cp949",
    "lt": "iso8859-4",
    "lv": "iso8859-4",
    "pl": "iso8859-2",
    "ru": "iso8859-5",
    "tr": "iso8859-9",
    "zh": "gbk",
    "zh-Hant": "big5",
}

# How a currency symbol is spelled where the usual code page lacks it.
SPELLED_SYMBOLS = {
    "CNY": "￥",
    "CRC": "CRC",
    "EUR": "EUR",
    "KRW": "￦",
    "RUB": "руб.",
    "TRY": "TL",
}

# Territories whose host code page has "#" where the formatting code does not look for it. Those that share Spanish or
# French with Spain or France are among them, for texts on the host pages of these languages.
NO_NUMBER_SIGN = {
    32, 57, 68, 125, 152, 170, 188, 208, 218, 222, 233, 246, 250, 320, 380, 484, 558, 578, 591, 600, 604, 724, 752,
    757, 792, 858, 862,
}  # fmt: skip

# Differences from CLDR that are meant: kind of object, id, values, reason.
DEVIATIONS = [
    (
        "language",
        6,
        {
            "abday.sun": "dom.",
            "abday.mon": "seg.",
            "abday.tue": "ter.",
            "abday.wed": "qua.",
            "abday.thu": "qui.",
            "abday.fri": "sex.",
            "abday.sat": "sáb.",
        },
        "Brazil's abbreviations, known in Portugal too; the European ones are not shortened",
    ),
    (
        "territory",
        170,
        {"mon-digits-intl": "2"},
        "the international form follows ISO 4217; prices are written without centavos",
    ),
    (
        "territory",
        348,
        {"mon-digits-intl": "2"},
        "the international form follows ISO 4217; prices are written without fillér",
    ),
    ("territory", 756, {"list": '";"'}, "all of Switzerland separates lists alike"),
    (
        "territory",
        792,
        {"positive": "precedes 0 space 1 sign 1", "negative": "precedes 0 space 1 sign 1"},
        "only the lira sign stands before the amount; TL follows it",
    ),
    (
        "territory",
        840,
        {
            "positive": "precedes 1 space 0 sign 3",
            "negative": "precedes 1 space 0 sign 0",
            "long-date": "%A, %B %d, %Y",
        },
        "equal to the built-in territory, on which programs rely",
    ),
    ("territory", 862, {"currency": "Bs."}, "the S belonged to the currency of 2018 to 2021"),
]
