#!/usr/bin/env python3
"""Writes the code pages that the system's ICU data lacks as ICU mapping files.

The catalogue generator reads every code page through ICU. A few pages are
not in the ICU data that Debian ships; this script takes their byte-to-Unicode
tables from the system's other converters (glibc's iconv modules and the Java
runtime's charsets) and writes them as .ucm files under data/catalogue/ucm/,
which the build compiles with ICU's makeconv. Run it by hand when a page is
added; the build never runs it.

Two EBCDIC pages have no converter on this system at all. They are derived
the way the open-systems EBCDIC pages are built: the ISO 8859 page's
characters placed through the byte layout of EBCDIC 1047 (which is a
one-to-one reordering of the 256 Latin-1 positions).
"""
import ctypes
import os
import subprocess
import sys
import tempfile

ICONV = {  # ucm name: (glibc iconv name, EBCDIC?)
    "ibm-275": ("IBM275", True),
    "ibm-880": ("IBM880", True),
    "ibm-905": ("IBM905", True),
    "ibm-1166": ("IBM1166", True),
    "hp-roman8": ("HP-ROMAN8", False),
    "kz-1048": ("RK1048", False),
    "iso-8859_16": ("ISO-8859-16", False),
}
JAVA = {  # ucm name: Java charset name
    "x-mac-arabic": "x-MacArabic",
    "x-mac-hebrew": "x-MacHebrew",
    "x-mac-thai": "x-MacThai",
    "x-mac-ukrainian": "x-MacUkraine",
    "x-mac-icelandic": "x-MacIceland",
    "x-mac-croatian": "x-MacCroatian",
    "x-mac-romanian": "x-MacRomania",
}
DERIVED = {  # ucm name: (Python codec of the ISO page, layout page in iconv)
    "ibm-924": ("iso8859_15", "IBM1047"),
    "ibm-425": ("iso8859_6", "IBM1047"),
}

JAVA_DUMP = r"""
import java.nio.*; import java.nio.charset.*;
public class Dump { public static void main(String[] a) throws Exception {
  CharsetDecoder d = Charset.forName(a[0]).newDecoder()
      .onMalformedInput(CodingErrorAction.REPORT).onUnmappableCharacter(CodingErrorAction.REPORT);
  for (int b = 0; b < 256; b++) {
    String s;
    try { s = d.reset().decode(ByteBuffer.wrap(new byte[]{(byte) b})).toString(); }
    catch (CharacterCodingException e) { System.out.println("-"); continue; }
    StringBuilder sb = new StringBuilder();
    s.codePoints().forEach(c -> sb.append(Integer.toHexString(c)).append(' '));
    System.out.println(sb.toString().trim()); } } }
"""


def iconv_table(name):
    """byte -> code point (None when the byte has no single character)."""
    libc = ctypes.CDLL("libc.so.6")
    libc.iconv_open.restype = ctypes.c_void_p
    libc.iconv_open.argtypes = [ctypes.c_char_p, ctypes.c_char_p]
    libc.iconv.restype = ctypes.c_size_t
    libc.iconv.argtypes = [ctypes.c_void_p] + [ctypes.c_void_p] * 4
    libc.iconv_close.argtypes = [ctypes.c_void_p]
    table = []
    for b in range(256):
        cd = libc.iconv_open(b"UTF-32BE", name.encode())
        if cd in (None, ctypes.c_void_p(-1).value):
            sys.exit(f"iconv has no {name}")
        src = ctypes.create_string_buffer(bytes([b]), 1)
        dst = ctypes.create_string_buffer(16)
        ps, pd = ctypes.c_void_p(ctypes.addressof(src)), ctypes.c_void_p(ctypes.addressof(dst))
        ns, nd = ctypes.c_size_t(1), ctypes.c_size_t(16)
        r = libc.iconv(cd, ctypes.byref(ps), ctypes.byref(ns), ctypes.byref(pd), ctypes.byref(nd))
        libc.iconv_close(cd)
        out = dst.raw[: 16 - nd.value]
        ok = r != ctypes.c_size_t(-1).value and ns.value == 0 and len(out) == 4
        table.append(int.from_bytes(out, "big") if ok else None)
    return table


def java_table(name):
    with tempfile.TemporaryDirectory() as tmp:
        path = os.path.join(tmp, "Dump.java")
        with open(path, "w") as f:
            f.write(JAVA_DUMP)
        lines = subprocess.run(["java", path, name], check=True, capture_output=True,
                               text=True).stdout.split("\n")[:256]
    table = []
    for line in lines:
        cps = line.split()
        table.append(int(cps[0], 16) if line != "-" and len(cps) == 1 else None)
    return table


def derived_table(iso_codec, layout):
    layout_table = iconv_table(layout)  # EBCDIC byte -> Latin-1 code point
    table = []
    for b in range(256):
        latin = layout_table[b]
        try:
            table.append(ord(bytes([latin]).decode(iso_codec)))
        except (UnicodeDecodeError, TypeError):
            table.append(None)
    return table


def write_ucm(directory, name, table, ebcdic, source):
    lines = [f"# {name}: {source}",
             "# Written by tools/catgen/import_codepages.py; compiled with makeconv.",
             f'<code_set_name>               "{name}"',
             "<mb_cur_max>                  1",
             "<mb_cur_min>                  1",
             '<uconv_class>                 "SBCS"',
             "<subchar>                     " + ("\\x6F" if ebcdic else "\\x3F")]
    if ebcdic:
        lines.append('<icu:charsetFamily>           "EBCDIC"')
    lines.append("CHARMAP")
    seen = set()
    entries = []
    for b, cp in enumerate(table):
        if cp is None or cp == 0xFFFD:
            continue
        # A character reached from two bytes round-trips from the first only.
        entries.append((cp, b, 3 if cp in seen else 0))
        seen.add(cp)
    for cp, b, flag in sorted(entries):
        lines.append(f"<U{cp:04X}> \\x{b:02X} |{flag}")
    lines.append("END CHARMAP")
    with open(os.path.join(directory, name + ".ucm"), "w") as f:
        f.write("\n".join(lines) + "\n")


def main():
    root = os.path.dirname(os.path.dirname(os.path.dirname(os.path.abspath(__file__))))
    out = os.path.join(root, "data", "catalogue", "ucm")
    os.makedirs(out, exist_ok=True)
    for name, (iconv_name, ebcdic) in ICONV.items():
        write_ucm(out, name, iconv_table(iconv_name), ebcdic,
                  f"byte table of the glibc iconv module {iconv_name}")
    for name, java_name in JAVA.items():
        write_ucm(out, name, java_table(java_name), False,
                  f"byte table of the Java runtime charset {java_name}")
    for name, (iso_codec, layout) in DERIVED.items():
        write_ucm(out, name, derived_table(iso_codec, layout), True,
                  f"derived: the {iso_codec} characters through the {layout} byte layout")


if __name__ == "__main__":
    main()
