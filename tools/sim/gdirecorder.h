// Records what a module asks of GDI, passing every call on to the real
// function: fonts created, text origins, mix modes, and the GDI objects
// the module created and has not deleted. Tests read exact numbers (font
// heights, start points) from it that pixels show only approximately.
#pragma once
#include <windows.h>
#include <set>
#include <vector>

struct GdiRecord {
    std::vector<LOGFONTW> fonts;    // every CreateFontIndirectW
    std::vector<POINT> textOrigins; // every TextOutW / ExtTextOutW, logical units
    std::vector<XFORM> textTransforms;  // world transform at each text call
    std::vector<int> rop2;          // every SetROP2
    std::set<HGDIOBJ> live;         // created by the module, not yet deleted
    long created = 0, deleted = 0;
    void Clear()
    {
        fonts.clear();
        textOrigins.clear();
        textTransforms.clear();
        rop2.clear();
    }
};

GdiRecord& TheGdiRecord();
void InstallGdiRecorder(HMODULE mod);
