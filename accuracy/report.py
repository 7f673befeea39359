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
import headers
import projections
import systems
from library import PROTOTYPES, SOURCE, Lines, Projection, contract, points
from measure import A, DEGREE, E, FLAT, apart

warnings.filterwarnings("ignore")
PICTURES = SOURCE / "docs" / "pictures"

# Functions that give names, texts, counts or constants of other functions: nothing to be off.
EXACT = (
    ("^TWtoler_to_cnt$", "a count of points, which the tolerance decides"),
    (r"_(c|param|stp|latTs|sTlat)$|^TWum_|^TWrslv_|^TWups$|^TWuk_n_grid$|^TWmadagascar$|^TWsomps$",
     "constants and parameters of families, which enter the rows of their families"),
    (r"_(cnt|tol|fnam|fhdr|info|names|nam_t_num|num_t_nam|get_\w+|id2name|name2id)$|_cnt_|^TWget_|"
     r"^TWmag|^TWmm_|^TWepoch|^TWsp|^TWvd|^TWund|^TWcs|^TWdt",
     "names, counts and rows of the store, handed on as they stand there"),
    (r"ascii|to_asc$|^TWclass_to|^TWnum_to|_nam$|_num$|_buf$|to_from$|_local$|^TWloc_",
     "texts, names and nodes as they stand in files, exact digit by digit in tests/unit"),
    (r"^TWverify_|prec$", "limits of angles and of digits, exact by comparison"),
)
# Headers of the systems layer and of the store whose functions compute nothing of their own.
HANDED_ON = {
    "definitions, names and units as the registry has them":
        ("ellipsoid.hpp", "system.hpp", "system_kind.hpp", "coordinates.hpp", "error.hpp"),
    "the C interface of the objects, whose rows hold": ("systems.h",),
    "names, counts and rows of the store, handed on as they stand there": ("store.h",),
}


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
    result = {}
    for name in sorted(PROTOTYPES):
        if not headers.calls_any(named, {name}):
            reason = next((why for pattern, why in EXACT if re.search(pattern, name)), "")
            result.setdefault(reason, []).append(name)
    return result


def without_rows(missing, rows):
    """Lines of the reasons: how many functions, and the headers that have no others."""
    listed = {reason: list(names) for reason, names in HANDED_ON.items()}
    every = " ".join(row.calls for group in rows.values() for row in group)
    for header in sorted(headers.HEADERS.glob("*.h")):
        names = headers.names_of(header.read_text())
        if names & PROTOTYPES.keys() and not headers.calls_any(every, names):
            # the reason of most of its functions
            reason = max(missing, key=lambda r: len(names & set(missing[r])))
            listed.setdefault(reason, []).append(header.name)
    text = ""
    for reason in sorted({*missing, *listed}):
        many = [f"{len(missing[reason])} functions"] if reason in missing else []
        told = ", ".join([*many, *(f"`{name}`" for name in listed.get(reason, ()))])
        text += f"- {reason}: {told}\n"
    return text


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


MAPS = ("Equidistant conic", "Polyconic", "Cassini, 6 degrees", "Azimuthal equidistant, 2,000 km",
        "Bipolar oblique conic", "Van der Grinten", "Indian polyhedric", "Malaya grid")


def families_picture(rows):
    """Where the families of the C library are how wrong: those whose error varies."""
    chosen = {row.family: row for row in rows if row.family in MAPS}
    figure, axes = plt.subplots(2, 4, figsize=(11, 5), layout="constrained")
    for axis, name in zip(axes.flat, MAPS):
        place, error = chosen[name].extra["place"] / DEGREE, chosen[name].extra["error"]
        known = np.isfinite(error)
        shown = axis.scatter(*place[known].T, c=np.maximum(error[known], 1e-9), s=9, cmap="viridis",
                             norm=LogNorm(), rasterized=True)
        axis.set_title(name + (", way back" if name.startswith("Bipolar") else ""), fontsize=8)
        axis.tick_params(labelsize=7)
        bar = figure.colorbar(shown, ax=axis)
        bar.ax.tick_params(labelsize=7)
    figure.supxlabel("longitude", fontsize=9)
    figure.supylabel("latitude", fontsize=9)
    figure.suptitle("error in metres", fontsize=9)
    save(figure, "accuracy_families.svg")


def orbit_picture(rows):
    figure, axis = plt.subplots(figsize=(7, 3.6))
    for row in rows:
        if not row.family.startswith("Space oblique Mercator, Landsat 5"):
            continue
        middle = slice(1, None, 3)  # on the track
        angle = np.degrees(row.extra["along"][middle])
        if "5 terms" in row.family:
            axis.semilogy(angle, row.extra["turned"][middle], label="Snyder's closed form, without turn and shift")
        axis.semilogy(angle, row.extra["error"][middle], label="TWsom_f, " + row.family.split(", ")[-1])
    axis.set_xlabel("degrees along the orbit, from the northernmost point to the equator")
    axis.set_ylabel("metres from the exact plane")
    axis.legend(fontsize=8)
    save(figure, "accuracy_space_oblique.svg")


# --- the page ----------------------------------------------------------------------------------

HEAD = """| what | calls | domain | forward | inverse | scale | against | points | note |
|---|---|---|---|---|---|---|---|---|"""


def headline(rows):
    """The table that README.md has, too: tests/docs/check.py holds the two together."""
    found = {row.family: row for row in rows["systems"]}
    registry = found["Projected systems of the registry"]
    operations = found["Datum operations of the registry by parameters"]
    methods = next(row for row in rows["systems"] if row.family.startswith("The "))
    length = found["Geodesics, to 19,000 km"]
    shown = lambda error: str(error).split(" (")[0]
    departs = registry.count - registry.extra["within"]
    return f"""| what | against | result |
|---|---|---|
| {registry.extra['systems']:,} projected systems of the registry, both ways | PROJ | {registry.extra['within']:,} of the {registry.count:,} that can be compared within {shown(registry.forward)}; in the other {departs} PROJ departs from the registry's text |
| {operations.count:,} datum operations by parameters, both ways | PROJ | within {shown(operations.forward)} |
| {methods.family[4:]}, forward, on the whole of their domains | 50 digits | within {shown(methods.forward)} |
| geodesics to 19,000 km, ends and lengths | GeographicLib | within {shown(max(length.forward, length.inverse, key=lambda v: v.worst))} |
"""


def page(rows, missing, seconds):
    day = datetime.date.today().isoformat()
    text = f"""# How true it is

Made by `scripts/accuracy` on {day}, in {seconds:.0f} seconds of one core; edit `accuracy/`, not this page.

{headline(rows)}
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

The C library keeps to its contract's formulas, some of which are series: where a row is weak, its note
names the better road. The public headers quote these rows (`accuracy/headers.py`) and no other figures.

## Map projections of the C library

{HEAD}
"""
    text += "\n".join(row.line() for row in rows["projections"])
    text += """

![Transverse Mercator: the contract's series and the systems layer](pictures/accuracy_transverse_mercator.svg)

![Azimuthal equidistant: error by distance from the origin](pictures/accuracy_azimuthal_equidistant.svg)

![Families of the C library whose error varies](pictures/accuracy_families.svg)

Of the Space Oblique Mercator there are two planes, both J. P. Snyder's (USGS Bulletin 1518, 1981). The one
of the general orbit, which the contract has, rolls the ground track out with the curvature that it has on
the ellipsoid: the contract's own curvature agrees with that of differential geometry to all digits, and
its functions with the integral to the millimetres that five terms of a series leave. The closed form for
circular orbits, which PROJ has, puts one constant, J = (1 - e²)³, for what varies along the orbit, and so
bends the track by 0.01 per cent (at the equator) to 0.10 per cent (at its northernmost point) more. Each
library is right to its own definition. Both planes are true to scale along the track and within 2e-6 of
each other 92 km beside it; the rolled-out one is the one that keeps the track's shape.

![Space oblique Mercator along the orbit](pictures/accuracy_space_oblique.svg)

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
edge.

## What has no row

"""
    return text + without_rows(missing, rows)


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
    families_picture(rows["projections"])
    orbit_picture(rows["projections"])
    text = page(rows, missing, time.process_time() - began)
    (SOURCE / "docs" / "accuracy.md").write_text(text)
    print(f"docs/accuracy.md: {sum(map(len, rows.values()))} rows")
    headers.main()


main()
