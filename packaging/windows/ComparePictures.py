#!/usr/bin/env python3
"""ComparePictures.py FOLDER OTHER: says how many pictures of two folders are the same byte for byte, and by how much
the others differ. Ends with 1 where one folder has a picture that the other has not."""
import pathlib
import sys

from PIL import Image, ImageChops


def pictures_of(folder):
    return {path.name: path for path in pathlib.Path(folder).iterdir()
            if path.suffix in (".jpg", ".png")}


def difference_of(path, other):
    """The number of pixels that differ, of all, and the largest difference of one of their values."""
    with Image.open(path) as one, Image.open(other) as two:
        if one.size != two.size:
            return None
        bands = ImageChops.difference(one.convert("RGB"), two.convert("RGB")).split()
    largest = ImageChops.lighter(ImageChops.lighter(bands[0], bands[1]), bands[2])
    counts = largest.histogram()
    return sum(counts[1:]), sum(counts), max(i for i, count in enumerate(counts) if count)


def main(folder, other):
    ours, theirs = pictures_of(folder), pictures_of(other)
    if not ours or ours.keys() != theirs.keys():
        print("only in one of the folders:", *sorted(ours.keys() ^ theirs.keys()))
        return 1
    unlike = [name for name in sorted(ours) if ours[name].read_bytes() != theirs[name].read_bytes()]
    print(f"{len(ours) - len(unlike)} of {len(ours)} pictures are the same byte for byte")
    for name in unlike:
        found = difference_of(ours[name], theirs[name])
        print(f"  {name}:", "another size" if found is None else
              f"{found[0]} of {found[1]} pixels differ, by at most {found[2]} of 255")
    return 0


if __name__ == "__main__":
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    sys.exit(main(*sys.argv[1:]))
