#!/usr/bin/python3
"""Learns what the gesture engine recognises digits by, and prints it as C++: platform/libgesture/templates.inc.

    scripts/learn_digits.py [FOLDER] >platform/libgesture/templates.inc

FOLDER has the drawings of each digit, digit_0.csv.gz to digit_9.csv.gz; the default is data/digits. The method is nearest
neighbour under dynamic time warping (Sakoe and Chiba, Dynamic programming algorithm optimization for spoken word
recognition, 1978): each drawing becomes a template. All arithmetic is in integers, and the same as the engine's, in
platform/libgesture/drawing.cpp and warping.cpp. Needs Debian's python3-numpy.
"""

import csv
import gzip
import os
import sys

import numpy as np

MOST_GROUPS = 170  # what a record of the engine holds
POINTS = 24
SCALE = 10  # what the root mean square becomes
MOST_VALUE = 27  # values are clipped to this size
BAND = 6
COLUMNS = ["ax_mm_s2", "ay_mm_s2", "az_mm_s2", "gx_mrad_s", "gy_mrad_s", "gz_mrad_s"]

# Digits that stay the same in a mirror: the writer may draw them either way round.
SYMMETRIC = (0, 8)

# How limits follow from distances. A simple shape is near to many movements, so its limit also follows from how near
# the drawings of other digits come to it.
OWN_QUANTILE, OWN_FACTOR = 0.99, 1.05
OTHERS_QUANTILE, OTHERS_FACTOR = 0.05, 1.25
SIZE_FACTOR = 1.25  # how much smaller or larger than the learned drawings a drawing may be


def read_drawings(folder):
    """The drawings in time order: (digit, number of the drawing, groups as the engine takes them)."""
    drawings = []
    for digit in range(10):
        path = os.path.join(folder, f"digit_{digit}.csv.gz")
        samples = {}
        with gzip.open(path, "rt", newline="") as file:
            for row in csv.DictReader(file):
                samples.setdefault(int(row["drawing"]), []).append([int(row[name]) for name in COLUMNS])
        drawings += [(digit, number, record_of(np.array(rows))) for number, rows in samples.items()]
    return drawings


def record_of(samples):
    """Every nth sample, so that they fit into a record, with the acceleration in 1/1000 of standard gravity."""
    groups = samples[:: -(-len(samples) // MOST_GROUPS)].astype(np.int64)
    groups[:, :3] = (groups[:, :3] * 200000 + 980665) // (2 * 980665)
    return groups


def root(squares):
    """The integer part of the square root."""
    return np.sqrt(squares.astype(np.float64)).astype(np.int64)


def moving_part(groups):
    """The groups without the still ones at both ends."""
    rate = np.pad(root((groups[:, 3:] ** 2).sum(axis=1)), 2, "edge")
    motion = np.convolve(rate, np.ones(5, dtype=np.int64), "valid")
    high = np.sort(motion)[(len(motion) - 1) * 19 // 20]
    moving = np.flatnonzero(motion * 20 > high)
    return groups[moving[0] : moving[-1] + 1]


def describe(groups):
    """The points of a drawing, and the size of its movement: of the acceleration and of the angular rate."""
    groups = moving_part(groups)
    count = len(groups)
    # In units of 1/POINTS of a group: group i spans [POINTS * i, POINTS * (i + 1)), point p spans [count * p, ...).
    sums = np.vstack([np.zeros((1, 6), dtype=np.int64), np.cumsum(groups * POINTS, axis=0)])
    ends = np.arange(POINTS + 1) * count
    whole = np.minimum(ends // POINTS, count - 1)
    integral = sums[whole] + groups[whole] * (ends - whole * POINTS)[:, None]
    points = np.diff(integral, axis=0)  # count times the mean of the groups
    points = (POINTS * points - points.sum(axis=0)) * 16 // (POINTS * count)
    sizes = []
    for half in (points[:, :3], points[:, 3:]):
        size = root((half**2).sum() // (POINTS * 3))
        half[:] = np.clip((2 * SCALE * half + size) // (2 * size), -MOST_VALUE, MOST_VALUE)
        sizes.append(int(size) // 16)
    return points, sizes


def mirrored(points):
    """As drawn in a mirror: left and right change places, and so does the sense of turning about the other two axes."""
    return points * np.array([-1, 1, 1, 1, -1, -1])


def distances(a, b):
    """The warping distance of each drawing of a to each of b."""
    far = np.int32(1 << 20)
    a, b = a.astype(np.int32), b.astype(np.int32)
    above = np.full((len(a), len(b), POINTS + 1), far, dtype=np.int32)
    above[:, :, 0] = 0
    for i in range(POINTS):
        row = np.full_like(above, far)
        for j in range(max(0, i - BAND), min(POINTS, i + BAND + 1)):
            squares = ((a[:, None, i] - b[None, :, j]) ** 2).sum(axis=2)
            before = np.minimum(np.minimum(above[:, :, j], above[:, :, j + 1]), row[:, :, j])
            row[:, :, j + 1] = root(64 * squares) + before
        above = row
    return above[:, :, POINTS]


def distances_among(digits, points):
    """Of each drawing to each other, or to its mirror image where the digit of the other is symmetric."""
    result = distances(points, points)
    symmetric = np.isin(digits, SYMMETRIC)
    result[:, symmetric] = np.minimum(result[:, symmetric], distances(mirrored(points), points[symmetric]))
    np.fill_diagonal(result, 1 << 20)
    return result


def text_of(points):
    """A character each value: @ is 0, A is 1, and before @ comes -1: >, so that a C++ string needs no escape."""
    return "".join(chr(value + ord("@" if value >= 0 else "?")) for value in points.ravel().tolist())


def quantile(values, share):
    return int(np.sort(values)[int(share * (len(values) - 1) + 0.5)])


def limits_of(digits, among):
    """For each digit, the largest distance to the nearest template at which a drawing counts as that digit."""
    own = [among[i, digits == digit].min() for i, digit in enumerate(digits)]
    common = OWN_FACTOR * quantile(own, OWN_QUANTILE)
    limits = []
    for digit in range(10):
        others = among[np.ix_(digits != digit, digits == digit)].min(axis=1)
        limits.append(int(min(common, OTHERS_FACTOR * quantile(others, OTHERS_QUANTILE))))
    return limits


def learn(drawings):
    """The text of the C++ file for (digit, number, groups) of at least two drawings of each digit."""
    digits = np.array([digit for digit, _, _ in drawings])
    described = [describe(groups) for _, _, groups in drawings]
    points = np.array([points for points, _ in described])
    sizes = np.array([sizes for _, sizes in described])
    limits = limits_of(digits, distances_among(digits, points))
    least, most = (sizes.min(axis=0) / SIZE_FACTOR).astype(int), (sizes.max(axis=0) * SIZE_FACTOR).astype(int)
    lines = [
        "// Generated by scripts/learn_digits.py: do not edit.",
        f"const std::array<std::uint32_t, 10> kLimits = {{{', '.join(map(str, limits))}}};",
        f"const SizeRange kAccelerationRange = {{{least[0]}, {most[0]}}};",
        f"const SizeRange kRateRange = {{{least[1]}, {most[1]}}};",
        "const Template kTemplates[] = {",
    ]
    for digit, values in zip(digits, points):
        lines.append(f'{{{digit},"{text_of(values)}"}},')
    return "\n".join(lines + ["};", ""])


def main():
    if len(sys.argv) > 2:
        sys.exit(f"usage: {sys.argv[0]} [FOLDER]")
    repository = os.path.dirname(os.path.dirname(os.path.abspath(__file__)))
    sys.stdout.write(learn(read_drawings(sys.argv[1] if len(sys.argv) == 2 else os.path.join(repository, "data/digits"))))


if __name__ == "__main__":
    main()
