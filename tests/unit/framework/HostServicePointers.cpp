// The host services of a test program without plug-in: none, unless the test puts one in place.
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
