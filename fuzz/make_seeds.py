#!/usr/bin/env python3
"""Writes the seed corpora of the fuzz targets (fuzz/<family>/corpus).

The handle targets read their parameters from the end of an input (the last
byte picks the encoding) and their texts from its front, so each seed is a
few texts from the unit tests in one encoding, followed by parameter bytes.
Run it again after changing the texts; the files are committed.
"""
import hashlib
import pathlib

ROOT = pathlib.Path(__file__).resolve().parent

# Texts the unit tests use: blanks, case, digits, quotes, LIKE patterns,
# accented and wide characters.
TEXTS = ["abba  c", "Ab aB", "a%b_c\\%", "  -12345 ", "9223372036854775807",
         "'quo''ted'", "x\u00e9y", "\u65e5\u672c\u8a9e", "a\u65e5b  ", "\U0001F600z"]

SO, SI = b"\x0e", b"\x0f"


def modal(text):
    """EBCDIC single-byte text with wide characters in a shift-out run."""
    out = b""
    for ch in text:
        if ord(ch) < 0x80:
            out += ch.encode("cp037")
        else:
            out += SO + b"\x45" + bytes([0x41 + ord(ch) % 0x7F]) + SI
    return out


def encode(codec, text):
    return text.encode(codec, errors="replace")


# Index in the targets' encoding list -> how to write text in it.
ENCODINGS = [
    lambda t: encode("latin-1", t),       # 29
    lambda t: encode("cp037", t),         # 78
    lambda t: encode("utf-8", t),         # 20
    lambda t: encode("cp037", t),         # 161 (UTF-EBCDIC: the invariant part)
    lambda t: encode("utf-16-le", t),     # 25
    lambda t: encode("utf-16-be", t),     # 24
    lambda t: encode("utf-32-be", t),     # 26
    lambda t: encode("utf-32-le", t),     # 27
    modal,                                # 129
    lambda t: encode("cp932", t),         # 135
    lambda t: encode("euc-jp", t),        # 134
    lambda t: encode("big5", t),          # 119 (wide characters of two bytes)
    lambda t: encode("gb18030", t),       # 205
]

HANDLE_TARGETS = ["cursor", "search", "compare", "edit", "editmove", "translit", "numeric", "bidi"]


def write(family, seeds):
    folder = ROOT / family / "corpus"
    folder.mkdir(parents=True, exist_ok=True)
    for seed in seeds:
        name = hashlib.sha1(seed).hexdigest()[:16]
        (folder / name).write_bytes(seed)


def main():
    for family in HANDLE_TARGETS:
        seeds = []
        for index, enc in enumerate(ENCODINGS):
            for a, b in zip(TEXTS[:5], TEXTS[5:]):
                seeds.append(enc(a) + enc(b) + bytes([0x08, 0x10, 0x03, 0x20, 0x01, index]))
        write(family, seeds)
    write("u8", [t.encode() + b"\x03" + TEXTS[0].encode() + b"\x06\x20\x01" for t in TEXTS] +
          [b"\xed\xa0\x80\xc0\xaf\xf4\x90\x80\x80" + b"\x09\x10\x01"])
    # The UTF target: a selector byte, then the text.
    write("unicode", [bytes([sel]) + t.encode(codec) for t in TEXTS
                      for sel, codec in ((0, "utf-8"), (1, "utf-16-le"), (6, "utf-16-be"))])


if __name__ == "__main__":
    main()
