// The host services that a driver only holds: their own operations belong to the host.
#pragma once

#include "platform/IInterface.h"

class ISocketFactory : public IInterface {};
class ICDSBuffer : public IInterface {};
class IDiag : public IInterface {};
class IDriverInterface : public IInterface {};
class ISmux : public IInterface {};
class IFastTimer : public IInterface {};
