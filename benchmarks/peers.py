"""Peers that NumPy and Python provide, told line by line what to run.

A line holds the name of a function below, its arguments and the file for its result, separated by
tabs; "-" stands for no file. The answer is the seconds that the work took.
"""
import functools
import os
import sys
import time

import numpy as np


def timed(work):
    start = time.perf_counter()
    result = work()
    return time.perf_counter() - start, result


@functools.lru_cache(maxsize=2)
def loaded(path, dtype):
    return np.fromfile(path, dtype)


def scan(path, delimiter, dtype, result_dtype):
    options = {} if delimiter == 'blank' else {'delimiter': delimiter}
    seconds, table = timed(lambda: np.loadtxt(path, dtype, **options).ravel())
    return seconds, table.astype(result_dtype)


def scan_words(path, delimiter):
    options = {} if delimiter == 'blank' else {'delimiter': delimiter}
    seconds, words = timed(lambda: np.loadtxt(path, 'U16', ndmin=1, **options))
    return seconds, ''.join(words.tolist())


def read(path, dtype, result_dtype):
    return timed(lambda: np.fromfile(path, dtype).astype(result_dtype, copy=False))


def saturated(values, dtype):
    ends = np.iinfo(dtype)
    return np.clip(np.round(values), ends.min, ends.max).astype(dtype)


def read_saturated(path, dtype, result_dtype):
    return timed(lambda: saturated(np.fromfile(path, dtype), result_dtype))


def read_strided(path, dtype, skip):
    dtype = np.dtype(dtype)

    def work():
        words = np.fromfile(path, dtype)
        return words[::1 + int(skip) // dtype.itemsize].copy()

    return timed(work)


def read_ubit12(path):
    def work():
        triples = np.fromfile(path, np.uint8).reshape(-1, 3).astype(np.uint16)
        fields = np.empty((len(triples), 2), np.uint16)
        fields[:, 0] = triples[:, 0] | (triples[:, 1] & 15) << 8
        fields[:, 1] = triples[:, 1] >> 4 | triples[:, 2] << 4
        return fields.ravel()

    return timed(work)


def write_saturated(path, dtype, file_dtype, target):
    values = loaded(path, dtype)
    if os.path.exists(target):
        os.remove(target)
    seconds, _ = timed(lambda: saturated(values, file_dtype).tofile(target))
    return seconds, np.fromfile(target, np.uint8)


@functools.lru_cache(maxsize=4)
def room(count, dtype):
    return np.empty(count, dtype)


def convert_saturated(path, dtype, result_dtype):
    values = loaded(path, dtype)
    between = room(len(values), dtype)
    result = room(len(values), result_dtype)
    ends = np.iinfo(result_dtype)

    def work():
        whole = values if values.dtype.kind == 'i' else np.round(values, out=between)
        np.clip(whole, ends.min, ends.max, out=between)
        np.copyto(result, between, casting='unsafe')
        return result

    return timed(work)


def convert(path, dtype, result_dtype):
    values = loaded(path, dtype)
    result = room(len(values), result_dtype)

    def work():
        np.copyto(result, values, casting='unsafe')
        return result

    return timed(work)


def lines(path):
    def work():
        with open(path, encoding='utf-8') as file:
            return [line for line in file]

    seconds, result = timed(work)
    return seconds, ''.join(result)


def save(result, path):
    if path == '-':
        return
    with open(path, 'wb') as file:
        file.write(result.encode() if isinstance(result, str) else result.tobytes())


def main():
    print('ready', flush=True)
    for line in sys.stdin:
        name, *arguments, path = line.rstrip('\n').split('\t')
        try:
            seconds, result = globals()[name](*arguments)
            save(result, path)
            print(seconds, flush=True)
        except Exception as error:
            print('error', type(error).__name__, str(error).replace('\n', ' '), flush=True)


main()
