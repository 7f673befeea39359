"""A walk through Tidewater in Python, with pictures.

    python tutorial.py [folder]

Each step is a function; the last lines run them all and write their pictures into the folder.
"""

import pathlib
import sys

import matplotlib

matplotlib.use("Agg")
import matplotlib.pyplot as plt
import numpy as np

import tidewater


def first_points():
    """From longitude and latitude to a map and back: one point, then many."""
    t = tidewater.Transformation("EPSG:4326", "EPSG:2154")
    print(t.describe())
    x, y = t(2.3522, 48.8566)  # numbers in, numbers out
    print(f"Paris: {x:.2f} E {y:.2f} N")

    lon, lat = np.meshgrid(np.linspace(-4, 8, 300), np.linspace(42, 51, 300))
    x, y = t(lon, lat, threads=0)  # any shape, all cores
    back = t.inverse(x, y)
    error = np.abs(back[0] - lon).max() * 111_000
    print(f"{lon.size} points there and back, within {error:.0e} m")
    assert error < 1e-6

    # What fails says why.
    _, _, words = t([2, 2], [48, 95], errors="words")
    print([tidewater.status_text(int(word)) for word in words])


def circles_on_the_ground(lon, lat, radius):
    """Small circles: the ends of geodesics of one length in all directions."""
    azimuth = np.linspace(0, 360, 49)
    geodesic = tidewater.Geodesic("WGS 84")
    return geodesic.direct(np.ravel(lon)[:, None], np.ravel(lat)[:, None], azimuth, radius)[:2]


def tissot(folder):
    """Tissot's indicatrices: what becomes of circles of one size."""
    maps = [tidewater.System(name).projection for name in ("EPSG:3395", "EPSG:8857")]
    maps.append(tidewater.Projection("sinusoidal"))
    names = ["World Mercator", "Equal Earth", "Sinusoidal"]
    figure, axes = plt.subplots(1, 3, figsize=(15, 5))
    lon, lat = np.meshgrid(np.arange(-150, 151, 30.0), np.arange(-60, 61, 30.0))
    for axis, projection, name in zip(axes, maps, names):
        for k in np.arange(-180, 181, 30):
            axis.plot(*projection(np.full(91, float(k)), np.linspace(-75, 75, 91)), lw=0.5,
                      color="#b0b0b0")
        for k in np.arange(-75, 76, 15):
            axis.plot(*projection(np.linspace(-180, 180, 181), float(k)), lw=0.5, color="#b0b0b0")
        x, y = projection(*circles_on_the_ground(lon, lat, 600e3))
        for i in range(len(x)):
            axis.fill(x[i], y[i], color="#c0392b", alpha=0.45, lw=0)
        # The same in figures.
        factors = projection.factors(lon, lat)
        axis.set_title(f"{name}\nareas {factors.areal.min():.2f} to {factors.areal.max():.2f}, "
                       f"angles to {factors.angular.max():.0f}°", fontsize=10)
        axis.set_aspect("equal")
        axis.axis("off")
    figure.savefig(folder / "tissot.png", dpi=110, bbox_inches="tight")
    plt.close(figure)


def distortion(folder):
    """How far a kilometre on the map is from one on the ground."""
    figure, axes = plt.subplots(1, 2, figsize=(12, 5))
    lon, lat = np.meshgrid(np.linspace(-6, 10, 161), np.linspace(41, 52, 111))
    for axis, code in zip(axes, ("EPSG:2154", "EPSG:32631")):
        system = tidewater.System(code)
        scale = system.projection.factors(lon, lat, threads=0).meridional
        off = (scale - 1) * 1e5
        limit = np.abs(off).max()
        picture = axis.contourf(lon, lat, off, levels=np.linspace(-limit, limit, 24), cmap="RdBu_r")
        figure.colorbar(picture, ax=axis, label="cm in a kilometre")
        lines = axis.contour(lon, lat, off, levels=[0], colors="k", linewidths=1)
        axis.clabel(lines, fmt="true", fontsize=8)
        axis.set_title(f"{system.name}: scale", fontsize=10)
        axis.set_xlabel("longitude")
        axis.set_ylabel("latitude")
        axis.set_aspect(1.5)
    figure.savefig(folder / "distortion.png", dpi=110, bbox_inches="tight")
    plt.close(figure)


def shifts(folder, grid_file="/usr/share/proj/ntf_r93.gsb"):
    """The vectors of a grid of datum shifts: what a formula leaves over."""
    if not pathlib.Path(grid_file).exists():
        print(f"No grid at {grid_file}: its picture is left out.")
        return
    grid = tidewater.ShiftGrid(grid_file)
    west, south, east, north = grid.bounds[0]
    lon, lat = np.meshgrid(np.linspace(west, east, 32)[1:-1], np.linspace(south, north, 26)[1:-1])
    by_grid = grid(lon, lat)
    # The registry's formula of three parameters for the same datums.
    by_formula = tidewater.Transformation("EPSG:4275", "EPSG:4326", operation="EPSG:1193")(lon, lat)
    metres = np.radians(1) * 6371e3
    east_off = (by_grid[0] - by_formula[0]) * metres * np.cos(np.radians(lat))
    north_off = (by_grid[1] - by_formula[1]) * metres
    figure, axis = plt.subplots(figsize=(7, 6))
    length = np.hypot(east_off, north_off)
    arrows = axis.quiver(lon, lat, east_off, north_off, length, cmap="viridis")
    figure.colorbar(arrows, label="metres")
    axis.set_title("NTF to RGF93: what the grid adds to three parameters", fontsize=10)
    axis.set_aspect(1.5)
    figure.savefig(folder / "shifts.png", dpi=110, bbox_inches="tight")
    plt.close(figure)


def declination(folder):
    """Where the compass points: declination over the world."""
    model = tidewater.MagneticModel("WMM2025", year=2026.5)
    lon, lat = np.meshgrid(np.linspace(-180, 180, 361), np.linspace(-85, 85, 171))
    east = model.declination(lon, lat, threads=0)
    figure, axis = plt.subplots(figsize=(12, 5.5))
    levels = np.arange(-180, 181, 10)
    lines = axis.contour(lon, lat, east, levels=levels, cmap="RdBu_r", vmin=-60, vmax=60,
                         linewidths=0.9)
    axis.contour(lon, lat, east, levels=[0], colors="k", linewidths=1.6)
    axis.clabel(lines, levels[::2], fmt="%d°", fontsize=7)
    axis.set_title(f"{model.name}: declination at {model.year:.1f}, degrees east", fontsize=10)
    figure.savefig(folder / "declination.png", dpi=110, bbox_inches="tight")
    plt.close(figure)


def main(folder):
    folder = pathlib.Path(folder)
    folder.mkdir(parents=True, exist_ok=True)
    first_points()
    tissot(folder)
    distortion(folder)
    shifts(folder)
    declination(folder)


if __name__ == "__main__":
    main(sys.argv[1] if len(sys.argv) > 1 else "pictures")
