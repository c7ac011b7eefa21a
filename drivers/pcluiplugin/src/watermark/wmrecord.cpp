#include "watermark/wmrecord.h"
#include "frame/module.h"
#include "resources/resource.h"

#include <strsafe.h>

WatermarkNode* AppendWatermarkNode(WatermarkNode** ppHead, HANDLE hHeap)
{
    auto* node = static_cast<WatermarkNode*>(HeapAlloc(hHeap, HEAP_ZERO_MEMORY, sizeof(WatermarkNode)));
    if (!node)
        return nullptr;
    WatermarkNode** link = ppHead;
    while (*link)
        link = &(*link)->next;
    *link = node;
    return node;
}

void FreeWatermarkList(WatermarkNode** ppHead, HANDLE hHeap)
{
    WatermarkNode* node = *ppHead;
    while (node) {
        WatermarkNode* next = node->next;
        HeapFree(hHeap, 0, node);
        node = next;
    }
    *ppHead = nullptr;
}

size_t BoundedLength(const WCHAR* psz, size_t cchField)
{
    size_t n = 0;
    while (n < cchField && psz[n])
        ++n;
    return n;
}

WatermarkNode* FindWatermarkByName(WatermarkNode* pHead, LPCWSTR pszName)
{
    WCHAR name[128];
    for (WatermarkNode* node = pHead; node; node = node->next) {
        size_t n = BoundedLength(node->wm.szName, 128);
        if (n > 127) n = 127;
        CopyMemory(name, node->wm.szName, n * sizeof(WCHAR));
        name[n] = 0;
        if (lstrcmpiW(name, pszName) == 0)
            return node;
    }
    return nullptr;
}

size_t WatermarkListLength(const WatermarkNode* pHead)
{
    size_t n = 0;
    for (; pHead; pHead = pHead->next)
        ++n;
    return n;
}

namespace {

struct DefaultWatermark {
    UINT idName, idText;
    COLORREF crColor;
    LONG angle;
    INT iPointSize, iVertPos, iHorzPos;
    BYTE bDynamic;
};

const DefaultWatermark kDefaults[4] = {
    {IDS_WM_DRAFT_NAME, IDS_WM_DRAFT_TEXT, 0xCDCDCD, 450, 72, WM_POS_CENTRE, WM_POS_CENTRE, 0},
    {IDS_WM_CONFIDENTIAL_NAME, IDS_WM_CONFIDENTIAL_TEXT, 0xCDCDCD, 450, 72, WM_POS_CENTRE, WM_POS_CENTRE, 0},
    {IDS_WM_USERNAME_NAME, IDS_WM_USERNAME_TEXT, 0x000000, 0, 8, WM_VPOS_TOP, WM_HPOS_LEFT, 1},
    {IDS_WM_DATETIME_NAME, IDS_WM_DATETIME_TEXT, 0x000000, 0, 8, WM_VPOS_TOP, WM_HPOS_RIGHT, 1},
};

}  // namespace

void BuildDefaultWatermarks(WATERMARK aWm[4])
{
    ZeroMemory(aWm, 4 * sizeof(WATERMARK));
    HINSTANCE hInst = ModuleInstance();
    WCHAR face[LF_FACESIZE] = {};
    if (LoadStringW(hInst, IDS_FONT_ARIAL, face, LF_FACESIZE) <= 0)
        StringCchCopyW(face, LF_FACESIZE, L"Arial");
    for (int i = 0; i < 4; ++i) {
        const DefaultWatermark& d = kDefaults[i];
        WATERMARK& wm = aWm[i];
        // Names and texts are limited to 50 units, as the defaults always were.
        LoadStringW(hInst, d.idName, wm.szName, 50);
        LoadStringW(hInst, d.idText, wm.szText, 50);
        wm.crColor = d.crColor;
        wm.bIntensity = 100;
        wm.lfFont.lfEscapement = d.angle;
        wm.lfFont.lfOrientation = d.angle;
        wm.lfFont.lfWeight = FW_NORMAL;
        StringCchCopyW(wm.lfFont.lfFaceName, LF_FACESIZE, face);
        wm.iPointSize = d.iPointSize;
        wm.iVertPos = d.iVertPos;
        wm.iHorzPos = d.iHorzPos;
        wm.iUnits = WM_UNITS_INCHES;
        wm.bDynamic = d.bDynamic;
    }
}
