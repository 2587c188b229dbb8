// The plug-in file, loaded for as long as an object lives.
#pragma once

#include "platform/IInterfaceFactory.h"
#include "platform/IProtModule.h"
#include "platform/IProtocolFactory.h"

class LoadedLibrary {
  public:
    /// Fails the test, with the loader's words, when the file cannot be loaded.
    LoadedLibrary();
    ~LoadedLibrary();
    LoadedLibrary(const LoadedLibrary&) = delete;
    LoadedLibrary& operator=(const LoadedLibrary&) = delete;

    bool loaded() const { return handle_ != nullptr; }
    IInterfaceFactory* factory() const;
    IProtModule* module() const;
    IProtocolFactory* protocols() const;
    void* symbol(const char* name) const;
    void unload();

    /// Whether the file is mapped, by whomever.
    static bool stillThere();

  private:
    void* handle_;
};
