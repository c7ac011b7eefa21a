#include "gdirecorder.h"
#include "iathook.h"

namespace {

GdiRecord g_record;

template <class Fn> Fn Real(const char* name)
{
    return reinterpret_cast<Fn>(GetProcAddress(GetModuleHandleW(L"gdi32.dll"), name));
}

template <class H> H Track(H h)
{
    if (h) {
        g_record.live.insert(h);
        g_record.created++;
    }
    return h;
}

HFONT WINAPI RecCreateFontIndirectW(const LOGFONTW* lf)
{
    static auto real = Real<HFONT(WINAPI*)(const LOGFONTW*)>("CreateFontIndirectW");
    if (lf)
        g_record.fonts.push_back(*lf);
    return Track(real(lf));
}
HBRUSH WINAPI RecCreateBrushIndirect(const LOGBRUSH* lb)
{
    static auto real = Real<HBRUSH(WINAPI*)(const LOGBRUSH*)>("CreateBrushIndirect");
    return Track(real(lb));
}
HPEN WINAPI RecCreatePenIndirect(const LOGPEN* lp)
{
    static auto real = Real<HPEN(WINAPI*)(const LOGPEN*)>("CreatePenIndirect");
    return Track(real(lp));
}
HRGN WINAPI RecCreateRectRgn(int l, int t, int r, int b)
{
    static auto real = Real<HRGN(WINAPI*)(int, int, int, int)>("CreateRectRgn");
    return Track(real(l, t, r, b));
}
HBRUSH WINAPI RecCreateSolidBrush(COLORREF c)
{
    static auto real = Real<HBRUSH(WINAPI*)(COLORREF)>("CreateSolidBrush");
    return Track(real(c));
}
HPEN WINAPI RecCreatePen(int style, int width, COLORREF c)
{
    static auto real = Real<HPEN(WINAPI*)(int, int, COLORREF)>("CreatePen");
    return Track(real(style, width, c));
}
HDC WINAPI RecCreateCompatibleDC(HDC hdc)
{
    static auto real = Real<HDC(WINAPI*)(HDC)>("CreateCompatibleDC");
    return Track(real(hdc));
}
HBITMAP WINAPI RecCreateCompatibleBitmap(HDC hdc, int cx, int cy)
{
    static auto real = Real<HBITMAP(WINAPI*)(HDC, int, int)>("CreateCompatibleBitmap");
    return Track(real(hdc, cx, cy));
}
BOOL WINAPI RecDeleteObject(HGDIOBJ h)
{
    static auto real = Real<BOOL(WINAPI*)(HGDIOBJ)>("DeleteObject");
    if (g_record.live.erase(h))
        g_record.deleted++;
    return real(h);
}
BOOL WINAPI RecDeleteDC(HDC h)
{
    static auto real = Real<BOOL(WINAPI*)(HDC)>("DeleteDC");
    if (g_record.live.erase(h))
        g_record.deleted++;
    return real(h);
}

void RecordOrigin(HDC hdc, int x, int y)
{
    g_record.textOrigins.push_back({x, y});
    XFORM xf = {1, 0, 0, 1, 0, 0};
    GetWorldTransform(hdc, &xf);
    g_record.textTransforms.push_back(xf);
}
BOOL WINAPI RecTextOutW(HDC hdc, int x, int y, LPCWSTR s, int n)
{
    static auto real = Real<BOOL(WINAPI*)(HDC, int, int, LPCWSTR, int)>("TextOutW");
    RecordOrigin(hdc, x, y);
    return real(hdc, x, y, s, n);
}
BOOL WINAPI RecExtTextOutW(HDC hdc, int x, int y, UINT o, const RECT* r, LPCWSTR s, UINT n, const INT* dx)
{
    static auto real = Real<BOOL(WINAPI*)(HDC, int, int, UINT, const RECT*, LPCWSTR, UINT, const INT*)>("ExtTextOutW");
    RecordOrigin(hdc, x, y);
    return real(hdc, x, y, o, r, s, n, dx);
}
int WINAPI RecSetROP2(HDC hdc, int rop)
{
    static auto real = Real<int(WINAPI*)(HDC, int)>("SetROP2");
    g_record.rop2.push_back(rop);
    return real(hdc, rop);
}

}  // namespace

GdiRecord& TheGdiRecord() { return g_record; }

void InstallGdiRecorder(HMODULE mod)
{
    struct {
        const char* name;
        void* fn;
    } hooks[] = {
        {"CreateFontIndirectW", reinterpret_cast<void*>(&RecCreateFontIndirectW)},
        {"CreateBrushIndirect", reinterpret_cast<void*>(&RecCreateBrushIndirect)},
        {"CreatePenIndirect", reinterpret_cast<void*>(&RecCreatePenIndirect)},
        {"CreateRectRgn", reinterpret_cast<void*>(&RecCreateRectRgn)},
        {"CreateSolidBrush", reinterpret_cast<void*>(&RecCreateSolidBrush)},
        {"CreatePen", reinterpret_cast<void*>(&RecCreatePen)},
        {"CreateCompatibleDC", reinterpret_cast<void*>(&RecCreateCompatibleDC)},
        {"CreateCompatibleBitmap", reinterpret_cast<void*>(&RecCreateCompatibleBitmap)},
        {"DeleteObject", reinterpret_cast<void*>(&RecDeleteObject)},
        {"DeleteDC", reinterpret_cast<void*>(&RecDeleteDC)},
        {"TextOutW", reinterpret_cast<void*>(&RecTextOutW)},
        {"ExtTextOutW", reinterpret_cast<void*>(&RecExtTextOutW)},
        {"SetROP2", reinterpret_cast<void*>(&RecSetROP2)},
    };
    for (auto& h : hooks)
        PatchImport(mod, "gdi32.dll", h.name, h.fn);
}
