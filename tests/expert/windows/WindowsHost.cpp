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

namespace {

bool check(HRESULT result, const char* step) {
    if (result != S_OK) {
        std::fprintf(stderr, "qv_windows_host: %s: 0x%08lX\n", step, result);
    }
    return result == S_OK;
}

// One item's line; the clocks' texts here are ASCII.
bool printItem(IkxSysExpert2& expert, BSTR name) {
    const kxSysAttributeTagID tags[] = {kxQvPriority1, kxQvUserDescription};
    IkxSysPropertyBag* bag = nullptr;
    ULONG priority1 = 0;
    BSTR description = nullptr;
    const bool read = check(expert.GetItemProperties(name, 2, tags, nullptr, &bag), "read") &&
                      check(bag->GetULong(kxQvPriority1, &priority1), "GetULong") &&
                      check(bag->GetString(kxQvUserDescription, &description), "GetString");
    std::printf("%ls priority1=%lu userDescription=%ls\n", name, priority1,
                description != nullptr ? description : L"");
    SysFreeString(description);
    SysFreeString(name);
    if (bag != nullptr) {
        bag->Release();
    }
    return read;
}

}  // namespace

int main(int argc, char** argv) {
    HMODULE library = LoadLibraryA(argc > 1 ? argv[1] : "qv1588.dll");
    const auto create = reinterpret_cast<createCorbelExpertFunction>(reinterpret_cast<void*>(
        library != nullptr ? GetProcAddress(library, "createCorbelExpert") : nullptr));
    IkxSysExpert2* expert = nullptr;
    IkxSysEnumStringList* names = nullptr;
    bool worked = create != nullptr && check(create(&expert), "createCorbelExpert") &&
                  check(expert->Initialize(), "Initialize") &&
                  check(expert->GetItemNames(&names), "GetItemNames");
    BSTR name = nullptr;
    while (worked && names->Next(1, &name, nullptr) == S_OK) {
        worked = printItem(*expert, name);
    }
    if (names != nullptr) {
        names->Release();
    }
    if (expert != nullptr) {
        expert->Shutdown();
        expert->Release();
    }
    if (library != nullptr) {
        FreeLibrary(library);
    }
    return worked ? 0 : 1;
}
