"""What pymodbus takes registers for: four floats, then two doubles, each in an order of its own.

usage: pymodbus_reals.py REGISTER...
"""

import sys

from pymodbus.constants import Endian
from pymodbus.payload import BinaryPayloadDecoder

ORDERS = (
    ("abcd", 2, Endian.Big, Endian.Big),
    ("cdab", 2, Endian.Big, Endian.Little),
    ("dcba", 2, Endian.Little, Endian.Little),
    ("badc", 2, Endian.Little, Endian.Big),
    ("abcdefgh", 4, Endian.Big, Endian.Big),
    ("ghefcdab", 4, Endian.Big, Endian.Little),
)

registers = [int(word) for word in sys.argv[1:]]
for name, count, byteorder, wordorder in ORDERS:
    decoder = BinaryPayloadDecoder.fromRegisters(
        registers[:count], byteorder=byteorder, wordorder=wordorder
    )
    real = decoder.decode_32bit_float() if count == 2 else decoder.decode_64bit_float()
    print(name, real)
    registers = registers[count:]
