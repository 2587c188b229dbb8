/* A host in plain C. It finds the plug-in's entry by name and drives the driver through tables of
 * function pointers, the way the code of a foreign compiler would.
 *
 *   abi_host PLUGIN     exit code 0 when every check held; each that did not is printed */
#include <dirent.h>
#include <dlfcn.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

#include "tests/abi/host_services.h"
#include "tests/abi/tables.h"

#define ARRAY(...)            \
    (const unsigned char[]) { \
        __VA_ARGS__           \
    }
#define EXCHANGE(request, reply) \
    { request, (int)sizeof request, reply, (int)sizeof reply }
#define CONFIG                                                                                  \
    "CfgVer=1 defNodeId=1 model=3 uart=com1 baudrate=19200 parity=even stopbits=1 mode=RS-485 " \
    "txMode=RTU timeout=500"

static int checks;
static int failures;

#define CHECK(condition) check((condition) ? 1 : 0, #condition, __LINE__)

static void check(int held, const char* condition, int line) {
    ++checks;
    if (held) return;
    ++failures;
    printf("host.c:%d: not so: %s\n", line, condition);
}

static int is(const char* text, const char* expected) {
    if (text != 0 && strcmp(text, expected) == 0) return 1;
    printf("  \"%s\" instead of \"%s\"\n", text == 0 ? "(null)" : text, expected);
    return 0;
}

static int begins(const char* text, const char* expected) {
    return text != 0 && strncmp(text, expected, strlen(expected)) == 0;
}

static int threads(void) {
    DIR* tasks = opendir("/proc/self/task");
    int count = 0;
    if (tasks == 0) return -1;
    while (readdir(tasks) != 0)
        ++count;
    closedir(tasks);
    return count - 2; /* "." and ".." */
}

static void* library_factory(void* library) {
    void* (*entry)(void) = 0;
    void* const found = dlsym(library, "GetInterfaceFactory");
    /* ISO C knows no way from an object's address to a function but the copy. */
    memcpy(&entry, &found, sizeof entry);
    return entry == 0 ? 0 : entry();
}

static void test_identities(void* protocol) {
    const ProtocolTable* table = TABLE(Protocol, protocol);
    CHECK(table->ConvertTo(protocol, "IProtocol7") == protocol);
    CHECK(table->ConvertTo(protocol, "IProtocol8") == 0);
    CHECK(is(table->GetImpName(protocol), "Protocol_MRTU"));
    CHECK(table->GetImpVersion(protocol) == 100);
    CHECK(is(table->GetName(protocol), "MRTU"));
    CHECK(is(table->GetProtocolName(protocol), "Modbus RTU"));
    CHECK(table->GetProtocolVersion(protocol) == 126);
    CHECK(table->GetProtocolType(protocol) == 184);
    CHECK(!table->IsConverted(protocol));
    CHECK(begins((const char*)table->GetXml(protocol), "compressedXML="));
    table->SetIdent(protocol, "line1");
    CHECK(is(table->GetIdent(protocol), "line1"));
}

static void test_start(void* protocol) {
    static const int settings[5] = {19200, 1, 8, 1, 1};
    const ProtocolTable* table = TABLE(Protocol, protocol);
    CHECK(table->GetLastError(protocol) == 1);
    CHECK(table->Config(protocol, CONFIG) != 0);
    CHECK(table->Start(protocol) != 0);
    CHECK(books.portsOpen == 1);
    CHECK(memcmp(books.settings, settings, sizeof settings) == 0);
}

static void test_tag(void* tag) {
    const TagTable* table = TABLE(Tag, tag);
    CHECK(is(table->GetVarName(tag), "1?HREG?400001?unsignedShort"));
    CHECK(table->GetVarType(tag) == 6);
    CHECK(table->GetItemType(tag) == 0);
    CHECK(table->GetVarLength(tag) == 2);
    CHECK(table->PackedLen(tag) == 2);
    CHECK(table->GetByteOffset(tag) == 0);
    CHECK(table->GetBitIndex(tag) == 0);
}

static void test_read_and_write(void* protocol, void* tag) {
    static const unsigned char read[] = {0x01, 0x03, 0x00, 0x00, 0x00, 0x01, 0x84, 0x0A};
    static const unsigned char readReply[] = {0x01, 0x03, 0x02, 0x12, 0x34, 0xB5, 0x33};
    static const unsigned char write[] = {0x01, 0x10, 0x00, 0x00, 0x00, 0x01,
                                          0x02, 0xAB, 0xCD, 0x18, 0xF5};
    static const unsigned char writeReply[] = {0x01, 0x10, 0x00, 0x00, 0x00, 0x01, 0x01, 0xC9};
    static const unsigned char refusal[] = {0x01, 0x83, 0x02, 0xC0, 0xF1};
    static const Exchange exchanges[] = {EXCHANGE(read, readReply), EXCHANGE(write, writeReply),
                                         EXCHANGE(read, refusal)};
    const ProtocolTable* table = TABLE(Protocol, protocol);
    const int lockings = books.lockings;
    unsigned char value[4] = {0xEE, 0xEE, 0xEE, 0xEE};

    host_script(exchanges, 3);
    CHECK(table->Read(protocol, tag, value) != 0);
    CHECK(memcmp(value, ARRAY(0x34, 0x12, 0xEE, 0xEE), 4) == 0);
    CHECK(table->Write(protocol, tag, ARRAY(0xCD, 0xAB)) != 0);
    CHECK(table->Read(protocol, tag, value) == 0);
    CHECK(table->GetLastError(protocol) == -6);
    CHECK(is(table->GetLastErrorString(protocol), "Exception: Illegal data address"));
    CHECK(memcmp(value, ARRAY(0x34, 0x12, 0xEE, 0xEE), 4) == 0);
    CHECK(books.unexpectedSends == 0);
    CHECK(books.lockings >= lockings + 3);
    CHECK(books.locksTaken == 0);
}

static void test_console(void* protocol) {
    const ProtocolTable* table = TABLE(Protocol, protocol);
    char answer[256];
    memset(answer, 'x', sizeof answer);
    CHECK(table->DoCommand(protocol, "no such command", answer, 255) == 0);
    CHECK(answer[0] == 'x');
    CHECK(table->DoCommand(protocol, "info", answer, 255) == 1);
    CHECK(begins(answer, "Protocol: MRTU (184) v.126\n"));
    CHECK(strstr(answer, "CMultiTask v.1\nCSerialFactory v.1\nCHeldService v.1\n") != 0);
    CHECK(answer[255] == 'x');
}

static void test_channel(void* protocol) {
    const ProtocolTable* table = TABLE(Protocol, protocol);
    void* tag = 0;
    test_identities(protocol);
    test_start(protocol);
    CHECK(table->CreateTag(protocol, "1?HREG?400001") == 0);
    tag = table->CreateTag(protocol, "1?HREG?400001?unsignedShort");
    CHECK(tag != 0);
    if (tag != 0) {
        test_tag(tag);
        test_read_and_write(protocol, tag);
        table->FreeTag(protocol, tag);
    }
    test_console(protocol);
    CHECK(table->Stop(protocol) != 0);
    CHECK(books.portsOpen == 0);
}

static void test_protocol_factory(void* entry) {
    void* factory = TABLE(InterfaceFactory, entry)->CreateInterface(entry, "IProtocolFactory");
    void* protocol = 0;
    CHECK(factory != 0);
    if (factory == 0) return;
    CHECK(TABLE(ProtocolFactory, factory)->CreateProtocol(factory, "MTCP") == 0);
    protocol = TABLE(ProtocolFactory, factory)->CreateProtocol(factory, "MRTU");
    CHECK(protocol != 0);
    if (protocol != 0) test_channel(protocol);
    TABLE(ProtocolFactory, factory)->DeleteProtocol(factory, protocol);
    TABLE(InterfaceFactory, entry)->ReleaseInterface(entry, factory);
}

static void test_module(void* entry) {
    void* module = TABLE(InterfaceFactory, entry)->CreateInterface(entry, "IProtModule");
    CHECK(module != 0);
    CHECK(TABLE(InterfaceFactory, entry)->CreateInterface(entry, "ISomething") == 0);
    if (module == 0) return;
    CHECK(TABLE(ProtModule, module)->Init(module, host_factory()) == 1);
    CHECK(is(TABLE(ProtModule, module)->GetLastError(module), ""));
    CHECK(books.held == 4);
    test_protocol_factory(entry);
    TABLE(ProtModule, module)->Close(module);
    CHECK(books.held == 0);
    CHECK(books.locksAlive == 0);
    CHECK(books.mistakes == 0);
}

int main(int count, char** arguments) {
    const int threadsBefore = threads();
    void* library = count == 2 ? dlopen(arguments[1], RTLD_NOW | RTLD_LOCAL) : 0;
    void* entry = 0;
    if (library == 0) {
        printf("%s\n", count == 2 ? dlerror() : "usage: abi_host PLUGIN");
        return EXIT_FAILURE;
    }
    entry = library_factory(library);
    CHECK(entry != 0);
    if (entry != 0) test_module(entry);
    CHECK(threadsBefore > 0 && threads() == threadsBefore);
    CHECK(dlclose(library) == 0);
    CHECK(dlopen(arguments[1], RTLD_NOW | RTLD_NOLOAD) == 0);
    printf("%d checks, %d failures\n", checks, failures);
    return failures == 0 ? EXIT_SUCCESS : EXIT_FAILURE;
}
