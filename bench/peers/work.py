"""What the masters of the comparison read and write; the same as Work.h."""

WRITTEN_AT = 2000
WRITTEN = [40000 + 7 * index for index in range(123)]

# By name: characters of request and reply in RTU, and what the slave holds there.
WORKS = {
    "read-1-register": (8, 5 + 2, [1000]),
    "read-125-registers": (8, 5 + 250, [1000 + index for index in range(125)]),
    "read-2000-coils": (8, 5 + 250, [int(index % 3 == 0) for index in range(2000)]),
    "write-123-registers": (9 + 246, 8, WRITTEN),
}


def check_sum(values):
    """FNV-1a over whole values."""
    result = 2166136261
    for value in values:
        result = (result ^ int(value)) * 16777619 & 0xFFFFFFFF
    return result
