"""Holds the figures of tests/published against PROJ, GeographicLib or the sums of harmonics.py."""

import warnings

import mpmath as mp
import numpy as np
from geographiclib.geodesic import Geodesic
from pyproj import CRS, Proj, Transformer

import harmonics
from library import SOURCE, proj_text

warnings.filterwarnings("ignore")


def angle(text):
    value = sum(abs(float(part)) / 60 ** i for i, part in enumerate(text.split(":")))
    return -value if text.startswith("-") else value


def numbers(line):
    row = []
    for word in line.split():
        if word in "SW":
            row[-1] = -row[-1]
        elif word not in "NE":
            row.append(angle(word))
    return row


def blocks():
    for path in sorted((SOURCE / "tests" / "published").glob("*.txt")):
        block = None
        for line in path.read_text().splitlines():
            key, found, value = line.partition(": ")
            if not line or line.startswith("#"):
                continue
            if not found:
                block["rows"].append(numbers(line))
            elif key == "source":
                if block:
                    yield block
                block = {"file": path.stem, "source": value, "rows": []}
            else:
                block[key] = value
        yield block


def peer_of(block):
    """The peer's name, and its results in the block's columns."""
    rows = np.array(block["rows"])
    if "geodesic" in block:
        figure = dict(word.split("=") for word in block["geodesic"].split())
        g = Geodesic(float(figure["a"]), 1 / float(figure["rf"]))
        ends = [g.Inverse(r[0], r[1], r[4], r[5]) for r in rows]
        return "GeographicLib", np.array([[e["s12"]] for e in ends]), rows[:, 3:4]
    if "magnetic" in block:
        name, date = block["magnetic"].split()
        with mp.workdps(30):
            model = harmonics.of_store(SOURCE / "data", name, float(date))
            return "accuracy/harmonics.py", np.array(
                [[float(v) for v in harmonics.field(model, r[1], r[0], r[2])]
                 for r in rows]), rows[:, 3:6]
    if block["system"].startswith("EPSG:"):
        crs = CRS.from_user_input(block["system"])
        meridian = crs.prime_meridian
        shift = meridian.longitude * meridian.unit_conversion_factor * 180 / np.pi
        # from Greenwich, on the system's own datum
        base = CRS.from_json_dict({**crs.geodetic_crs.to_json_dict()})
        peer = Transformer.from_crs(base, crs, always_xy=True)
        lon = rows[:, 1] if shift == 0 or base.prime_meridian.longitude else rows[:, 1] + shift
        unit = base.axis_info[0].unit_conversion_factor * 180 / np.pi
        return "PROJ", np.column_stack(peer.transform(lon / unit, rows[:, 0] / unit)), rows[:, 2:4]
    return "PROJ", np.column_stack(Proj(proj_text(block["system"]))(rows[:, 1], rows[:, 0])), \
        rows[:, 2:4]


def main():
    agree, others = 0, []
    for block in blocks():
        what = f"{block['file']}: {block['source']}"
        try:
            peer, computed, printed = peer_of(block)
        except Exception as reason:
            others.append(f"{what}: the peer has no formula ({str(reason)[:60]})")
            continue
        # Southing and westing may come in the other order.
        off = min(np.abs(computed - printed).max(), np.abs(computed[:, ::-1] - printed).max())
        if off <= float(block["within"]):
            agree += 1
        else:
            others.append(f"{what}: {off:.6g} from {peer}")
    print(f"{agree} published blocks agree with an independent peer to the digits printed")
    for line in others:
        print("  not:", line)


if __name__ == "__main__":
    main()
