#include "tests/abi/host_services.h"

#include <string.h>

#include "tests/abi/tables.h"

HostBooks books;

/* An object without state is a pointer to its table. */
typedef struct {
    const void* table;
} Object;

/* Nobody may destroy the host's services: a call of these slots ends the program. */
#define NO_DESTRUCTORS \
    { 0, 0 }

static int version_one(const void* object) {
    (void)object;
    return 1;
}

/* The lock. */

typedef struct {
    const LockTable* table;
    int taken;
    int alive;
} Lock;

static void lock_lock(void* object) {
    Lock* lock = object;
    if (lock->taken || !lock->alive) ++books.mistakes;
    lock->taken = 1;
    ++books.locksTaken;
    ++books.lockings;
}

static void lock_unlock(void* object) {
    Lock* lock = object;
    if (!lock->taken) ++books.mistakes;
    lock->taken = 0;
    --books.locksTaken;
}

static const LockTable lockTable = {lock_lock, lock_unlock};
static Lock locks[4];

/* "IMultiTask2" */

static void* multi_task_convert(void* object, const char* name) {
    return strcmp(name, "IMultiTask2") == 0 ? object : 0;
}

static const char* multi_task_name(const void* object) {
    (void)object;
    return "CMultiTask";
}

static void* multi_task_create_lock(void* object, int reserved) {
    (void)object;
    if (reserved != 0) ++books.mistakes;
    for (unsigned i = 0; i < sizeof locks / sizeof *locks; ++i) {
        if (locks[i].alive) continue;
        locks[i] = (Lock){&lockTable, 0, 1};
        ++books.locksAlive;
        return &locks[i];
    }
    return 0;
}

static void multi_task_delete_lock(void* object, void* held) {
    Lock* lock = held;
    (void)object;
    if (!lock->alive || lock->taken) ++books.mistakes;
    lock->alive = 0;
    --books.locksAlive;
}

static void multi_task_sleep(void* object, int ms) {
    (void)object;
    books.sleptMs += ms;
}

static const MultiTaskTable multiTaskTable = {
    NO_DESTRUCTORS,         multi_task_convert,     multi_task_name, version_one,
    multi_task_create_lock, multi_task_delete_lock, multi_task_sleep};
static Object multiTask = {&multiTaskTable};

/* The port "com1" */

static const Exchange* script;
static int scriptLength;
static const unsigned char* pending;
static int pendingLength;

void host_script(const Exchange* exchanges, int count) {
    script = exchanges;
    scriptLength = count;
    pendingLength = 0;
}

static int port_configure(void* port, int baud, int parity, int dataBits, int stopBits, int mode) {
    const int settings[5] = {baud, parity, dataBits, stopBits, mode};
    (void)port;
    memcpy(books.settings, settings, sizeof settings);
    return 1;
}

static void port_purge(void* port) {
    (void)port;
    pendingLength = 0;
}

static int port_send(void* port, const unsigned char* data, int length) {
    (void)port;
    if (scriptLength == 0 || length != script->requestLength ||
        memcmp(data, script->request, (size_t)length) != 0) {
        ++books.unexpectedSends;
        return 1;
    }
    pending = script->reply;
    pendingLength = script->replyLength;
    ++script;
    --scriptLength;
    return 1;
}

static int port_receive_byte(void* port, unsigned char* byte, int timeoutMs, int reserved) {
    (void)port;
    (void)timeoutMs;
    if (reserved != 0) ++books.mistakes;
    if (pendingLength == 0) return 0;
    *byte = *pending++;
    --pendingLength;
    return 1;
}

static int port_receive_frame(void* port, unsigned char* data, int maxLength, int timeoutMs,
                              int gapMs, int* received, int reserved) {
    (void)port;
    (void)timeoutMs;
    (void)gapMs;
    if (reserved != 0) ++books.mistakes;
    *received = pendingLength < maxLength ? pendingLength : maxLength;
    memcpy(data, pending, (size_t)*received);
    pending += *received;
    pendingLength -= *received;
    return *received > 0;
}

static const SerialPortTable portTable = {port_configure, port_purge, port_receive_byte, port_send,
                                          port_receive_frame};
static Object port = {&portTable};

/* "ISerialFactory" */

static void* serial_convert(void* object, const char* name) {
    return strcmp(name, "ISerialFactory") == 0 ? object : 0;
}

static const char* serial_name(const void* object) {
    (void)object;
    return "CSerialFactory";
}

static void* serial_open(void* object, const char* name) {
    (void)object;
    if (strcmp(name, "com1") != 0 || books.portsOpen != 0) return 0;
    ++books.portsOpen;
    return &port;
}

static void serial_release(void* object, void* released) {
    (void)object;
    if (released != &port || books.portsOpen != 1) ++books.mistakes;
    --books.portsOpen;
}

static const SerialFactoryTable serialTable = {NO_DESTRUCTORS, serial_convert, serial_name,
                                               version_one,    serial_open,    serial_release};
static Object serial = {&serialTable};

/* The two services that a driver only holds. */

static void* held_convert(void* object, const char* name) {
    (void)name;
    return object;
}

static const char* held_name(const void* object) {
    (void)object;
    return "CHeldService";
}

static const InterfaceTable heldTable = {NO_DESTRUCTORS, held_convert, held_name, version_one};
static Object sockets = {&heldTable};
static Object dataBuffer = {&heldTable};

/* The factory of all of them. */

static void* factory_create(void* factory, const char* name) {
    static const struct {
        const char* name;
        Object* object;
    } services[] = {{"IMultiTask2", &multiTask},
                    {"ISerialFactory", &serial},
                    {"ISocketFactory", &sockets},
                    {"ICDSBuffer", &dataBuffer}};
    (void)factory;
    for (unsigned i = 0; i < sizeof services / sizeof *services; ++i) {
        if (strcmp(name, services[i].name) != 0) continue;
        ++books.held;
        return services[i].object;
    }
    return 0;
}

static void factory_release(void* factory, void* held) {
    (void)factory;
    if (held == 0 || books.held == 0) ++books.mistakes;
    --books.held;
}

static const InterfaceFactoryTable factoryTable = {factory_create, factory_release};
static Object factory = {&factoryTable};

void* host_factory(void) {
    return &factory;
}
