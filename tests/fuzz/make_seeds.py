#!/usr/bin/env python3
"""Cuts the record reader's fuzz seeds from a generated sample store.

Usage: make_seeds.py STORE_DIR CORPUS_DIR

The saved corpus was cut from the large preset (brindlewick-samplestore
--preset large).

Every seed is a header followed by a few real records, so the fuzzer starts
inside each record decoder instead of having to find the framing first:
  start-<kind>   the first records of a power, periodic and process file
  type-<NN>      the header and three records of one type
  and a few damaged streams: a body cut short, a version-0 record after
  data, a second header of another boot, keys of no class and keys above
  the type table.
Seeds stay below 4 KB so that the replay test stays quick.
"""
import os
import sys

MAX_SEED = 4096


def varint(data, i):
    value, shift = 0, 0
    while True:
        byte = data[i]
        i += 1
        value |= (byte & 0x7F) << shift
        shift += 7
        if not byte & 0x80:
            return value, i


def encode_varint(value):
    out = bytearray()
    while True:
        byte = value & 0x7F
        value >>= 7
        if value:
            out.append(byte | 0x80)
        else:
            out.append(byte)
            return bytes(out)


def frames(data):
    """(type, key-and-body bytes, body bytes) of every record of a file."""
    out, i = [], 0
    while i < len(data):
        start = i
        key, i = varint(data, i)
        length, i = varint(data, i)
        out.append((key >> 3, data[start:i + length], data[i:i + length]))
        i += length
    return out


def rekey(body, record_type):
    return encode_varint(record_type << 3 | 2) + encode_varint(len(body)) + body


def leading_fields(body, below):
    """The body's leading fields numbered below `below` (varints and strings)."""
    i = 0
    while i < len(body):
        start = i
        key, i = varint(body, i)
        if key >> 3 >= below:
            return body[:start]
        value, i = varint(body, i)
        if key & 7 == 2:
            i += value
    return body


def kind_of(name):
    for kind in ("power", "periodic"):
        if "." + kind in name:
            return kind
    return "process"


def main():
    store, corpus = sys.argv[1], sys.argv[2]
    os.makedirs(corpus, exist_ok=True)
    files = sorted(os.path.join(d, f) for d, _, names in os.walk(store) for f in names)
    seeds = {}
    by_type = {}  # type -> (header, records) of the first file holding it
    usage_by_boot = {}  # boot -> (header, first process sample) of its first process file
    for path in files:
        records = frames(open(path, "rb").read())
        header = records[0][1]
        kind = kind_of(os.path.basename(path))
        seeds.setdefault("start-" + kind, b"".join(r[1] for r in records[:12]))
        for record_type in sorted({r[0] for r in records[1:]}):
            if record_type not in by_type:
                by_type[record_type] = (header, [(raw, body) for t, raw, body in records[1:] if t == record_type])
        if kind == "process" and len(records) > 1:
            usage_by_boot.setdefault(os.path.basename(path)[:36], (header, records[1][1]))

    for record_type, (header, records) in sorted(by_type.items()):
        seeds["type-%02d" % record_type] = header + b"".join(raw for raw, _ in records[:3])

    # Damaged streams (a version-0 record is the version and the two times
    # of a current header), each built from records of one file (so that no
    # record is stamped before its header) unless it needs two boots.
    (header_a, usage_a), (header_b, usage_b) = list(usage_by_boot.values())[:2]
    header_s, sleeps = by_type[7]
    sleep = sleeps[0][1]
    seeds["type-08"] = header_s + rekey(sleep, 8)
    seeds["cut-body"] = header_a + usage_a + usage_a[:len(usage_a) // 2]
    seeds["version0-after-data"] = header_a + usage_a + rekey(leading_fields(frames(header_a)[0][2], 4), 1)
    seeds["second-header-other-boot"] = header_a + usage_a + header_b + usage_b
    seeds["no-class-types"] = header_s + rekey(sleep, 0) + rekey(sleep, 5) + sleeps[0][0]
    seeds["above-the-table"] = header_s + rekey(sleep, 7) + rekey(sleep, 40) + rekey(sleep, 1000)

    for name, data in sorted(seeds.items()):
        with open(os.path.join(corpus, name), "wb") as f:
            f.write(data[:MAX_SEED])
    print("%d seeds in %s" % (len(seeds), corpus))


if __name__ == "__main__":
    main()
