// A library with the right entry, which has nothing to give.
#include "platform/IInterfaceFactory.h"

extern "C" IInterfaceFactory* GetInterfaceFactory();
extern "C" IInterfaceFactory* GetInterfaceFactory() {
    return nullptr;
}
