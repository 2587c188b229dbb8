// The loaded plug-in as the examples of the documents use it: one model, devices that answer all.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <optional>
#include <string>
#include <vector>

#include "platform/IProtocol.h"
#include "tests/support/FakeHost.h"
#include "tests/support/Replies.h"
#include "tests/unit/plugin/LoadedLibrary.h"

namespace docs_test {

using Texts = std::vector<std::string>;

inline std::string configuration(const std::string& model) {
    return "CfgVer=1 defNodeId=1 uart=com1 baudrate=9600 parity=none stopbits=1 mode=RS-232 "
           "txMode=RTU repeat=0 model=" +
           model;
}

/// The loaded driver with one model, started; every device answers, its memory all zeros or what
/// was told.
class DriverOfThePage {
  public:
    explicit DriverOfThePage(const std::string& model) {
        host_.serialFactory.offer("com1", port_);
        port_.answerWith([this](const testing_support::Bytes& frame) {
            return answerTo(testing_support::rtuMessage(frame));
        });
        if (library_.module()->Init(&host_) == 0) ADD_FAILURE() << "no module";
        protocol_ = library_.protocols()->CreateProtocol("MRTU");
        const bool ok =
            protocol_->Config(configuration(model).c_str()) != 0 && protocol_->Start() != 0;
        if (!ok) ADD_FAILURE() << protocol_->GetLastErrorString();
    }
    ~DriverOfThePage() {
        library_.protocols()->DeleteProtocol(protocol_);
        library_.module()->Close();
    }
    DriverOfThePage(const DriverOfThePage&) = delete;
    DriverOfThePage& operator=(const DriverOfThePage&) = delete;

    /// What the devices' registers hold, from each request's first one on.
    void hold(const testing_support::Bytes& memory) { memory_ = memory; }

    /// @return null when the driver refuses; lastError() then tells why.
    ITag* create(const std::string& uri) {
        longItems_ = uri.find("?LONG?") != std::string::npos;
        return protocol_->CreateTag(uri.c_str());
    }
    /// @return why the driver refuses the tag, without the tag; empty when it takes it.
    std::string refusalOf(const std::string& uri) {
        if (create(uri) != nullptr) return {};
        const std::string front = "Tag URI error: " + uri + " - ";
        const std::string error = lastError();
        EXPECT_EQ(-1, code());
        EXPECT_EQ(front, error.substr(0, front.size()));
        return error.substr(std::min(front.size(), error.size()));
    }

    std::optional<testing_support::Bytes> read(const ITag& tag) {
        testing_support::Bytes value(static_cast<std::size_t>(std::max(tag.GetVarLength(), 0)) + 1,
                                     0xEE);
        if (protocol_->Read(&tag, value.data()) == 0) return std::nullopt;
        value.pop_back();
        return value;
    }
    bool write(const ITag& tag) {
        const testing_support::Bytes zeros(
            static_cast<std::size_t>(std::max(tag.GetVarLength(), 0)) + 1, 0);
        return protocol_->Write(&tag, zeros.data()) != 0;
    }

    /// The requests since the last call, without their check.
    Texts sent() {
        Texts texts;
        for (const testing_support::Bytes& frame : port_.sent())
            texts.push_back(testing_support::toHex(testing_support::rtuMessage(frame)));
        port_.forget();
        return texts;
    }
    int code() const { return protocol_->GetLastError(); }
    std::string lastError() const { return protocol_->GetLastErrorString(); }

  private:
    testing_support::Bytes answerTo(const testing_support::Bytes& request) const {
        const int count = request[4] * 256 + request[5];
        if (request[1] > 4)
            return testing_support::rtuFrame({request.begin(), request.begin() + 6});
        const bool bits = request[1] < 3;
        const int length = bits ? (count + 7) / 8 : count * (longItems_ ? 4 : 2);
        testing_support::Bytes answer{request[0], request[1], static_cast<std::uint8_t>(length)};
        for (std::size_t byte = 0; byte < static_cast<std::size_t>(length); ++byte)
            answer.push_back(byte < memory_.size() ? memory_[byte] : std::uint8_t{0});
        return testing_support::rtuFrame(answer);
    }

    testing_support::FakeHost host_;
    testing_support::ScriptedPort port_{host_.multiTask};
    LoadedLibrary library_;
    IProtocol* protocol_ = nullptr;
    testing_support::Bytes memory_;
    bool longItems_ = false;
};

}  // namespace docs_test
