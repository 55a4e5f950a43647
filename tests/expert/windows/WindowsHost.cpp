// A Windows host as one is written for the platform: <windows.h> first, then the public
// headers, whose COM types are then the platform's own (IUnknown, BSTR from oleaut32). It
// loads qv1588.dll with LoadLibrary, creates and initialises the expert, lists the items,
// reads each one's priority1 and user description with GetItemProperties, prints
// "NAME priority1=N userDescription=TEXT" per item and releases everything. Exit code 0 when
// every step worked. tools/build-windows runs it under Wine against real clocks.
// Usage: qv_windows_host PATH-OF-qv1588.dll
#include <windows.h>

#include <qv1588/corbel.h>
#include <qv1588/qv1588.h>

#include <cstdio>
#include <string>

namespace {

// The clocks' texts here are ASCII.
std::string narrow(const OLECHAR* text) {
    std::string result;
    for (; text != nullptr && *text != 0; ++text) {
        result.push_back(*text < 0x80 ? static_cast<char>(*text) : '?');
    }
    return result;
}

bool check(HRESULT result, const char* step) {
    if (result != S_OK) {
        std::fprintf(stderr, "qv_windows_host: %s: 0x%08lX\n", step, result);
    }
    return result == S_OK;
}

bool printItem(IkxSysExpert2& expert, const OLECHAR* name) {
    const kxSysAttributeTagID tags[] = {kxQvPriority1, kxQvUserDescription};
    IkxSysPropertyBag* bag = nullptr;
    ULONG priority1 = 0;
    BSTR description = nullptr;
    const bool read = check(expert.GetItemProperties(name, 2, tags, nullptr, &bag), "read") &&
                      check(bag->GetULong(kxQvPriority1, &priority1), "GetULong") &&
                      check(bag->GetString(kxQvUserDescription, &description), "GetString");
    std::printf("%s priority1=%lu userDescription=%s\n", narrow(name).c_str(), priority1,
                narrow(description).c_str());
    SysFreeString(description);
    if (bag != nullptr) {
        bag->Release();
    }
    return read;
}

bool listAndRead(IkxSysExpert2& expert) {
    IkxSysEnumStringList* names = nullptr;
    bool allRead = check(expert.GetItemNames(&names), "GetItemNames");
    BSTR name = nullptr;
    while (allRead && names->Next(1, &name, nullptr) == S_OK) {
        allRead = printItem(expert, name);
        SysFreeString(name);
    }
    if (names != nullptr) {
        names->Release();
    }
    return allRead;
}

}  // namespace

int main(int argc, char** argv) {
    HMODULE library = LoadLibraryA(argc > 1 ? argv[1] : "qv1588.dll");
    const auto create = reinterpret_cast<createCorbelExpertFunction>(reinterpret_cast<void*>(
        library != nullptr ? GetProcAddress(library, "createCorbelExpert") : nullptr));
    IkxSysExpert2* expert = nullptr;
    bool worked = create != nullptr && check(create(&expert), "createCorbelExpert");
    if (worked) {
        worked = check(expert->Initialize(), "Initialize") && listAndRead(*expert);
        check(expert->Shutdown(), "Shutdown");
        expert->Release();
    }
    if (library != nullptr) {
        FreeLibrary(library);
    }
    return worked ? 0 : (std::fprintf(stderr, "qv_windows_host: failed\n"), 1);
}
