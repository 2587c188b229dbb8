#include "tests/abi/shortage/Host.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <iterator>

#include "tests/abi/shortage/ShortMemory.h"

namespace shortage {

class MultiTask::Lock final : public ILock {
  public:
    explicit Lock(int& held) : held_(held) {}
    void lock() override {
        if (taken_) std::abort();
        taken_ = true;
        ++held_;
    }
    void unlock() override {
        if (!taken_) std::abort();
        taken_ = false;
        --held_;
    }

  private:
    int& held_;
    bool taken_ = false;
};

void* MultiTask::ConvertTo(const char* name) {
    return CompareInterface(name, "IMultiTask2") ? static_cast<IMultiTask2*>(this) : nullptr;
}

ILock* MultiTask::createLock(int) {
    const Plenty plenty;
    ++alive_;
    return new Lock(held_);
}

void MultiTask::deleteLock(ILock* lock) {
    const Plenty plenty;
    --alive_;
    delete static_cast<Lock*>(lock);
}

void MultiTask::sleep(int) {}

// Line

int Line::configure(int baud, int parity, int dataBits, int stopBits, int mode) {
    const Plenty plenty;
    settings_.clear();
    for (const int number : {baud, parity, dataBits, stopBits, mode})
        settings_ += std::to_string(number) + ' ';
    return 1;
}

int Line::receiveByte(unsigned char* byte, int timeoutMs, int) {
    if (timeoutMs == 0 || next_ >= length_) return 0;
    *byte = reply_[next_++];
    return 1;
}

int Line::receiveFrame(unsigned char* data, int maxLength, int, int, int* received, int) {
    *received = std::min(length_ - next_, maxLength);
    std::copy_n(reply_ + next_, *received, data);
    next_ += *received;
    return *received > 0 ? 1 : 0;
}

int Line::send(const unsigned char* data, int length) {
    length_ = 0;
    next_ = 0;
    if (length < 8) return 1;
    if (data[1] <= 4) {
        answerRead(data);
    } else {
        for (int byte = 0; byte < 6; ++byte)
            put(data[byte]);
    }
    putCheck();
    return 1;
}

void Line::answerRead(const unsigned char* request) {
    const unsigned address = request[2] * 256U + request[3];
    const unsigned count = request[4] * 256U + request[5];
    const bool bits = request[1] <= 2;
    const unsigned width = request[0] == 2 ? 4 : 2;
    put(request[0]);
    put(request[1]);
    put(bits ? (count + 7) / 8 : count * width);
    if (bits) {
        for (unsigned byte = 0; byte < (count + 7) / 8; ++byte)
            put(address % 2 == 0 ? 0xAA : 0x55);
        return;
    }
    for (unsigned item = 0; item < count; ++item) {
        for (unsigned filler = 2; filler < width; ++filler)
            put(0);
        put((address + item) / 256);
        put(address + item);
    }
}

void Line::put(unsigned byte) {
    if (length_ < static_cast<int>(sizeof reply_))
        reply_[length_++] = static_cast<unsigned char>(byte & 0xFFU);
}

// Source: Modbus over Serial Line V1.02, 6.2.2.
void Line::putCheck() {
    unsigned crc = 0xFFFF;
    for (int at = 0; at < length_; ++at) {
        crc ^= reply_[at];
        for (int bit = 0; bit < 8; ++bit)
            crc = (crc & 1U) != 0 ? (crc >> 1) ^ 0xA001U : crc >> 1;
    }
    put(crc & 0xFFU);
    put(crc >> 8);
}

// SerialFactory

void* SerialFactory::ConvertTo(const char* name) {
    return CompareInterface(name, "ISerialFactory") ? static_cast<ISerialFactory*>(this) : nullptr;
}

ISerialPort* SerialFactory::openPort(const char*) {
    ++open_;
    return &line_;
}

void SerialFactory::releasePort(ISerialPort*) {
    --open_;
}

// Storage

void* Storage::ConvertTo(const char* name) {
    if (CompareInterface(name, "IPermanentStorage")) return static_cast<IPermanentStorage*>(this);
    if (CompareInterface(name, "IPermanentStorage2")) return static_cast<IPermanentStorage2*>(this);
    return nullptr;
}

void Storage::writeString(const char* section, const char* key, const char* value) {
    const Plenty plenty;
    sections_[section][key] = value;
}

void Storage::writeBool(const char* section, const char* key, bool value) {
    writeString(section, key, value ? "1" : "0");
}

void Storage::writeInt(const char* section, const char* key, int value) {
    const Plenty plenty;
    sections_[section][key] = std::to_string(value);
}

const char* Storage::readString(const char* section, const char* key) {
    const Plenty plenty;
    return sections_[section][key].c_str();
}

bool Storage::readBool(const char* section, const char* key) {
    return readInt(section, key) != 0;
}

int Storage::readInt(const char* section, const char* key) {
    return std::atoi(readString(section, key));
}

int Storage::hasKey(const char* section, const char* key) {
    const Plenty plenty;
    return sections_[section].contains(key) ? 1 : 0;
}

void Storage::removeKey(const char* section, const char* key) {
    const Plenty plenty;
    sections_[section].erase(key);
}

int Storage::keyCount(const char* section) {
    const Plenty plenty;
    return static_cast<int>(sections_[section].size());
}

const char* Storage::keyName(const char* section, int index) {
    const Plenty plenty;
    return std::next(sections_[section].begin(), index)->first.c_str();
}

int Storage::readStringInto(const char* section, const char* key, char* buffer, int size) {
    std::strncpy(buffer, readString(section, key), static_cast<std::size_t>(size));
    return 1;
}

int Storage::keyNameInto(const char* section, int index, char* buffer, int size) {
    std::strncpy(buffer, keyName(section, index), static_cast<std::size_t>(size));
    return 1;
}

std::string Storage::contents() const {
    std::string text;
    for (const auto& [section, keys] : sections_)
        for (const auto& [key, value] : keys)
            text += section + '/' + key + '=' + value + '\n';
    return text;
}

// Host

IInterface* Host::CreateInterface(const char* name) {
    if (CompareInterface(name, withheld_)) return nullptr;
    ++servicesHeld_;
    if (CompareInterface(name, "IMultiTask2")) return &multiTask;
    if (CompareInterface(name, "ISerialFactory")) return &serialFactory;
    if (CompareInterface(name, "IPermanentStorage")) return &storage;
    return &held_;
}

void Host::ReleaseInterface(IInterface*) {
    --servicesHeld_;
}

}  // namespace shortage
