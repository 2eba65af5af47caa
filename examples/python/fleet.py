#!/usr/bin/env python3
"""Compares one parameter over all DCM files of a folder tree.

Reads the files with Dask, by a cluster on this machine or by that of a scheduler, whose workers see
the same folder. Prints a table of the files, those farthest from the median first; writes it as CSV
and draws the spread if asked to.
"""

import argparse
import pathlib
import sys

import dask.distributed
import dcm
import numpy as np
import pandas

BATCH = 20  # files of one task


def look_up(paths, name, encoding):
    """The parameter of each file, or in words why there is none. Runs in a worker."""
    found = []
    for path in paths:
        try:
            parameter = dcm.read(path, encoding)[name]
            parameter.values  # is loaded here, by the worker
            found.append((path, parameter))
        except KeyError:
            found.append((path, f"no {name}"))
        except (OSError, dcm.ReadError) as error:
            found.append((path, str(error)))
    return found


def collect(client, paths, name, encoding):
    """The same for all files in order, with progress on the standard error stream."""
    batches = [paths[i : i + BATCH] for i in range(0, len(paths), BATCH)]
    futures = client.map(look_up, batches, name=name, encoding=encoding, key=f"look-up-{name}")
    found = {}
    for _, result in dask.distributed.as_completed(futures, with_results=True):
        found.update(result)
        print(f"\r{len(found)} of {len(paths)} files", end="", file=sys.stderr, flush=True)
    print(file=sys.stderr)
    return [(path, found[path]) for path in paths]


def compare(found):
    """The table of all files, a typical parameter, and the values of the files comparable to it.

    Comparable are those with numbers in the commonest shape.
    """
    parameters = {path: one for path, one in found if isinstance(one, dcm.Parameter)}
    numbers = {path: one for path, one in parameters.items() if one.values.dtype == np.float64}
    if not numbers:
        return pandas.DataFrame(found, columns=["file", "remark"]).set_index("file"), None, None
    shapes = pandas.Series([one.values.shape for one in numbers.values()])
    shape = shapes.mode()[0]
    alike = {path: one for path, one in numbers.items() if one.values.shape == shape}
    values = np.stack([one.values for one in alike.values()])
    middle = np.median(values, axis=0)
    rows = []
    for path, one in found:
        row = {"file": path, "remark": ""}
        if path in alike and alike[path].values.size:
            own = alike[path].values
            row |= {"min": own.min(), "mean": own.mean(), "max": own.max()}
            row["from median"] = np.abs(own - middle).max()
        elif path in parameters:
            row["remark"] = f"shape {parameters[path].values.shape}, or texts"
        else:
            row["remark"] = one
        rows.append(row)
    table = pandas.DataFrame(rows).set_index("file")
    if "from median" in table:
        table = table.sort_values("from median", ascending=False)
    return table, next(iter(alike.values())), values


def draw(typical, values, path):
    """The spread over the files: a histogram, a band over the points, or a grid of max - min."""
    import matplotlib

    matplotlib.use("Agg")
    from matplotlib import pyplot

    figure, ax = pyplot.subplots(figsize=(5.6, 3.6), layout="constrained")
    if values[0].size == 1:
        ax.hist(values.ravel(), bins=30)
        ax.set(xlabel=f"[{typical.unit}]", ylabel="files")
    elif values[0].ndim == 2:
        spread = typical.copy()
        spread.values[:] = values.max(axis=0) - values.min(axis=0)
        spread.plot(ax, cmap="magma")
    else:
        line = typical.copy()
        line.values[:] = np.median(values, axis=0)
        line.plot(ax, label="median")
        over = ax.lines[0].get_xdata()
        ax.fill_between(over, values.min(axis=0), values.max(axis=0), alpha=0.3, label="min to max")
        ax.legend()
    ax.set_title(f"{typical.name}: spread over {len(values)} files")
    figure.savefig(path)


def main():
    parser = argparse.ArgumentParser(description=__doc__.partition("\n")[0])
    parser.add_argument("folder", type=pathlib.Path)
    parser.add_argument("parameter")
    parser.add_argument("--pattern", default="*.dcm", help="names of the files (%(default)s)")
    parser.add_argument("--encoding", default="cp1252", help="their encoding (%(default)s)")
    parser.add_argument("--scheduler", help="address of a Dask scheduler, such as tcp://host:8786")
    parser.add_argument("--workers", type=int, help="processes of the local cluster")
    parser.add_argument("--csv", type=pathlib.Path, help="file for the whole table")
    parser.add_argument("--plot", type=pathlib.Path, help="file for the picture of the spread")
    options = parser.parse_args()

    paths = [str(path) for path in sorted(options.folder.resolve().rglob(options.pattern))]
    if not paths:
        sys.exit(f"fleet: no file {options.pattern} below {options.folder}")
    cluster = {"address": options.scheduler}
    if not options.scheduler:
        cluster = {"n_workers": options.workers, "threads_per_worker": 1, "dashboard_address": None}
    with dask.distributed.Client(**cluster) as client:
        found = collect(client, paths, options.parameter, options.encoding)

    table, typical, values = compare(found)
    print(table.head(20).to_string())
    if options.csv:
        table.to_csv(options.csv)
    if values is None:
        sys.exit("fleet: no file has numbers in this parameter")
    if options.plot:
        draw(typical, values, options.plot)


if __name__ == "__main__":
    main()
