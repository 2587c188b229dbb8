"""pymodbus doing the same work; prints the same line as the other masters.

usage: pymodbus_master.py PORT BAUD WORK COUNT own
"""

import resource
import sys
import time

from pymodbus.client import ModbusSerialClient
from pymodbus.framer.rtu_framer import ModbusRtuFramer

from work import WRITTEN, WRITTEN_AT, check_sum


def transaction(client, work):
    if work == "read-1-register":
        return lambda: client.read_holding_registers(0, 1, slave=1).registers
    if work == "read-125-registers":
        return lambda: client.read_holding_registers(0, 125, slave=1).registers
    if work == "read-2000-coils":
        return lambda: client.read_coils(0, 2000, slave=1).bits[:2000]
    if work == "write-123-registers":
        return lambda: [client.write_registers(WRITTEN_AT, WRITTEN, slave=1).count]
    sys.exit("unknown work: " + work)


def used():
    usage = resource.getrusage(resource.RUSAGE_SELF)
    return usage.ru_utime + usage.ru_stime, usage.ru_nvcsw, time.monotonic()


def main():
    port, baud, work, count = sys.argv[1], int(sys.argv[2]), sys.argv[3], int(sys.argv[4])
    client = ModbusSerialClient(port=port, framer=ModbusRtuFramer, baudrate=baud, timeout=1)
    if not client.connect():
        sys.exit("cannot open " + port)
    transact = transaction(client, work)
    first = transact()
    lost = wrong = 0
    before = used()
    for _ in range(count):
        try:
            wrong += transact() != first
        except Exception:  # what it raises differs; a lost transaction is one
            lost += 1
    after = used()
    if work.startswith("write"):
        first = client.read_holding_registers(WRITTEN_AT, 123, slave=1).registers
    print(count, lost, wrong, round((after[0] - before[0]) * 1e9),
          round((after[2] - before[2]) * 1e9), after[1] - before[1], check_sum(first))
    client.close()


main()
