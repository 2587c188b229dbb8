// The optional capabilities that a driver has only when it overrides them.
#include "framework/BitUtils.h"
#include "framework/ProtocolBase.h"

namespace {

constexpr int kGeneralFailure = -1;
constexpr int kNotAvailable = -3;

/// Bytes between two tags; in effect no limit.
constexpr int kAnyGap = 0xFFFFFF;
static_assert(kAnyGap == 16777215);

}  // namespace

// Block writes and datagrams.

int ProtocolBase::WriteBlock(const ITag*, const unsigned char*, int) {
    SetError(kNotAvailable, "Optimized writing not supported");
    return 0;
}

int ProtocolBase::MaxDatagramItems(const ITag*) const {
    return 0;
}

int ProtocolBase::MaxDatagramLength(const ITag*) const {
    return 0;
}

bool ProtocolBase::CanCoexistInDatagram(const ITag*, const ITag*) const {
    return false;
}

int ProtocolBase::ReadDatagram(const ITag* const*, int, unsigned char*) {
    return 0;
}

bool ProtocolBase::CanWriteDatagrams(const ITag*) const {
    return false;
}

bool ProtocolBase::CanAddToWriteDatagram(const ITag* const*, int, const ITag*) const {
    return false;
}

int ProtocolBase::WriteDatagramWithStatus(const ITag* const*, int, const unsigned char*,
                                          idal_error_t*) {
    return 0;
}

// Several tags at once.

bool ProtocolBase::MultipleReadSupported() const {
    return false;
}

int ProtocolBase::MultipleRead(IMultiRead*) {
    return 0;
}

bool ProtocolBase::MultipleWriteSupported() const {
    return false;
}

int ProtocolBase::MultipleWrite(IMultiWrite*) {
    return 0;
}

// Bit blocks.

bool ProtocolBase::CanReadBitBlock(const ITag*) const {
    return false;
}

int ProtocolBase::ReadBitBlock(const ITag*, unsigned char*, int) {
    return 0;
}

bool ProtocolBase::CanWriteBitBlock(const ITag*) const {
    return false;
}

int ProtocolBase::WriteBitBlock(const ITag*, const unsigned char*, int) {
    return 0;
}

// How tags lie to one another.

int ProtocolBase::MaxUnusedGap(const ITag*) const {
    return kAnyGap;
}

bool ProtocolBase::IsBefore(const ITag* a, const ITag* b) const {
    return a->GetByteOffset() < b->GetByteOffset();
}

bool ProtocolBase::IsAdjacent(const ITag* a, const ITag* b) const {
    if (adjacency_ != nullptr) return adjacency_(a, b);
    return ProtUtilsN::getEndingBit(b) == ProtUtilsN::getStartingBit(a);
}

bool ProtocolBase::NeedsReadBeforeWrite(const ITag*) const {
    return false;
}

// Extensions, objects and the line.

int ProtocolBase::Extend(int, void*) {
    return 0;
}

void* ProtocolBase::GetInterface(const char*) {
    return nullptr;
}

int ProtocolBase::readObject(const ITag*, IObjectString*) {
    SetError(kGeneralFailure, "read object not supported");
    return 0;
}

int ProtocolBase::writeObject(const ITag*, const IObjectString*) {
    SetError(kGeneralFailure, "write object not supported");
    return 0;
}

int ProtocolBase::vcsGetCapability() const {
    return 0;
}

int ProtocolBase::vcsGetComParams(char*, int) const {
    return 0;
}

int ProtocolBase::vcsActivateInterleaved(unsigned short) {
    return 0;
}

// Events.

int ProtocolBase::refuseEvents() {
    SetError(kGeneralFailure, "protocol does not support event channel");
    return 0;
}

IEventChannel* ProtocolBase::createEventChannel(int) {
    refuseEvents();
    return nullptr;
}

IEventChannel* ProtocolBase::createEventChannel(IEventProcessor*) {
    refuseEvents();
    return nullptr;
}

void ProtocolBase::deleteEventChannel(IEventChannel*) {}

int ProtocolBase::addEventSource(IEventChannel*, const char*) {
    return refuseEvents();
}

int ProtocolBase::addAlarmEvents(IEventChannel*, IAlarm*) {
    return refuseEvents();
}

void* ProtocolBase::frontEvent(IEventChannel*) {
    return nullptr;
}

void ProtocolBase::popEvent(IEventChannel*) {}

// Alarms.

IAlarm* ProtocolBase::createAlarm(const char*) {
    SetError(kGeneralFailure, "protocol does not support alarms");
    return nullptr;
}

void ProtocolBase::deleteAlarm(IAlarm*) {}

int ProtocolBase::listAlarms(IAlarmProcessor*) {
    return 0;
}

int ProtocolBase::quitAlarm(IAlarm*) {
    return 0;
}

// Trends.

ITrend* ProtocolBase::createTrend(const char*) {
    SetError(kGeneralFailure, "protocol does not support trends");
    return nullptr;
}

void ProtocolBase::deleteTrend(ITrend*) {}

int ProtocolBase::readTrend(ITrend*, unsigned long long, unsigned long long, unsigned long long&,
                            unsigned int, bool, ITrendProcessor*) {
    return 0;
}

// Time stamps of the device itself.

bool ProtocolBase::hasPlcTimestamp(const ITag*) {
    return false;
}
