"""RemoveTlsDirectory.py FILE: takes the directory of thread-local storage out of a DLL's header.

MinGW's runtime puts one into every DLL, and Windows refuses to switch thread notifications off for a DLL that has one. For
a DLL that keeps nothing per thread.
"""
import struct
import sys

with open(sys.argv[1], "r+b") as file:
    data = file.read()
    header = struct.unpack_from("<I", data, 0x3C)[0]
    if data[header:header + 4] != b"PE\0\0" or struct.unpack_from("<H", data, header + 24)[0] != 0x20B:
        sys.exit(sys.argv[1] + ": no DLL of 64 bits")
    file.seek(header + 24 + 112 + 9 * 8)
    file.write(bytes(8))
