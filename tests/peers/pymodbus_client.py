"""A pymodbus client that uses every function code once and prints what it got.

usage: pymodbus_client.py rtu|ascii PORT NODE
"""

import sys

from pymodbus.client import ModbusSerialClient
from pymodbus.framer.ascii_framer import ModbusAsciiFramer
from pymodbus.framer.rtu_framer import ModbusRtuFramer

FRAMERS = {"rtu": ModbusRtuFramer, "ascii": ModbusAsciiFramer}


def show(name, reply, values):
    if reply.isError():
        print(name, "failed:", reply)
    else:
        print(name, *values(reply))


def bits(count):
    return lambda reply: [int(bit) for bit in reply.bits[:count]]


def main():
    mode, port, node = sys.argv[1], sys.argv[2], int(sys.argv[3])
    client = ModbusSerialClient(
        port=port, framer=FRAMERS[mode], baudrate=19200, timeout=10)
    if not client.connect():
        sys.exit("cannot open " + port)
    registers = lambda reply: reply.registers
    echo = lambda reply: ["written"]
    show("coils", client.read_coils(5, 9, slave=node), bits(9))
    show("inputs", client.read_discrete_inputs(5, 9, slave=node), bits(9))
    show("holding", client.read_holding_registers(5, 3, slave=node), registers)
    show("input", client.read_input_registers(5, 3, slave=node), registers)
    show("coil", client.write_coil(100, True, slave=node), echo)
    show("register", client.write_register(100, 4711, slave=node), echo)
    show("coils", client.write_coils(201, [True, False, True], slave=node), echo)
    show("registers", client.write_registers(201, [1, 65535, 256], slave=node), echo)
    show("back", client.read_holding_registers(200, 5, slave=node), registers)
    beyond = client.read_holding_registers(10000, 1, slave=node)
    print("beyond", beyond.exception_code)
    client.close()


main()
