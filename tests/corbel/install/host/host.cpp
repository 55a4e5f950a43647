// A host built against the installed package: it creates the expert through the library's
// export and prints the expert's display name (ASCII).
#include <qv1588/corbel.h>

#include <cstdio>

int main() {
    IkxSysExpert2* expert = nullptr;
    if (FAILED(createCorbelExpert(&expert))) {
        return 1;
    }
    BSTR name = nullptr;
    const HRESULT result = expert->GetDisplayName(&name);
    for (const OLECHAR* unit = name; unit != nullptr && *unit != u'\0'; ++unit) {
        std::putchar(static_cast<char>(*unit));
    }
    std::putchar('\n');
    SysFreeString(name);
    expert->Release();
    return SUCCEEDED(result) ? 0 : 1;
}
