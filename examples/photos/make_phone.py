#!/usr/bin/env python3
"""Makes phone.jpg: coffee.png as a telephone might have taken it.

Usage: make_phone.py [CJPEG]

Its colours are those of Display P3, more saturated than sRGB can show, with a profile of its own; it is stored on its
side, with Exif (orientation 6 and a thumbnail), XMP and IPTC. Needs nothing but Python and cjpeg of Debian's
libjpeg-turbo-progs; writes the same bytes each time.
"""
import pathlib
import struct
import subprocess
import sys
import zlib

FOLDER = pathlib.Path(__file__).resolve().parent
SATURATION = 1.2  # in linear light

# Linear light of sRGB in primaries of Display P3, and what both make of brightness (CIE Y).
SRGB_TO_P3 = ((0.8225, 0.1775, 0.0), (0.0332, 0.9668, 0.0), (0.0171, 0.0724, 0.9105))
P3_BRIGHTNESS = (0.2290, 0.6917, 0.0793)

# Red, green and blue of Display P3 in CIE XYZ, adapted to D50; the white of sRGB to D50; the curve of sRGB.
P3_COLORANTS = ((0.51512, 0.24119, -0.00105), (0.29198, 0.69224, 0.04188), (0.15710, 0.06657, 0.78407))
D50 = (0.9642, 1.0, 0.8249)
D65_TO_D50 = (1.04788, 0.02292, -0.05022, 0.02959, 0.99048, -0.01707, -0.00925, 0.01508, 0.75168)
CURVE = (2.4, 1 / 1.055, 0.055 / 1.055, 1 / 12.92, 0.04045)

TITLE = "Cup of coffee"
CREATOR = "Rachel Michetti"
RIGHTS = "CC0"
DATE = (2026, 1, 2, 15, 4, 5)
EXIF_DATE = "%d:%02d:%02d %02d:%02d:%02d" % DATE
XMP_DATE = "%d-%02d-%02dT%02d:%02d:%02d" % DATE
LONG = {0x8769, 0x0201, 0x0202, 0xa002, 0xa003}  # tags of Exif with numbers of 32 bits; the others have 16


def read_png(path):
    """Width, height and rows of an 8-bit RGB file that is not interlaced."""
    data, offset, pixels = path.read_bytes(), 8, b""
    while offset < len(data):
        length, kind = struct.unpack_from(">I4s", data, offset)
        body = data[offset + 8:offset + 8 + length]
        if kind == b"IHDR":
            width, height, *rest = struct.unpack(">IIBBBBB", body)
            assert rest == [8, 2, 0, 0, 0]
        elif kind == b"IDAT":
            pixels += body
        offset += length + 12
    pixels, rows, above = zlib.decompress(pixels), [], bytes(3 * width)
    for y in range(height):
        start = y * (3 * width + 1)
        row = bytearray(pixels[start + 1:start + 1 + 3 * width])
        for i, stored in enumerate(row):
            left, corner = (row[i - 3], above[i - 3]) if i >= 3 else (0, 0)
            near = min((abs(above[i] - corner), 0, left), (abs(left - corner), 1, above[i]),
                       (abs(left + above[i] - 2 * corner), 2, corner))[2]
            row[i] = (stored + (0, left, above[i], (left + above[i]) // 2, near)[pixels[start]]) % 256
        rows.append(bytes(row))
        above = row
    return width, height, rows


def light(code):
    return code / 12.92 if code <= 0.04045 else ((code + 0.055) / 1.055) ** 2.4


def code(light):
    light = min(max(light, 0), 1)
    return round(255 * (12.92 * light if light <= 0.0031308 else 1.055 * light ** (1 / 2.4) - 0.055))


LIGHTS = [light(value / 255) for value in range(256)]


def saturated(colour):
    """Codes of sRGB as codes of Display P3, further from grey."""
    srgb = [LIGHTS[value] for value in colour]
    p3 = [sum(a * b for a, b in zip(row, srgb)) for row in SRGB_TO_P3]
    grey = sum(a * b for a, b in zip(P3_BRIGHTNESS, p3))
    return bytes(code(grey + SATURATION * (value - grey)) for value in p3)


def jpeg(cjpeg, width, height, pixels, quality):
    """The segments behind the first, which says that the file is JFIF."""
    ppm = b"P6\n%d %d\n255\n" % (width, height) + pixels
    data = subprocess.run([cjpeg, "-quality", str(quality), "-optimize"], input=ppm, capture_output=True,
                          check=True).stdout
    assert data[2:4] == b"\xff\xe0"
    return data[4 + int.from_bytes(data[4:6], "big"):]


def segment(marker, body):
    return struct.pack(">BBH", 0xff, marker, len(body) + 2) + body


def fixed(*values):
    return b"".join(struct.pack(">i", round(value * 65536)) for value in values)


def profile():
    """An ICC profile of version 4.3."""
    def text(value):
        return b"mluc" + struct.pack(">4xII2s2sII", 1, 12, b"en", b"US", 2 * len(value), 28) + value.encode("utf-16-be")

    tags = {b"desc": text("ORU sample P3"), b"cprt": text("CC0"), b"wtpt": b"XYZ \0\0\0\0" + fixed(*D50),
            b"chad": b"sf32\0\0\0\0" + fixed(*D65_TO_D50)}
    for name, colorant in zip((b"rXYZ", b"gXYZ", b"bXYZ"), P3_COLORANTS):
        tags[name] = b"XYZ \0\0\0\0" + fixed(*colorant)
    for name in (b"rTRC", b"gTRC", b"bTRC"):
        tags[name] = b"para\0\0\0\0\0\3\0\0" + fixed(*CURVE)
    start, table, bodies, places = 128 + 4 + 12 * len(tags), struct.pack(">I", len(tags)), b"", {}
    for name, body in tags.items():
        if body not in places:
            places[body] = start + len(bodies)
            bodies += body + bytes(-len(body) % 4)
        table += struct.pack(">4sII", name, places[body], len(body))
    header = struct.pack(">I4xI4s4s4s6H4s", start + len(bodies), 0x04300000, b"mntr", b"RGB ", b"XYZ ", *DATE, b"acsp")
    return (header.ljust(68, b"\0") + fixed(*D50)).ljust(128, b"\0") + table + bodies


def ifd(offset, entries, following=False):
    """A list of a TIFF file at an offset, and its data; another list may follow."""
    table, data, start = struct.pack("<H", len(entries)), b"", offset + 2 + 12 * len(entries) + 4
    for tag, value in sorted(entries.items()):
        if isinstance(value, str):
            kind, count, body = 2, len(value) + 1, value.encode() + b"\0"
        elif isinstance(value, tuple):
            kind, count, body = 5, 1, struct.pack("<II", *value)
        else:
            kind, count, body = (3, 1, struct.pack("<H2x", value)) if tag not in LONG else (4, 1, struct.pack("<I", value))
        if len(body) > 4:
            table += struct.pack("<HHII", tag, kind, count, start + len(data))
            data += body + bytes(len(body) % 2)
        else:
            table += struct.pack("<HHI4s", tag, kind, count, body)
    return table + struct.pack("<I", start + len(data) if following else 0) + data


def exif(width, height, thumbnail):
    main = {0x010e: TITLE, 0x010f: "ORU", 0x0110: "ORU sample", 0x0112: 6, 0x011a: (72, 1), 0x011b: (72, 1), 0x0128: 2,
            0x0132: EXIF_DATE, 0x013b: CREATOR, 0x8298: RIGHTS, 0x8769: 0}
    camera = {0x829a: (1, 60), 0x829d: (18, 10), 0x8827: 125, 0x9003: EXIF_DATE, 0x920a: (42, 10), 0xa001: 65535,
              0xa002: width, 0xa003: height, 0xa434: "ORU sample lens"}
    main[0x8769] = 8 + len(ifd(8, main, True))
    lists = ifd(8, main, False)
    lists += ifd(8 + len(lists), camera)
    place = 8 + len(lists)
    small = {0x0103: 6, 0x011a: (72, 1), 0x011b: (72, 1), 0x0128: 2, 0x0201: 0, 0x0202: len(thumbnail)}
    small[0x0201] = place + len(ifd(place, small))
    # The first list tells where the second one begins, behind the camera's.
    link = 8 + 2 + 12 * len(main) - 8
    lists = lists[:link] + struct.pack("<I", place) + lists[link + 4:]
    return b"Exif\0\0" + struct.pack("<2sHI", b"II", 42, 8) + lists + ifd(place, small) + thumbnail


def xmp():
    return ("""http://ns.adobe.com/xap/1.0/\0<?xpacket begin="\ufeff" id="W5M0MpCehiHzreSzNTczkc9d"?>
<x:xmpmeta xmlns:x="adobe:ns:meta/"><rdf:RDF xmlns:rdf="http://www.w3.org/1999/02/22-rdf-syntax-ns#">
<rdf:Description rdf:about="" xmlns:xmp="http://ns.adobe.com/xap/1.0/" xmlns:dc="http://purl.org/dc/elements/1.1/"
 xmp:Rating="4" xmp:CreateDate="%s">
<dc:title><rdf:Alt><rdf:li xml:lang="x-default">%s</rdf:li></rdf:Alt></dc:title>
<dc:creator><rdf:Seq><rdf:li>%s</rdf:li></rdf:Seq></dc:creator>
</rdf:Description></rdf:RDF></x:xmpmeta>
<?xpacket end="r"?>""" % (XMP_DATE, TITLE, CREATOR)).encode()


def iptc():
    records = ((1, 90, b"\x1b%G"), (2, 5, TITLE.encode()), (2, 25, b"coffee"), (2, 25, b"cup"), (2, 80, CREATOR.encode()),
               (2, 116, RIGHTS.encode()))
    data = b"".join(struct.pack(">BBBH", 0x1c, record, number, len(text)) + text for record, number, text in records)
    return b"Photoshop 3.0\0" + struct.pack(">4sHHI", b"8BIM", 0x0404, 0, len(data)) + data + bytes(len(data) % 2)


def main(cjpeg="cjpeg"):
    width, height, rows = read_png(FOLDER / "coffee.png")
    rows = [[saturated(row[3 * x:3 * x + 3]) for x in range(width)] for row in rows]
    # On its side: the picture's last column is the first row of the file.
    stored = [[rows[y][width - 1 - x] for y in range(height)] for x in range(width)]
    small = [[row[x] for x in range(0, height, 4)] for row in stored[::4]]
    pixels, thumbnail = (b"".join(b"".join(row) for row in picture) for picture in (stored, small))
    thumbnail = b"\xff\xd8" + jpeg(cjpeg, len(small[0]), len(small), thumbnail, 70)
    history = [segment(0xe1, exif(height, width, thumbnail)), segment(0xe1, xmp()), segment(0xed, iptc()),
               segment(0xe2, b"ICC_PROFILE\0\1\1" + profile())]
    (FOLDER / "phone.jpg").write_bytes(b"\xff\xd8" + b"".join(history) + jpeg(cjpeg, height, width, pixels, 85))


if __name__ == "__main__":
    main(*sys.argv[1:])
