// The engine needs no host: the services that the framework may ask for are missing here.
#include "framework/HostServicePointers.h"

IInterface* piMultiTask = nullptr;
IInterface* piSerialFactory = nullptr;
IInterface* piSocketFactory = nullptr;
IInterface* piCDSBuffer = nullptr;
IInterface* piDiag = nullptr;
IInterface* piPermanentStorage = nullptr;
IInterface* piDriverInterface = nullptr;
IInterface* piSmux = nullptr;
IInterface* piFastTimer = nullptr;
