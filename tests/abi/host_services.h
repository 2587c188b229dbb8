/* The host's services in plain C, and what the plug-in has done with them. */
#ifndef MRTU_TESTS_ABI_HOST_SERVICES_H
#define MRTU_TESTS_ABI_HOST_SERVICES_H

/* One request that the port expects and the answer that it then gives. */
typedef struct {
    const unsigned char* request;
    int requestLength;
    const unsigned char* reply;
    int replyLength;
} Exchange;

typedef struct {
    int held;       /* services taken and not yet handed back */
    int locksAlive; /* locks created and not yet deleted */
    int locksTaken; /* locks that somebody holds */
    int lockings;   /* how often a lock was taken */
    int sleptMs;
    int portsOpen;
    int settings[5];     /* baud, parity, data bits, stop bits, mode */
    int unexpectedSends; /* requests that are not the next of the script */
    int mistakes;        /* calls that no host would bear, such as unlocking a free lock */
} HostBooks;

extern HostBooks books;

/* The host's interface factory, for the module's Init(). */
void* host_factory(void);

/* Sets what the port "com1" answers from now on. The exchanges must outlive their use. */
void host_script(const Exchange* exchanges, int count);

#endif
