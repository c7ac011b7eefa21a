// The plug-in as the driver sees it: the DLL, its class factory and the
// IPrintOemUI2 object.
#include "frame/oemdevmode.h"
#include "plugin_dll.h"
#include "simdriverui.h"
#include "simspooler.h"

#include <gtest/gtest.h>
#include <cstring>
#include <vector>

namespace {

using GetClassObjectFn = HRESULT(STDAPICALLTYPE*)(REFCLSID, REFIID, void**);
using CanUnloadFn = HRESULT(STDAPICALLTYPE*)();

GetClassObjectFn GetClassObject()
{
    return reinterpret_cast<GetClassObjectFn>(GetProcAddress(PluginDll(), "DllGetClassObject"));
}
CanUnloadFn CanUnload()
{
    return reinterpret_cast<CanUnloadFn>(GetProcAddress(PluginDll(), "DllCanUnloadNow"));
}

// A caller buffer with guard bytes on both sides.
struct Guarded {
    explicit Guarded(size_t cb) : bytes(cb + 64, 0xA5), size(cb) {}
    BYTE* data() { return bytes.data() + 32; }
    bool guardsIntact() const
    {
        for (size_t i = 0; i < 32; ++i)
            if (bytes[i] != 0xA5 || bytes[32 + size + i] != 0xA5)
                return false;
        return true;
    }
    std::vector<BYTE> bytes;
    size_t size;
};

struct PluginTest : ::testing::Test {
    void SetUp() override
    {
        ASSERT_NE(PluginDll(), nullptr);
        plugin = CreatePluginObject();
        ASSERT_NE(plugin, nullptr);
    }
    void TearDown() override
    {
        if (plugin)
            plugin->Release();
    }
    IPrintOemUI2* plugin = nullptr;
};

}  // namespace

TEST(PluginDllTest, ClassFactoryAndUnloading)
{
    ASSERT_NE(PluginDll(), nullptr);
    ASSERT_NE(GetClassObject(), nullptr);
    ASSERT_NE(CanUnload(), nullptr);
    EXPECT_EQ(CanUnload()(), S_OK);

    void* out = reinterpret_cast<void*>(0x1234);
    EXPECT_EQ(GetClassObject()(IID_IPrintOemUI, IID_IClassFactory, &out), CLASS_E_CLASSNOTAVAILABLE);
    EXPECT_EQ(out, reinterpret_cast<void*>(0x1234)) << "out pointer must stay untouched";

    EXPECT_EQ(GetClassObject()(CLSID_OEMUI, IID_IPrintOemUI, &out), E_NOINTERFACE);
    EXPECT_EQ(out, nullptr);
    EXPECT_EQ(CanUnload()(), S_OK) << "a refused interface leaves nothing alive";

    IUnknown* unk = nullptr;
    ASSERT_EQ(GetClassObject()(CLSID_OEMUI, IID_IUnknown, reinterpret_cast<void**>(&unk)), S_OK);
    IClassFactory* factory = nullptr;
    ASSERT_EQ(unk->QueryInterface(IID_IClassFactory, reinterpret_cast<void**>(&factory)), S_OK);
    EXPECT_EQ(unk->Release(), 1u) << "the caller's reference is the only one";
    EXPECT_EQ(CanUnload()(), S_FALSE);

    SimDriverUI outer;
    IPrintOemUI2* obj = nullptr;
    EXPECT_EQ(factory->CreateInstance(&outer, IID_IPrintOemUI2,
                                      reinterpret_cast<void**>(&obj)),
              CLASS_E_NOAGGREGATION);
    ASSERT_EQ(factory->CreateInstance(nullptr, IID_IPrintOemUI2, reinterpret_cast<void**>(&obj)), S_OK);
    IPrintOemUI* v1 = nullptr;
    ASSERT_EQ(obj->QueryInterface(IID_IPrintOemUI, reinterpret_cast<void**>(&v1)), S_OK);
    EXPECT_EQ(static_cast<void*>(v1), static_cast<void*>(obj));
    v1->Release();
    void* none = nullptr;
    EXPECT_EQ(obj->QueryInterface(IID_IClassFactory, &none), E_NOINTERFACE);
    EXPECT_EQ(none, nullptr);

    factory->LockServer(TRUE);
    EXPECT_EQ(factory->Release(), 0u);
    EXPECT_EQ(obj->Release(), 0u);
    EXPECT_EQ(CanUnload()(), S_FALSE) << "a server lock keeps the DLL";
    // The lock is released through a new factory.
    ASSERT_EQ(GetClassObject()(CLSID_OEMUI, IID_IClassFactory, reinterpret_cast<void**>(&factory)), S_OK);
    factory->LockServer(FALSE);
    factory->Release();
    EXPECT_EQ(CanUnload()(), S_OK);
}

TEST_F(PluginTest, GetInfoEveryModeAndSize)
{
    for (DWORD mode = 0; mode <= 6; ++mode) {
        for (DWORD cb : {0u, 3u, 4u, 8u}) {
            Guarded buf(cb);
            Guarded needed(sizeof(DWORD));
            SetLastError(0);
            HRESULT hr = plugin->GetInfo(mode, cb ? buf.data() : nullptr, cb,
                                         reinterpret_cast<PDWORD>(needed.data()));
            DWORD err = GetLastError();
            DWORD need = *reinterpret_cast<DWORD*>(needed.data());
            SCOPED_TRACE(testing::Message() << "mode " << mode << " size " << cb);
            EXPECT_TRUE(buf.guardsIntact());
            EXPECT_TRUE(needed.guardsIntact());
            if (mode != 1 && mode != 3 && mode != 4) {
                EXPECT_EQ(hr, E_FAIL);
                EXPECT_EQ(err, DWORD(ERROR_INVALID_PARAMETER));
                EXPECT_EQ(need, 0xA5A5A5A5u) << "needed size untouched";
            } else if (cb < 4) {
                EXPECT_EQ(hr, E_FAIL);
                EXPECT_EQ(err, DWORD(ERROR_INSUFFICIENT_BUFFER));
                EXPECT_EQ(need, 4u);
            } else if (mode == 4) {
                EXPECT_EQ(hr, E_FAIL);
                EXPECT_EQ(err, DWORD(ERROR_NOT_SUPPORTED));
                EXPECT_EQ(need, 0u);
            } else {
                EXPECT_EQ(hr, S_OK);
                EXPECT_EQ(need, 4u);
                DWORD v = *reinterpret_cast<DWORD*>(buf.data());
                EXPECT_EQ(v, mode == 1 ? 0x4E52564Eu : 1u);
                if (cb > 4)
                    EXPECT_EQ(buf.data()[4], 0xA5) << "only 4 bytes written";
            }
        }
    }
    DWORD v = 0;
    SetLastError(0);
    EXPECT_EQ(plugin->GetInfo(OEMGI_GETSIGNATURE, &v, 4, nullptr), E_FAIL);
    EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_PARAMETER));
}

TEST_F(PluginTest, QueryColorProfileSizes)
{
    for (ULONG cb : {0ul, 30ul, 31ul, 32ul, 40ul}) {
        Guarded buf(cb);
        ULONG size = cb;
        FLONG flags = 0x77;
        SetLastError(0);
        HRESULT hr = plugin->QueryColorProfile(nullptr, nullptr, nullptr, nullptr, 0, cb ? buf.data() : nullptr,
                                               &size, &flags);
        SCOPED_TRACE(cb);
        EXPECT_TRUE(buf.guardsIntact());
        EXPECT_EQ(size, 32u);
        if (cb < 32) {
            EXPECT_EQ(hr, E_FAIL);
            EXPECT_EQ(GetLastError(), DWORD(ERROR_INSUFFICIENT_BUFFER));
            EXPECT_EQ(flags, 0x77u);
        } else {
            EXPECT_EQ(hr, S_OK);
            EXPECT_STREQ(reinterpret_cast<WCHAR*>(buf.data()), L"OEMPROFILE.icm");
            EXPECT_EQ(flags, 2u);
            EXPECT_EQ(buf.data()[30], 0xA5) << "30 bytes written, not the reported 32";
        }
    }
    WCHAR name[32] = {};
    ULONG size = sizeof(name);
    SetLastError(1234);
    EXPECT_EQ(plugin->QueryColorProfile(nullptr, nullptr, nullptr, nullptr, 1, name, &size, nullptr), E_FAIL);
    EXPECT_EQ(GetLastError(), 1234u) << "other query modes set no error code";
    EXPECT_EQ(name[0], 0);
}

TEST_F(PluginTest, PublishDriverInterfaceKeepsTheFirst)
{
    SimDriverUI first, second;
    SimDriverObject objFirst(&first), objSecond(&second);
    EXPECT_EQ(plugin->PublishDriverInterface(&objFirst), S_OK);
    EXPECT_EQ(plugin->PublishDriverInterface(&objSecond), S_OK);
    EXPECT_EQ(objFirst.queryCount, 1);
    EXPECT_EQ(objSecond.queryCount, 0) << "a second call does not query";
    EXPECT_EQ(first.refs, 2) << "the object holds one reference";
    plugin->Release();
    plugin = nullptr;
    EXPECT_EQ(first.refs, 1) << "released with the object";

    struct NoDriverUI : IUnknown {
        STDMETHODIMP QueryInterface(REFIID, void** ppv) override { *ppv = nullptr; return E_NOINTERFACE; }
        STDMETHODIMP_(ULONG) AddRef() override { return 1; }
        STDMETHODIMP_(ULONG) Release() override { return 1; }
    } noUI;
    IPrintOemUI2* other = CreatePluginObject();
    EXPECT_EQ(other->PublishDriverInterface(&noUI), E_FAIL);
    EXPECT_EQ(other->PublishDriverInterface(&objSecond), S_OK) << "a failed call leaves no interface held";
    other->Release();
}

TEST_F(PluginTest, NotOfferedSlotsAnswerNotImplemented)
{
    EXPECT_EQ(plugin->DevQueryPrintEx(nullptr, nullptr, nullptr, nullptr), E_NOTIMPL);
    EXPECT_EQ(plugin->DeviceCapabilities(nullptr, nullptr, nullptr, 0, nullptr, nullptr, nullptr, 0, nullptr),
              E_NOTIMPL);
    EXPECT_EQ(plugin->UpgradePrinter(0, nullptr), E_NOTIMPL);
    EXPECT_EQ(plugin->FontInstallerDlgProc(nullptr, 0, 0, 0), E_NOTIMPL);
    EXPECT_EQ(plugin->UpdateExternalFonts(nullptr, nullptr, nullptr), E_NOTIMPL);
    EXPECT_EQ(plugin->QueryJobAttributes(nullptr, nullptr, 0, nullptr), E_NOTIMPL);
    EXPECT_EQ(plugin->HideStandardUI(0), E_NOTIMPL);
}
