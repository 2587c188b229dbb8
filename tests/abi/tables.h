/* The tables of the host's and the plug-in's interfaces, laid out by hand.
 *
 * Source: Itanium C++ ABI, 2.5 (virtual tables) and 2.9.2; the ABI for the Arm Architecture follows
 * it. An object begins with a pointer to its table. A virtual destructor takes two slots, the
 * complete and the deleting one; every other operation takes one, in the order of declaration. */
#ifndef MRTU_TESTS_ABI_TABLES_H
#define MRTU_TESTS_ABI_TABLES_H

#include <stdbool.h>

typedef void (*Slot)(void);

/* Stands where a C host has nothing to call and nobody calls the host. */
#define UNUSED_SLOTS(name, count) Slot name[count]

/* What every table of the IInterface family begins with. */
#define INTERFACE_SLOTS                                 \
    UNUSED_SLOTS(destructors, 2);                       \
    void* (*ConvertTo)(void* object, const char* name); \
    const char* (*GetImpName)(const void* object);      \
    int (*GetImpVersion)(const void* object)

typedef struct {
    INTERFACE_SLOTS;
} InterfaceTable;

/* The two factories of interfaces have no destructor in their tables. */
typedef struct {
    void* (*CreateInterface)(void* factory, const char* name);
    void (*ReleaseInterface)(void* factory, void* held);
} InterfaceFactoryTable;

typedef struct {
    INTERFACE_SLOTS;
    int (*Init)(void* module, void* hostFactory);
    void (*Close)(void* module);
    const char* (*GetLastError)(const void* module);
} ProtModuleTable;

typedef struct {
    INTERFACE_SLOTS;
    void* (*CreateProtocol)(void* factory, const char* name);
    void (*DeleteProtocol)(void* factory, void* protocol);
} ProtocolFactoryTable;

/* IProtocol and IProtocol2; the later generations follow behind. */
typedef struct {
    INTERFACE_SLOTS;
    int (*Config)(void* protocol, const char* text);
    void* (*CreateTag)(void* protocol, const char* uri);
    void (*FreeTag)(void* protocol, void* tag);
    bool (*CanBeOptimized)(const void* protocol, const void* a, const void* b, bool write);
    int (*Start)(void* protocol);
    int (*Stop)(void* protocol);
    int (*Read)(void* protocol, const void* tag, unsigned char* value);
    int (*Write)(void* protocol, const void* tag, const unsigned char* value);
    int (*ReadBlock)(void* protocol, const void* tag, unsigned char* data, int length);
    int (*WriteBlock)(void* protocol, const void* tag, const unsigned char* data, int length);
    int (*MaxDatagramItems)(const void* protocol, const void* tag);
    int (*MaxDatagramLength)(const void* protocol, const void* tag);
    UNUSED_SLOTS(datagrams, 2);
    const char* (*GetName)(const void* protocol);
    const char* (*GetNextInstanceName)(const void* protocol);
    int (*GetLastError)(const void* protocol);
    const char* (*GetLastErrorString)(const void* protocol);
    int (*GetProtocolVersion)(const void* protocol);
    int (*GetProtocolType)(const void* protocol);
    const char* (*GetProtocolName)(const void* protocol);
    int (*GetInfo)(const void* protocol, char* buffer, int size);
    const unsigned char* (*GetXml)(const void* protocol);
    bool (*IsConverted)(const void* protocol);
    const char* (*GetIdent)(const void* protocol);
    void (*SetIdent)(void* protocol, const char* ident);
    int (*DoCommand)(void* protocol, const char* command, char* answer, int size);
    int (*Extend)(void* protocol, int code, void* data);
} ProtocolTable;

typedef struct {
    UNUSED_SLOTS(destructors, 2);
    void* (*Clone)(const void* tag);
    unsigned int (*GetByteOffset)(const void* tag);
    int (*GetBitIndex)(const void* tag);
    const char* (*GetVarName)(const void* tag);
    int (*GetVarType)(const void* tag);
    int (*GetVarLength)(const void* tag);
    int (*GetItemType)(const void* tag);
    int (*PackedLen)(const void* tag);
} TagTable;

typedef struct {
    void (*lock)(void* lock);
    void (*unlock)(void* lock);
} LockTable;

typedef struct {
    INTERFACE_SLOTS;
    void* (*createLock)(void* service, int reserved);
    void (*deleteLock)(void* service, void* lock);
    void (*sleep)(void* service, int ms);
} MultiTaskTable;

typedef struct {
    int (*configure)(void* port, int baud, int parity, int dataBits, int stopBits, int mode);
    void (*purge)(void* port);
    int (*receiveByte)(void* port, unsigned char* byte, int timeoutMs, int reserved);
    int (*send)(void* port, const unsigned char* data, int length);
    int (*receiveFrame)(void* port, unsigned char* data, int maxLength, int timeoutMs, int gapMs,
                        int* received, int reserved);
} SerialPortTable;

typedef struct {
    INTERFACE_SLOTS;
    void* (*openPort)(void* factory, const char* name);
    void (*releasePort)(void* factory, void* port);
} SerialFactoryTable;

/* The table of an object: TABLE(Protocol, object)->Start(object). */
#define TABLE(kind, object) (*(const kind##Table* const*)(object))

#endif
