// The root of every interface that host and plug-in show each other.
#pragma once

#include <cstring>

/// True only when both names are the same byte for byte: case counts, nothing is trimmed.
/// A null name equals nothing.
inline bool CompareInterface(const char* a, const char* b) {
    return a != nullptr && b != nullptr && std::strcmp(a, b) == 0;
}

/// An object that can be asked for another face of itself by name.
/// Threads: every call here is a query and may come from any thread.
class IInterface {
  public:
    virtual ~IInterface() = default;

    /// @return this object as the interface or class called `name`, or null when it is none such.
    /// The caller casts the pointer to exactly that interface; ownership does not move.
    virtual void* ConvertTo(const char* name) = 0;

    /// @return the implementation's own name; lives as long as the object.
    virtual const char* GetImpName() const = 0;

    /// @return the implementation's version, e.g. 100 for 1.00.
    virtual int GetImpVersion() const = 0;
};
