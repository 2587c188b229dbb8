"""A pymodbus slave with known contents; tells what its memory holds when standard input ends.

usage: pymodbus_slave.py rtu|ascii PORT NODE
"""

import asyncio
import sys

from pymodbus.datastore import ModbusSequentialDataBlock, ModbusServerContext, ModbusSlaveContext
from pymodbus.framer.ascii_framer import ModbusAsciiFramer
from pymodbus.framer.rtu_framer import ModbusRtuFramer
from pymodbus.server import StartAsyncSerialServer

FRAMERS = {"rtu": ModbusRtuFramer, "ascii": ModbusAsciiFramer}
SIZE = 300


def block(values):
    return ModbusSequentialDataBlock(0, values)


def memory():
    return ModbusSlaveContext(
        co=block([address % 3 == 0 for address in range(SIZE)]),
        di=block([address % 4 == 1 for address in range(SIZE)]),
        hr=block([2000 + address for address in range(SIZE)]),
        ir=block([50000 + address for address in range(SIZE)]),
        zero_mode=True,
    )


async def serve(mode, port, node):
    slave = memory()
    context = ModbusServerContext(slaves={node: slave}, single=False)
    server = await StartAsyncSerialServer(
        context, framer=FRAMERS[mode], port=port, baudrate=19200, defer_start=True
    )
    await server.start()  # The port is open when this returns.
    serving = asyncio.ensure_future(server.serve_forever())
    print("ready", flush=True)
    await asyncio.get_running_loop().run_in_executor(None, sys.stdin.read)
    print("coils", *(int(bit) for bit in slave.getValues(1, 100, 20)))
    print("registers", *slave.getValues(3, 100, 20))
    sys.stdout.flush()
    serving.cancel()


asyncio.run(serve(sys.argv[1], sys.argv[2], int(sys.argv[3])))
