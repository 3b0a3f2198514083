"""Packages written by uipack open with olefile, an independent compound file reader: every
stream is where its request name's digest says, with the plain length, the stored length and
the size the layout gives. Covers mini streams, streams of their own sectors, and a package
large enough to need DIFAT sectors.

Usage: olefile_reads_packages.py UIPACK RESOURCES_UI_FOLDER BUILT_PACKAGE"""
import hashlib
import os
import struct
import subprocess
import sys
import tempfile

import olefile


def stream_name(request):
    upper = "".join(c.upper() if "a" <= c <= "z" else c for c in request)
    return hashlib.md5(upper.encode("utf-16-le")).hexdigest()[:30]


def check(package, files):
    """files: request name -> plain length"""
    ole = olefile.OleFileIO(package, raise_defects=olefile.DEFECT_INCORRECT)
    found = {entry[0] for entry in ole.listdir(streams=True, storages=True)}
    expected = {stream_name(name) for name in files}
    assert found == expected, (sorted(found), sorted(expected))
    for request, plain in files.items():
        data = ole.openstream(stream_name(request)).read()
        p, s = struct.unpack("<II", data[:8])
        assert p == plain, (request, p, plain)
        assert s == (plain + 7) // 8 * 8, (request, s)
        assert len(data) == 8 + s, (request, len(data), s)
    ole.close()


def files_below(folder):
    found = {}
    for root, _, names in os.walk(folder):
        for name in names:
            path = os.path.join(root, name)
            request = os.path.relpath(path, folder).replace(os.sep, "/")
            if request != "README.md":
                found[request] = os.path.getsize(path)
    return found


def main():
    uipack, resources, built = sys.argv[1:4]
    check(built, files_below(resources))

    sizes = {"empty.htm": 0, "one.css": 1, "whole.htm": 504, "odd.htm": 761,
             "last-mini.png": 4080, "first-large.png": 4081, "images/largest.png": 42000,
             "images/many/sectors.bin": 9 * 1024 * 1024}
    with tempfile.TemporaryDirectory() as work:
        source = os.path.join(work, "ui")
        for request, size in sizes.items():
            path = os.path.join(source, *request.split("/"))
            os.makedirs(os.path.dirname(path), exist_ok=True)
            with open(path, "wb") as out:
                out.write(os.urandom(size))
        package = os.path.join(work, "ui.pack")
        subprocess.run([uipack, source, package], check=True, stdout=subprocess.DEVNULL)
        check(package, sizes)
    print("olefile read", len(sizes), "streams and the built package")


main()
