#!/usr/bin/env python3
"""Installs a build into an empty prefix, moves the prefix, and uses the library from there as a
stranger would: by the CMake package and by pkg-config."""

import argparse
import os
import pathlib
import re
import shutil
import subprocess
import sys
import tempfile

CONSUMER = pathlib.Path(__file__).resolve().parent / "consumer"
GREETING = "Hello from an installed plugin\n"


def run(*command, **options):
    """What the command prints; a command that fails ends the check with all it said."""
    done = subprocess.run(list(map(str, command)), text=True, stdout=subprocess.PIPE,
                          stderr=subprocess.STDOUT, check=False, **options)
    if done.returncode != 0:
        sys.exit(f"{' '.join(map(str, command))}\n{done.stdout}exit status {done.returncode}")
    return done.stdout


def expect(what, actual, expected):
    if actual != expected:
        sys.exit(f"{what}: {actual!r}, not {expected!r}")


def check_soname(prefix):
    dynamic = run("readelf", "--dynamic", prefix / "lib/libzelmar.so")
    expect("soname", re.findall(r"\(SONAME\).*\[(.*)\]", dynamic), ["libzelmar.so.1"])


def check_headers(prefix, compiler, scratch):
    """Every installed header compiles on its own, in a program that sees nothing but the prefix."""
    include = prefix / "include"
    headers = sorted(path.relative_to(include).as_posix() for path in include.rglob("*.h"))
    expect("internal headers", [name for name in headers if "/internal/" in name], [])
    sources = []
    for number, name in enumerate(headers):
        sources.append(scratch / f"header{number}.cpp")
        sources[-1].write_text(f"#include <{name}>\n#include <{name}>\n")
    run(compiler, "-std=c++20", "-Wall", "-Wextra", "-Wpedantic", "-Werror", "-fsyntax-only",
        "-I", include, *sources)


def check_consumers(directory, environment):
    expect("greeting", run(directory / "consumer_host", directory / "consumer_plugin.so",
                           env=environment), GREETING)


def check_cmake_package(prefix, compiler, cmake, scratch):
    build = scratch / "by-cmake"
    run(cmake, "-S", CONSUMER, "-B", build, "-G", "Ninja", f"-DCMAKE_PREFIX_PATH={prefix}",
        f"-DCMAKE_CXX_COMPILER={compiler}")
    run(cmake, "--build", build)
    check_consumers(build, os.environ)


def check_pkg_config(prefix, compiler, scratch):
    build = scratch / "by-pkg-config"
    build.mkdir()
    environment = {**os.environ, "PKG_CONFIG_PATH": str(prefix / "lib/pkgconfig"),
                   "LD_LIBRARY_PATH": str(prefix / "lib")}
    flags = run("pkg-config", "--cflags", "--libs", "zelmar", env=environment).split()
    run(compiler, "-std=c++20", CONSUMER / "host.cpp", "-o", build / "consumer_host", *flags)
    run(compiler, "-std=c++20", "-shared", "-fPIC", CONSUMER / "plugin.cpp",
        "-o", build / "consumer_plugin.so", *flags)
    check_consumers(build, environment)


def check_tool(prefix):
    """The tool finds its library from where it stands."""
    run(prefix / "bin/kelvash", "kelvash", "command", "list")


def main():
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("--cmake", required=True)
    parser.add_argument("--compiler", required=True)
    parser.add_argument("--build", required=True, help="the build to install")
    arguments = parser.parse_args()

    with tempfile.TemporaryDirectory(prefix="zelmar-install-") as directory:
        scratch = pathlib.Path(directory)
        run(arguments.cmake, "--install", arguments.build, "--prefix", scratch / "first")
        prefix = scratch / "moved"
        shutil.move(scratch / "first", prefix)
        check_soname(prefix)
        check_headers(prefix, arguments.compiler, scratch)
        check_cmake_package(prefix, arguments.compiler, arguments.cmake, scratch)
        check_pkg_config(prefix, arguments.compiler, scratch)
        check_tool(prefix)


if __name__ == "__main__":
    main()
