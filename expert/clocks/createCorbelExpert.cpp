#include "expert/CQVComObject.h"
#include "expert/clocks/CPtpSysExpert.h"

// The library's one export: the only symbol the shared library makes visible.
extern "C" __attribute__((visibility("default"))) HRESULT KXSYS_CALL
createCorbelExpert(IkxSysExpert2** expert) {
    if (expert == nullptr) {
        return E_POINTER;
    }
    *expert = nullptr;
    CQVComObject<CPtpSysExpert>* created = nullptr;
    // A failure, the find mutex's included, leaves nothing behind: E_OUTOFMEMORY.
    if (FAILED(CQVComObject<CPtpSysExpert>::CreateInstance(&created))) {
        return E_OUTOFMEMORY;
    }
    created->AddRef();
    *expert = created;
    return S_OK;
}
