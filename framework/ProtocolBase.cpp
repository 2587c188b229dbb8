// Identity, error state, ownership of tags and the fields of a tag URI.
#include "framework/ProtocolBase.h"

#include <sys/time.h>

#include <algorithm>
#include <cstring>
#include <string_view>

#include "framework/DataTypes.h"
#include "framework/HostServicePointers.h"
#include "framework/TagBase.h"
#include "framework/TextUtils.h"

namespace {

constexpr int kProtocolBaseVersion = 100;

constexpr const char* kEveryFace[] = {"ProtocolBase", "IProtocol7", "IProtocol6", "IProtocol5",
                                      "IProtocol4",   "IProtocol3", "IProtocol2", "IProtocol"};

const char* orEmpty(const char* text) {
    return text != nullptr ? text : "";
}

bool equalTexts(const char* a, const char* b) {
    return a != nullptr && b != nullptr && std::strcmp(a, b) == 0;
}

/// Writes into the caller's buffer until it is full. Like a stream, it goes bad at the first null
/// text and swallows whatever follows.
class InfoWriter {
  public:
    InfoWriter(char* out, int size) : out_(out, size) {}

    InfoWriter& operator<<(const char* text) {
        if (text == nullptr) bad_ = true;
        if (!bad_) out_ << text;
        return *this;
    }

    InfoWriter& operator<<(int number) {
        if (!bad_) out_ << number;
        return *this;
    }

    int written() const { return out_.written(); }

  private:
    ProtUtilsN::BoundedWriter out_;
    bool bad_ = false;
};

/// @return the first character of the next field, or null when `field` is the last one.
const char* nextField(const char* field) {
    const char* mark = std::strchr(field, '?');
    return mark != nullptr ? mark + 1 : nullptr;
}

}  // namespace

ProtocolBase::ProtocolBase() = default;

ProtocolBase::~ProtocolBase() {
    DeleteTags();
}

void* ProtocolBase::ConvertTo(const char* name) {
    const bool known =
        std::any_of(std::begin(kEveryFace), std::end(kEveryFace),
                    [name](const char* face) { return CompareInterface(name, face); });
    return known ? this : nullptr;
}

ITag* ProtocolBase::CreateTag(const char* uri) {
    ITag* const tag = CreateTagBase(uri);
    if (tag == nullptr) return nullptr;
    const bool listed = guardedBy(false, [&] {
        tags_.add(tag);
        return true;
    });
    if (listed) return tag;
    delete tag;
    return nullptr;
}

void ProtocolBase::FreeTag(ITag* tag) {
    tags_.remove(tag);
    delete tag;
}

void ProtocolBase::DeleteTags() {
    for (ITag* tag : tags_)
        delete tag;
    tags_.clear();
}

int ProtocolBase::Start() {
    return 1;
}

int ProtocolBase::Stop() {
    return 1;
}

const char* ProtocolBase::GetNextInstanceName() const {
    return GetName();
}

const unsigned char* ProtocolBase::GetXml() const {
    return nullptr;
}

bool ProtocolBase::IsConverted() const {
    return false;
}

const char* ProtocolBase::GetIdent() const {
    const char* ident = ident_.get();
    return *ident != '\0' ? ident : GetName();
}

void ProtocolBase::SetIdent(const char* ident) {
    if (!ident_.set(orEmpty(ident))) SetError(-1, "Out of memory");
}

int ProtocolBase::GetLastError() const {
    return error_.last().code;
}

const char* ProtocolBase::GetLastErrorString() const {
    return error_.last().text;
}

void ProtocolBase::SetError(int code, const char* text) noexcept {
    error_.set(code, orEmpty(text));
}

int ProtocolBase::outOfMemory() noexcept {
    SetError(-1, "Out of memory");
    return 0;
}

void ProtocolBase::SetTagError(const TagBase* tag) noexcept {
    if (tag->wasShortOfMemory()) {
        outOfMemory();
        return;
    }
    const std::string_view parts[] = {"Tag URI error: ", orEmpty(tag->GetVarName()), " - ",
                                      tag->getError()};
    if (!error_.setQuoting(-1, parts)) outOfMemory();
}

int ProtocolBase::GetInfo(char* buffer, int size) const {
    InfoWriter info(buffer, size);
    info << "Protocol: " << GetName() << " (" << GetProtocolType() << ") v." << GetProtocolVersion()
         << "\n";
    info << "Implementation: " << GetImpName() << " v." << GetImpVersion() << "\n";
    info << "ProtocolBase v." << kProtocolBaseVersion << "\n";
    info << "ProtLib v." << ProtUtilsN::GetVersion() << "\n";
    if (IsConverted()) return info.written();

    for (const IInterface* service : {piMultiTask, piSerialFactory, piSocketFactory}) {
        if (service == nullptr) continue;
        info << service->GetImpName() << " v." << service->GetImpVersion() << "\n";
    }
    return info.written();
}

const char* const* ProtocolBase::tagUriNames() const {
    static constexpr const char* kNoNames[] = {nullptr};
    return kNoNames;
}

int ProtocolBase::getTagUriFieldCount() const {
    int count = 0;
    for (const char* const* name = tagUriNames(); *name != nullptr; ++name)
        ++count;
    return count;
}

const char* ProtocolBase::getTagUriFieldName(int index) const {
    if (index < 0 || index >= getTagUriFieldCount()) return nullptr;
    return tagUriNames()[index];
}

int ProtocolBase::getTagUriFieldPosition(const char* name) const {
    const char* const* names = tagUriNames();
    for (int index = 0; names[index] != nullptr; ++index) {
        if (equalTexts(names[index], name)) return index;
    }
    return -1;
}

const char* ProtocolBase::getTagUriField(const ITag* tag, int index, int* length) const {
    if (index < 0) return nullptr;
    const char* field = tag->GetVarName();
    for (int skipped = 0; field != nullptr && skipped < index; ++skipped)
        field = nextField(field);
    if (field == nullptr) return nullptr;
    *length = static_cast<int>(std::strcspn(field, "?"));
    return field;
}

unsigned long long currentTimeStamp() {
    timeval now{};
    gettimeofday(&now, nullptr);
    return static_cast<unsigned long long>(now.tv_sec) * 1000ULL +
           static_cast<unsigned long long>(now.tv_usec) / 1000ULL;
}
