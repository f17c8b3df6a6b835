#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/PluginEntry.h>
#include <zelmar/autocli/SharedLibraryPlugin.h>

#include <dlfcn.h>

using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

std::string LoaderError() {
    const char* error = dlerror();
    return error ? error : "(null)";
}

}  // namespace

SharedLibraryPlugin::~SharedLibraryPlugin() = default;

std::shared_ptr<SharedLibraryPlugin> SharedLibraryPlugin::New(const std::string& path) {
    return std::make_shared<SharedLibraryPlugin>(path);
}

void SharedLibraryPlugin::Initialize() {
    void* handle = dlopen(_path.c_str(), RTLD_LAZY | RTLD_GLOBAL);
    if (!handle) {
        throw ZelmarException("Unable to load plugin from " + _path + " : " + LoaderError());
    }
    std::shared_ptr<void> object(handle, &dlclose);
    void* entry = dlsym(handle, "AutoCli_RegisterNamespaces");
    if (!entry) {
        throw ZelmarException("Unable to get plugin registration point from " + _path + " : " +
                              LoaderError());
    }
    _handle = std::move(object);
    _registerNamespaces = reinterpret_cast<decltype(&AutoCli_RegisterNamespaces)>(entry);
}

const std::string& SharedLibraryPlugin::GetName() const {
    return _path;
}

void SharedLibraryPlugin::RegisterNamespaces(std::shared_ptr<Namespace> root) {
    if (!_registerNamespaces) {
        return;
    }
    if (const auto treeRoot = std::dynamic_pointer_cast<RootNamespace>(root)) {
        treeRoot->KeepAlive(_handle);
    }
    // The code of a foreign exception can go with the object: only its text leaves.
    try {
        _registerNamespaces(std::move(root));
    } catch (const ZelmarException&) {
        throw;
    } catch (const std::exception& error) {
        throw ZelmarException(error.what());
    } catch (...) {
        throw ZelmarException("Unknown error");
    }
}

bool SharedLibraryPlugin::HasFormatter(const std::string& /*name*/) {
    return false;
}

std::shared_ptr<Formatter> SharedLibraryPlugin::GetFormatter(const std::string& /*name*/) {
    return nullptr;
}

const std::vector<std::shared_ptr<Formatter>>& SharedLibraryPlugin::GetFormatters() {
    static const std::vector<std::shared_ptr<Formatter>> none;
    return none;
}

}  // namespace AutoCli
