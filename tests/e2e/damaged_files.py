#!/usr/bin/python3
# SPDX-License-Identifier: GPL-3.0-or-later
"""Makes a folder of damaged and hostile files, the same ones each time, for tests of what opens documents.

    damaged_files.py FOLDER     prints a line for each: the kind of view or decoder it is meant for, a tab, its name
"""
import gzip
import io
import pathlib
import random
import struct
import subprocess
import sys
import tarfile
import tempfile
import typing
import zipfile
import zlib

from PIL import Image

PICTURE, DOCUMENT, ARCHIVE, TEXT, MEDIA = "picture", "document", "archive", "text", "media"
GIBIBYTE = 1 << 30


class Sparse(typing.NamedTuple):
    """A file that takes less of the disk than it is long."""
    begin: bytes
    length: int


def noise(count, seed):
    return random.Random(seed).randbytes(count)


def flipped(content, seed, flips=12, spare=0):
    """With some bits turned over, but none in the first `spare` bytes."""
    chance = random.Random(seed)
    changed = bytearray(content)
    for _ in range(flips):
        changed[chance.randrange(spare, len(changed))] ^= 1 << chance.randrange(8)
    return bytes(changed)


def cut_and_flipped(stem, suffix, content, spare=16):
    for percent in (1, 30, 60, 97):
        yield f"{stem} cut at {percent} %{suffix}", content[:max(3, len(content) * percent // 100)]
    for seed in (1, 2, 3):
        yield f"{stem} flipped {seed}{suffix}", flipped(content, seed, spare=spare)


def picture(form, **options):
    image = Image.new("RGB", (320, 200))
    image.putdata([(x * 255 // 320, y * 255 // 200, (x * y) % 256) for y in range(200) for x in range(320)])
    out = io.BytesIO()
    image.save(out, form, **options)
    return out.getvalue()


def moving(form):
    frames = [Image.new("RGB", (120, 80), (10 * i, 200, 255 - 10 * i)) for i in range(20)]
    out = io.BytesIO()
    frames[0].save(out, form, save_all=True, append_images=frames[1:], duration=40, loop=0)
    return out.getvalue()


def chunk(kind, content, checksum=None):
    right = zlib.crc32(kind + content)
    return struct.pack(">I", len(content)) + kind + content + struct.pack(">I", right if checksum is None else checksum)


def png(width, height, depth, colour, *chunks):
    head = chunk(b"IHDR", struct.pack(">IIBBBBB", width, height, depth, colour, 0, 0, 0))
    return b"\x89PNG\r\n\x1a\n" + head + b"".join(chunks) + chunk(b"IEND", b"")


def squeezed_zeroes(count):
    """A zlib stream of so many zeroes, made without squeezing them all: the same block again and again."""
    block = 1 << 20
    packer = zlib.compressobj(9)
    begin = packer.compress(bytes(block)) + packer.flush(zlib.Z_FULL_FLUSH)
    again = packer.compress(bytes(block)) + packer.flush(zlib.Z_FULL_FLUSH)
    blocks, rest = divmod(count, block)
    if blocks == 0:
        return zlib.compress(bytes(count), 9)
    last = packer.compress(bytes(rest)) + packer.flush()
    checksum = (count % 65521) << 16 | 1
    return begin + again * (blocks - 1) + last[:-4] + struct.pack(">I", checksum)


def blank_png(width, height):
    return png(width, height, 1, 0, chunk(b"IDAT", squeezed_zeroes((width + 7) // 8 * height + height)))


def pngs():
    yield from cut_and_flipped("Picture", ".png", picture("PNG"), spare=33)
    yield "100,000 pixels wide and high.png", png(100000, 100000, 8, 6, chunk(b"IDAT", squeezed_zeroes(1 << 24)))
    yield "As large as numbers go.png", png(0x7FFFFFFF, 0x7FFFFFFF, 16, 6, chunk(b"IDAT", b"x\x9c"))
    yield "Bomb of 400 megapixels.png", blank_png(20000, 20000)
    yield "Bomb of 36 megapixels.png", blank_png(6000, 6000)
    yield "A line of a million pixels.png", blank_png(1000000, 1)
    yield "A gigabyte of notes.png", png(8, 8, 8, 0, chunk(b"zTXt", b"Comment\0\0" + squeezed_zeroes(GIBIBYTE)),
                                         chunk(b"IDAT", squeezed_zeroes(72)))
    yield "A gigabyte of colour profile.png", png(8, 8, 8, 0, chunk(b"iCCP", b"p\0\0" + squeezed_zeroes(GIBIBYTE)),
                                                  chunk(b"IDAT", squeezed_zeroes(72)))
    yield "Wrong checksum.png", png(8, 8, 8, 0, chunk(b"IDAT", squeezed_zeroes(72), 0))
    yield "No size.png", png(0, 0, 8, 0, chunk(b"IDAT", squeezed_zeroes(72)))
    yield "Nothing.png", b""
    yield "Text.png", b"This is no picture.\n"
    yield "Noise.png", b"\x89PNG\r\n\x1a\n" + noise(5000, 1)


def jpegs():
    usual = picture("JPEG", quality=85)
    yield from cut_and_flipped("Picture", ".jpg", usual, spare=4)
    yield from cut_and_flipped("Progressive", ".jpg", picture("JPEG", quality=85, progressive=True), spare=4)
    start = usual.index(b"\xff\xc0")
    yield "65,500 pixels wide and high.jpg", usual[:start + 5] + struct.pack(">HH", 65500, 65500) + usual[start + 9:]
    notes = b"Exif\0\0MM\0*" + struct.pack(">I", 8) + struct.pack(">H", 65535) + noise(200, 2)
    yield "Notes without end.jpg", usual[:2] + b"\xff\xe1" + struct.pack(">H", len(notes) + 2) + notes + usual[2:]
    late = picture("JPEG", progressive=True)
    scan = late.rindex(b"\xff\xda")
    yield "200 scans.jpg", late[:-2] + late[scan:-2] * 200 + late[-2:]


def gifs():
    yield from cut_and_flipped("Animation", ".gif", moving("GIF"), spare=13)
    head = b"GIF89a" + struct.pack("<HHBBB", 16, 16, 0x80, 0, 0) + b"\0\0\0\xff\xff\xff" + b"!\xff\x0bNETSCAPE2.0\x03\x01\0\0\0"
    frame = b"!\xf9\x04\x04\x00\x00\x00\x00" + b"," + struct.pack("<HHHHB", 0, 0, 1, 1, 0) + b"\x02\x02D\x01\0"
    yield "A million frames.gif", head + frame * 1000000 + b";"
    vast = b"GIF89a" + struct.pack("<HHBBB", 65535, 65535, 0x80, 0, 0) + head[13:]
    yield "65,535 pixels wide and high.gif", vast + frame + b";"
    outside = b"," + struct.pack("<HHHHB", 65000, 65000, 65535, 65535, 0) + b"\x02\x02D\x01\0"
    yield "Frame outside.gif", head + outside + frame + b";"


def webps():
    yield from cut_and_flipped("Picture", ".webp", picture("WEBP"), spare=20)
    yield from cut_and_flipped("Animation", ".webp", moving("WEBP"), spare=30)
    body = b"WEBPVP8X" + struct.pack("<I", 10) + b"\x02\0\0\0" + b"\xff" * 6 + b"ANIM" + struct.pack("<IIH", 6, 0, 0)
    yield "Sixteen million pixels wide.webp", b"RIFF" + struct.pack("<I", len(body)) + body


def tiffs():
    yield from cut_and_flipped("Picture", ".tif", picture("TIFF"), spare=8)

    def directory(*fields, following=0):
        entries = b"".join(struct.pack("<HHII", *field) for field in fields)
        return b"II*\0\x08\0\0\0" + struct.pack("<H", len(fields)) + entries + struct.pack("<I", following)
    shape = [(256, 4, 1, 64), (257, 4, 1, 64), (258, 3, 1, 8), (259, 3, 1, 1), (262, 3, 1, 1), (273, 4, 1, 200), (279, 4, 1, 4096)]
    yield "Directories in a circle.tif", directory(*shape, following=8) + bytes(5000)
    yield "Four billion pixels wide.tif", directory((256, 4, 1, 0xFFFFFFFF), (257, 4, 1, 0xFFFFFFFF), *shape[2:]) + bytes(5000)
    yield "100,000 pixels wide and high.tif", directory((256, 4, 1, 100000), (257, 4, 1, 100000), *shape[2:]) + bytes(5000)
    yield "Strips without end.tif", directory(*shape[:5], (273, 4, 0x3FFFFFFF, 8), (279, 4, 0x3FFFFFFF, 8)) + bytes(500)


def heifs():
    with tempfile.TemporaryDirectory() as folder:
        source, made = pathlib.Path(folder, "a.png"), pathlib.Path(folder, "a.heic")
        source.write_bytes(picture("PNG"))
        subprocess.run(["heif-enc", source, "-o", made], check=True, stdout=subprocess.DEVNULL)
        usual = made.read_bytes()
    yield from cut_and_flipped("Picture", ".heic", usual, spare=24)
    extent = usual.index(b"ispe") + 8
    yield "100,000 pixels wide and high.heic", usual[:extent] + struct.pack(">II", 100000, 100000) + usual[extent + 8:]
    heif = struct.pack(">I", 24) + b"ftypheic\0\0\0\0mif1heic"
    yield "Noise.heic", heif + noise(4000, 3)
    yield "Boxes without end.heic", heif + struct.pack(">I", 0x7FFFFFFF) + b"meta" + (struct.pack(">I", 8) + b"iloc") * 2000


def other_pictures():
    size = struct.pack("<IiiHHIIiiII", 40, 100000, 100000, 1, 24, 0, 0, 0, 0, 0, 0)
    yield "100,000 pixels wide and high.bmp", b"BM" + struct.pack("<IHHI", 54, 0, 0, 54) + size + bytes(100)
    yield "Cut.ico", picture("ICO")[:40]


def shapes(inside, head=""):
    return f'<?xml version="1.0"?>{head}<svg xmlns="http://www.w3.org/2000/svg" xmlns:xlink="http://www.w3.org/1999/xlink" ' \
           f'width="100" height="100">{inside}</svg>'.encode()


def svgs():
    usual = shapes("".join(f'<circle cx="{i}" cy="50" r="{i % 40}" fill="#{i:03x}"/>' for i in range(300)))
    yield from cut_and_flipped("Drawing", ".svg", usual, spare=60)
    yield "Nested deeply.svg", shapes("<g>" * 100000 + "</g>" * 100000)
    yield "Nested 250 deep.svg", shapes('<g opacity="0.99">' * 250 + '<rect width="9" height="9"/>' + "</g>" * 250)
    lines = "".join(f'<!ENTITY l{i} "{f"&l{i - 1};" * 10}">' for i in range(1, 12))
    yield "Entities of entities.svg", shapes("<text>&l11;</text>", f'<!DOCTYPE svg [<!ENTITY l0 "ha">{lines}]>')
    uses = "".join(f'<g id="u{i}">{f"<use xlink:href=%s/>" % repr(f"#u{i - 1}") * 10}</g>' for i in range(1, 12))
    yield "Uses of uses.svg", shapes(f'<defs><rect id="u0" width="1" height="1"/>{uses}</defs><use xlink:href="#u11"/>')
    yield "Uses in a circle.svg", shapes('<g id="a"><use xlink:href="#b"/></g><g id="b"><use xlink:href="#a"/></g>')
    yield "Pattern of itself.svg", shapes('<pattern id="p" width="9" height="9" fill="url(#p)"><rect fill="url(#p)" width="9" '
                                          'height="9"/></pattern><rect width="99" height="99" fill="url(#p)"/>')
    blur = '<filter id="f" filterUnits="userSpaceOnUse" x="-1e6" y="-1e6" width="2e6" height="2e6">' + \
           '<feTurbulence baseFrequency="0.9" numOctaves="9999"/><feGaussianBlur stdDeviation="5000"/>' * 20 + "</filter>"
    yield "Filters.svg", shapes(blur + '<rect width="99" height="99" filter="url(#f)"/>')
    yield "As wide as numbers go.svg", b'<svg xmlns="http://www.w3.org/2000/svg" width="1e30" height="1e30"><rect/></svg>'
    yield "No size.svg", b'<svg xmlns="http://www.w3.org/2000/svg" width="0" height="-5"><rect width="NaN"/></svg>'
    red = '<rect width="100" height="100" fill="#00f"/>'
    yield "References.svg", shapes(
        red + '<image xlink:href="file:///etc/passwd" width="9" height="9"/><image href="http://127.0.0.1:9/x.png" width="9" '
        'height="9"/><xi:include xmlns:xi="http://www.w3.org/2001/XInclude" href="file:///etc/passwd" parse="text"/>'
        '<text>&secret;</text>', '<!DOCTYPE svg [<!ENTITY secret SYSTEM "file:///etc/passwd">]>')
    yield "Bomb.svgz", gzip.compress(b'<svg xmlns="http://www.w3.org/2000/svg"><!--' + bytes(64 << 20) + b"--></svg>", 9, mtime=0)


def portable(*objects, trailer="/Root 1 0 R", xref=None):
    out = b"%PDF-1.5\n"
    places = []
    for number, content in enumerate(objects, 1):
        places.append(len(out))
        out += f"{number} 0 obj\n".encode() + (content if isinstance(content, bytes) else content.encode()) + b"\nendobj\n"
    table = f"xref\n0 {len(objects) + 1}\n0000000000 65535 f \n" + "".join(f"{place:010} 00000 n \n" for place in places)
    start = len(out)
    return out + (table if xref is None else xref(start)).encode() + \
        f"trailer\n<</Size {len(objects) + 1} {trailer}>>\nstartxref\n{start}\n%%EOF\n".encode()


def stream(content, words=""):
    return f"<</Length {len(content)} {words}>>\nstream\n".encode() + content + b"\nendstream"


ROOT, PAGES = "<</Type/Catalog/Pages 2 0 R>>", "<</Type/Pages/Kids[3 0 R]/Count 1>>"


def one_page(content, resources="", box="0 0 200 200", *more):
    page = f"<</Type/Page/Parent 2 0 R/MediaBox[{box}]/Contents 4 0 R/Resources<<{resources}>>>>"
    return portable(ROOT, PAGES, page, content, *more)


def documents():
    usual = one_page(stream(b"0 0 1 rg 20 20 100 100 re f"))
    yield from cut_and_flipped("Page", ".pdf", usual, spare=9)
    yield "Pages in a circle.pdf", portable(ROOT, "<</Type/Pages/Kids[2 0 R 2 0 R]/Count 2>>")
    yield "Two billion pages.pdf", portable(ROOT, "<</Type/Pages/Kids[3 0 R]/Count 2147483647>>", "<</Type/Page/Parent 2 0 R>>")
    yield "Table in a circle.pdf", portable(ROOT, PAGES, trailer="/Root 1 0 R /Prev 9")
    yield "Table elsewhere.pdf", portable(ROOT, PAGES, xref=lambda start: "xref\n0 99999999\n" + "9999999999 00000 n \n" * 50)
    yield "No root.pdf", portable("<<>>", trailer="")
    yield "Root in a circle.pdf", portable("1 0 R")
    yield "Bomb.pdf", one_page(stream(squeezed_zeroes(GIBIBYTE), "/Filter/FlateDecode"))
    twice = squeezed_zeroes(GIBIBYTE)
    yield "Bomb in a bomb.pdf", one_page(stream(zlib.compress(twice, 9), "/Filter[/FlateDecode/FlateDecode]"))
    yield "Form of itself.pdf", one_page(stream(b"/F Do"), "/XObject<</F 5 0 R>>", "0 0 200 200", stream(
        b"/F Do /F Do", "/Type/XObject/Subtype/Form/BBox[0 0 9 9]/Resources<</XObject<</F 5 0 R>>>>"))
    yield "Vast page.pdf", one_page(stream(b"0 0 1e9 1e9 re f"), "", "0 0 1e9 1e9")
    yield "Page of no size.pdf", one_page(stream(b"f"), "", "0 0 0 0")
    yield "Vast picture.pdf", one_page(stream(b"/I Do"), "/XObject<</I 5 0 R>>", "0 0 200 200", stream(
        squeezed_zeroes(1 << 20), "/Subtype/Image/Width 100000/Height 100000/BitsPerComponent 8/ColorSpace/DeviceRGB"
        "/Filter/FlateDecode"))
    yield "Arrays in arrays.pdf", portable("[" * 100000 + "]" * 100000)
    yield "Noise.pdf", b"%PDF-1.7\n" + noise(20000, 4)
    yield "Nothing.pdf", b""


def zipped(*entries, method=zipfile.ZIP_DEFLATED):
    out = io.BytesIO()
    with zipfile.ZipFile(out, "w", method, compresslevel=9) as archive:
        for name, content in entries:
            archive.writestr(zipfile.ZipInfo(name), content, method)
    return out.getvalue()


def archives():
    usual = zipped(*((f"Folder/File {i}.txt", f"Content {i}\n" * 40) for i in range(40)))
    yield from cut_and_flipped("Archive", ".zip", usual, spare=4)
    bomb = zipped(("zeroes", bytes(256 << 20)))
    yield "Bomb.zip", bomb
    yield "Bombs in a bomb.zip", zipped(*((f"{i}.zip", bomb) for i in range(16)))
    yield "Names that climb.zip", zipped(("../../../../tmp/climbed", "x"), ("/etc/climbed", "x"), ("a/../../b", "x"), ("..", "x"))
    yield "Names that lie.zip", zipped(("a\nb\x1b[31m", "x"), ("\u202egpj.exe", "x"), ("n" * 60000, "x"), ("", "x"))
    yield "60,000 entries.zip", zipped(*((f"{i:05}", "") for i in range(60000)), method=zipfile.ZIP_STORED)
    yield "Deep folders.zip", zipped(("d/" * 20000 + "f", "x"))
    end = usual.rindex(b"PK\5\6")
    yield "Entries elsewhere.zip", usual[:end + 10] + struct.pack("<HII", 65535, 0x7FFFFFFF, 0x7FFFFFF0) + b"\0\0"
    packed = io.BytesIO()
    with tarfile.open(fileobj=packed, mode="w") as archive:
        for name, kind, target in (("../climbed", tarfile.REGTYPE, ""), ("link", tarfile.SYMTYPE, "/etc"), ("link/x", tarfile.REGTYPE, ""),
                                   ("self", tarfile.LNKTYPE, "self"), ("device", tarfile.CHRTYPE, "")):
            entry = tarfile.TarInfo(name)
            entry.type, entry.linkname = kind, target
            archive.addfile(entry)
    yield "Names that climb.tar", packed.getvalue()
    yield from cut_and_flipped("Archive", ".tar", packed.getvalue(), spare=0)
    vast = bytearray(packed.getvalue()[:512])
    vast[124:136] = b"\x80" + b"\xff" * 11
    yield "Vast entry.tar", bytes(vast)
    yield "Bomb.tar.gz", gzip.compress(bytes(vast[:124]) + b"77777777777\0" + bytes(vast[136:]) + bytes(256 << 20), 9, mtime=0)
    yield "Noise.7z", b"7z\xbc\xaf\x27\x1c\0\4" + noise(3000, 5)
    yield "Noise.rar", b"Rar!\x1a\7\1\0" + noise(3000, 6)
    yield "Noise.iso", bytes(32768) + b"\1CD001\1" + noise(6000, 7)


def texts():
    yield "Noise.txt", noise(300000, 8)
    yield "Program.txt", b"\x7fELF\2\1\1" + bytes(9) + noise(100000, 9)
    yield "Zeroes.txt", bytes(1 << 20)
    yield "One long line.txt", b"word " * (4 << 20)
    yield "Broken letters.txt", "Grüße aus 東京 😀\n".encode() * 2000 + b"\xff\xfe\xc0\x80\xed\xa0\x80" * 500
    yield "Half a letter.txt", "\ufeffGrüße\n".encode("utf-16-le") * 100 + b"x"
    yield "Marks without letters.txt", ("a" + "\u0301" * 100000 + "\n").encode()
    yield "Directions.txt", ("\u202e\u2066" * 20000 + "text\n").encode()
    yield "Controls.txt", bytes(range(256)) * 100
    yield "Nothing.txt", b""
    yield "Two gibibytes.txt", Sparse(b"A line at the beginning.\n" * 5000, 2 * GIBIBYTE)
    yield "Two gibibytes of nothing.txt", Sparse(b"", 2 * GIBIBYTE)
    yield "Quotes in quotes.md", b">" * 100000 + b"x\n"
    yield "Brackets.md", b"[" * 100000 + b"](x)\n"
    yield "Lists in lists.md", b"".join(b" " * i + b"- x\n" for i in range(2000))
    yield "Braces.json", b"[" * 1000000


def media():
    def riff(kind, body):
        return b"RIFF" + struct.pack("<I", 0xFFFFFFFF) + kind + body
    form = struct.pack("<HHIIHH", 1, 65535, 0xFFFFFFFF, 0, 0, 0)
    yield "Format of lies.wav", riff(b"WAVE", b"fmt " + struct.pack("<I", 16) + form + b"data" + struct.pack("<I", 0xFFFFFFFF) + bytes(99))
    yield "Noise.avi", riff(b"AVI ", b"LIST" + struct.pack("<I", 0xFFFFFFFF) + b"hdrlavih" + noise(5000, 10))
    yield "Noise.mp3", b"ID3\4\0\0\x7f\x7f\x7f\x7f" + noise(8000, 11)
    yield "Boxes in boxes.mp4", struct.pack(">I", 16) + b"ftypisom\0\0\0\0" + (struct.pack(">I", 0x7FFFFFFF) + b"moov") * 5000
    yield "Box of nothing.mp4", struct.pack(">I", 16) + b"ftypisom\0\0\0\0" + struct.pack(">I", 0) + b"moov"
    yield "Noise.ogg", b"OggS\0\2" + bytes(8) + noise(8000, 12)
    yield "Element without end.mkv", b"\x1a\x45\xdf\xa3\x93\x42\x82\x88matroska\x18\x53\x80\x67\x01" + b"\xff" * 7 + noise(8000, 13)
    yield "Block of lies.flac", b"fLaC\0\xff\xff\xff" + noise(8000, 14)
    yield "Nothing.mp4", b""


def write(path, content):
    with open(path, "wb") as file:
        file.write(content.begin if isinstance(content, Sparse) else content)
        if isinstance(content, Sparse):
            file.truncate(content.length)


MAKERS = ((PICTURE, (pngs, jpegs, gifs, webps, tiffs, heifs, other_pictures, svgs)), (DOCUMENT, (documents,)), (ARCHIVE, (archives,)),
          (TEXT, (texts,)), (MEDIA, (media,)))


def make(folder, kinds=(PICTURE, DOCUMENT, ARCHIVE, TEXT, MEDIA)):
    """Writes the files of these kinds into the folder; a list of (kind, name). "Bomb.zip" and its like unpack to much, so
    nothing but what is under test should open them."""
    folder = pathlib.Path(folder)
    folder.mkdir(parents=True, exist_ok=True)
    made = []
    for kind, makers in MAKERS:
        if kind not in kinds:
            continue
        for maker in makers:
            for name, content in maker():
                write(folder / name, content)
                made.append((kind, name))
    return made


if __name__ == "__main__":
    for line in make(sys.argv[1], sys.argv[2:] or (PICTURE, DOCUMENT, ARCHIVE, TEXT, MEDIA)):
        print("\t".join(line))
