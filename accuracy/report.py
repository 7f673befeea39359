"""Measures everything and writes docs/accuracy.md with its pictures."""

import datetime
import re
import sys
import time
import warnings

import matplotlib

matplotlib.use("Agg")
import matplotlib.pyplot as plt
import mpmath as mp
import numpy as np
from geographiclib.geodesic import Geodesic
from matplotlib.colors import LogNorm

import formulas as f
import geodesy
import projections
import systems
from library import PROTOTYPES, SOURCE, Lines, Projection, contract, points
from measure import A, DEGREE, E, INVERSE_F, apart, on_the_ground

warnings.filterwarnings("ignore")
PICTURES = SOURCE / "docs" / "pictures"
FLAT = 1 / INVERSE_F

# Functions that give names, texts, counts or constants of other functions: nothing to be off.
EXACT = (
    (r"_(c|param|stp|latTs|sTlat)$|^TWum_|^TWrslv_|^TWups$|^TWuk_n_grid$|^TWmadagascar$|^TWsomps$",
     "constants and parameters of families; they enter the rows of their families"),
    (r"_(cnt|tol|fnam|fhdr|info|names|nam_t_num|num_t_nam|get_\w+|id2name|name2id)$|_cnt_|^TWget_|"
     r"^TWmag|^TWmm_|^TWepoch|^TWsp|^TWvd|^TWund|^TWcs|^TWdt", "names, counts and rows of the store"),
    (r"ascii|to_asc$|^TWclass_to|^TWnum_to|_nam$|_num$|_buf$|to_from$|_local$|^TWloc_",
     "texts, names and nodes as they stand in files: exact digit by digit, tested in tests/unit"),
    (r"^TWverify_|prec$", "limits of angles and of digits: exact by comparison"),
)


def collected():
    start = time.process_time()
    rows = {}
    for title, source in (("projections", projections), ("geodesy", geodesy), ("systems", systems)):
        rows[title] = []
        for row in source.rows():
            rows[title].append(row)
            print(f"{time.process_time() - start:6.0f} s  {row.family}", flush=True)
    return rows


def uncovered(rows):
    """Exported functions that no row names, by the reason why; those without one under ''."""
    named = " ".join(row.calls for group in rows.values() for row in group)
    stems = {name[:-1] for name in re.findall(r"`(\w+\*)`", named)}
    result = {}
    for name in sorted(PROTOTYPES):
        if re.search(rf"`{name}`", named) or any(name.startswith(stem) for stem in stems):
            continue
        reason = next((why for pattern, why in EXACT if re.search(pattern, name)), "")
        result.setdefault(reason, []).append(name)
    return result


# --- pictures ----------------------------------------------------------------------------------


def save(figure, name):
    figure.savefig(PICTURES / name, format="svg", bbox_inches="tight",
                   metadata={"Date": None, "Creator": "scripts/accuracy"})
    plt.close(figure)


def transverse_picture():
    reference = f.transverse_mercator(mp.mpf(E), 0, 0)
    lon, lat = np.linspace(0.5, 34.5, 24), np.linspace(0, 84, 22)
    grid = np.array([[a, b] for b in lat for a in lon])
    exact = [[A * v for v in reference(mp.radians(mp.mpf(float(a))), mp.radians(mp.mpf(float(b))))]
             for a, b in grid]
    k = {**contract("TWt_merc_c", e=E, lat0=0), "e": E, "lon0": 0.0, "lat0": 0.0}
    ours = apart(exact, A * points("TWt_merc_f", grid * DEGREE, **k))
    new = apart(exact, Projection("transverse mercator lat0=0 lon0=0 k0=1 ellps=GRS80").forward(grid))
    figure, axes = plt.subplots(1, 2, figsize=(9, 3.6), sharey=True)
    for axis, values, title in ((axes[0], ours, "the contract's series (TWt_merc_f)"),
                                (axes[1], new, "systems layer")):
        shown = axis.contourf(lon, lat, np.maximum(values, 1e-10).reshape(len(lat), len(lon)),
                              levels=10.0 ** np.arange(-10, 4), norm=LogNorm(1e-10, 1e3),
                              cmap="viridis")
        axis.set_title(title, fontsize=10)
        axis.set_xlabel("degrees from the central meridian")
    axes[0].set_ylabel("latitude")
    figure.colorbar(shown, ax=axes, label="error, metres")
    save(figure, "accuracy_transverse_mercator.svg")


def geodesic_picture():
    g = Geodesic(A, FLAT)
    azimuth = np.concatenate([np.linspace(0.5, 88, 60), np.linspace(88, 92, 160),
                              np.linspace(92, 179.5, 60)])
    figure, axis = plt.subplots(figsize=(7, 3.6))
    lines = Lines(0, A, FLAT)
    for length, colour in ((1e6, "C0"), (5e6, "C1"), (1e7, "C2")):
        ends = [g.Direct(30, 0, azi, length) for azi in azimuth]
        old = []
        for end in ends:
            c = contract("TWgeodesic_inv", start=(0, 30 * DEGREE, 0),
                         end=(end["lon2"] * DEGREE, end["lat2"] * DEGREE, 0), a=A, e=E)
            old.append(abs(c["distance"][0] - length))
        axis.semilogy(azimuth, np.maximum(old, 1e-10), ".", ms=3, color=colour,
                      label=f"TWgeodesic_inv, {length / 1000:,.0f} km")
        new = lines.inverse(np.zeros(len(ends)), np.full(len(ends), 30.0),
                            np.array([e["lon2"] for e in ends]), np.array([e["lat2"] for e in ends]))[0]
        axis.semilogy(azimuth, np.maximum(np.abs(new - length), 1e-10), "-", lw=0.6, color=colour)
    axis.plot([], [], "-", lw=0.6, color="black", label="systems layer, the same lengths")
    axis.set_xlabel("azimuth at the start, latitude 30")
    axis.set_ylabel("error of the length, metres")
    axis.legend(fontsize=8)
    save(figure, "accuracy_geodesic_inverse.svg")


def equidistant_picture():
    g = Geodesic(A, FLAT)
    distance = np.logspace(4, 7.2, 40)
    k = {**contract("TWaz_eq_c", e=E, lat0=50 * DEGREE), "e": E, "lon0": 0.0, "lat0": 50 * DEGREE}
    map_ = Projection("azimuthal equidistant lat0=50 lon0=0 ellps=GRS80")
    old, new = [], []
    for s in distance:
        azimuth = np.arange(5, 360, 15)
        ends = np.array([[p["lon2"], p["lat2"]] for p in (g.Direct(50, 0, a, s) for a in azimuth)])
        exact = s * np.column_stack([np.sin(azimuth * DEGREE), np.cos(azimuth * DEGREE)])
        old.append(np.hypot(*(A * points("TWaz_eq_f", ends * DEGREE, **k)[:, :2] - exact).T).max())
        new.append(np.hypot(*(map_.forward(ends) - exact).T).max())
    figure, axis = plt.subplots(figsize=(7, 3.4))
    axis.loglog(distance / 1000, old, label="TWaz_eq_f")
    axis.loglog(distance / 1000, np.maximum(new, 1e-10), label="systems layer")
    axis.set_xlabel("distance from the origin, km")
    axis.set_ylabel("worst error, metres")
    axis.legend()
    save(figure, "accuracy_azimuthal_equidistant.svg")


def molodensky_picture(rows):
    figure, axis = plt.subplots(figsize=(7, 3.4))
    for row in rows:
        if row.family.startswith("Molodensky,"):
            place, error = row.extra["place"], row.extra["error"]
            axis.semilogy(place[:, 1] / DEGREE, np.maximum(error, 1e-10), ".", ms=3,
                          label=row.family.replace("Molodensky, ", ""))
    axis.set_xlabel("latitude")
    axis.set_ylabel("error, metres")
    axis.legend(fontsize=8)
    save(figure, "accuracy_molodensky.svg")


# --- the page ----------------------------------------------------------------------------------

HEAD = """| what | calls | domain | forward | inverse | scale | against | points | note |
|---|---|---|---|---|---|---|---|---|"""


def page(rows, missing, seconds):
    day = datetime.date.today().isoformat()
    systems_worst = [r for r in rows["systems"] if r.against.startswith("formula") and r.forward
                     and r.calls == "`Projection`"]
    text = f"""# How true it is

Made by `scripts/accuracy` on {day}, in {seconds:.0f} seconds of one core; edit `accuracy/`, not this page.

Each row measures one family of the C library, or one object of the systems layer, against an authority
of its own: the published formula evaluated in 50 digits by mpmath (`accuracy/formulas.py`, written from
the publications and not from the library's sources), GeographicLib for geodesics and what is made of
them, PROJ where its algorithm is as good and no closed formula is at hand. Points are strewn evenly over
the domain. An error is told as **worst (and what 95 of 100 points stay below)**:

- forward: distance on the map, in metres on the earth's size;
- inverse: distance on the ground from the point whose exact image went in, or, where a note says so, the
  way back of what came out;
- scale: relative error against the derivatives of the exact formula;
- of functions that are no projections: the error of the result in the unit that stands there.

The earth is GRS 1980 (spheres 6,370,997 m) where the row does not say otherwise. A double carries
1.9 nm in a coordinate of 10,000 km, so that some nanometres are as good as none.

In short: {len(systems_worst)} projections of the systems layer stand here against an exact formula; the
worst of them is off by {max(r.forward.worst for r in systems_worst) * 1e6:.1f} µm forward, on the whole of its domain. The C library keeps to its contract's formulas, some of which are
series: where a row is weak, its note names the better road.

## Map projections of the C library

{HEAD}
"""
    text += "\n".join(row.line() for row in rows["projections"])
    text += """

![Transverse Mercator: the contract's series and the systems layer](pictures/accuracy_transverse_mercator.svg)

![Azimuthal equidistant: error by distance from the origin](pictures/accuracy_azimuthal_equidistant.svg)

## Geodesy of the C library

Where the result is a length or an angle the error stands under forward. Of lines, forward is the end of
the direct problem, inverse the length of the inverse problem.

""" + HEAD + "\n"
    text += "\n".join(row.line() for row in rows["geodesy"])
    text += """

`TWgeodesic_inv` decides on the sphere whether the vertex lies ahead of a point. A long line that leaves
within some tenths of a degree of due east or west can so come out short; the picture shows where.

![Length of the inverse geodesic by azimuth](pictures/accuracy_geodesic_inverse.svg)

![Molodensky's formula by latitude](pictures/accuracy_molodensky.svg)

## The systems layer

""" + HEAD + "\n"
    text += "\n".join(row.line() for row in rows["systems"])
    text += """

Scales are by differences of the sixth order on the finished map; they are weakest hard by a pole or an
edge. Every projected system of the registry, 5,135 of them, and every operation by parameters is
compared with PROJ by `tests/systems/` (docs/systems.md tells the outcome).

## What has no row

"""
    for reason, names in sorted(missing.items()):
        text += f"- {reason}: {len(names)} functions.\n"
    return text


def main():
    began = time.process_time()
    PICTURES.mkdir(parents=True, exist_ok=True)
    rows = collected()
    missing = uncovered(rows)
    if "" in missing:
        print("no row and no reason:", " ".join(missing[""]))
        if "--loose" not in sys.argv:
            sys.exit(1)
    plt.rcParams["svg.hashsalt"] = "tidewater"
    transverse_picture()
    geodesic_picture()
    equidistant_picture()
    molodensky_picture(rows["geodesy"])
    text = page(rows, missing, time.process_time() - began)
    (SOURCE / "docs" / "accuracy.md").write_text(text)
    print(f"docs/accuracy.md: {sum(map(len, rows.values()))} rows")


main()
