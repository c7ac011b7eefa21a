// Small owners for Win32 handles so that every path releases what it took.
#pragma once
#include <windows.h>
#include <winspool.h>

class ScopedRegKey {
public:
    ScopedRegKey() = default;
    explicit ScopedRegKey(HKEY h) : h_(h) {}
    ~ScopedRegKey() { reset(); }
    ScopedRegKey(const ScopedRegKey&) = delete;
    ScopedRegKey& operator=(const ScopedRegKey&) = delete;
    HKEY get() const { return h_; }
    explicit operator bool() const { return h_ != nullptr; }
    HKEY* out() { reset(); return &h_; }
    void reset(HKEY h = nullptr)
    {
        if (h_) RegCloseKey(h_);
        h_ = h;
    }
private:
    HKEY h_ = nullptr;
};

// A zero-filled block from the process heap.
class HeapBuffer {
public:
    HeapBuffer() = default;
    explicit HeapBuffer(SIZE_T cb) { alloc(cb); }
    ~HeapBuffer() { reset(); }
    HeapBuffer(const HeapBuffer&) = delete;
    HeapBuffer& operator=(const HeapBuffer&) = delete;
    bool alloc(SIZE_T cb)
    {
        reset();
        p_ = cb ? HeapAlloc(GetProcessHeap(), HEAP_ZERO_MEMORY, cb) : nullptr;
        cb_ = p_ ? cb : 0;
        return p_ != nullptr;
    }
    void reset()
    {
        if (p_) HeapFree(GetProcessHeap(), 0, p_);
        p_ = nullptr;
        cb_ = 0;
    }
    template <class T = void> T* get() const { return static_cast<T*>(p_); }
    SIZE_T size() const { return cb_; }
    explicit operator bool() const { return p_ != nullptr; }
private:
    void* p_ = nullptr;
    SIZE_T cb_ = 0;
};

template <class T> class ScopedGdiObject {
public:
    explicit ScopedGdiObject(T h = nullptr) : h_(h) {}
    ~ScopedGdiObject() { if (h_) DeleteObject(h_); }
    ScopedGdiObject(const ScopedGdiObject&) = delete;
    ScopedGdiObject& operator=(const ScopedGdiObject&) = delete;
    T get() const { return h_; }
    explicit operator bool() const { return h_ != nullptr; }
private:
    T h_;
};

// Selects an object into a DC and puts the previous one back.
class ScopedSelect {
public:
    ScopedSelect(HDC hdc, HGDIOBJ h) : hdc_(hdc), old_(h ? SelectObject(hdc, h) : nullptr) {}
    ~ScopedSelect() { if (old_ && old_ != HGDI_ERROR) SelectObject(hdc_, old_); }
    ScopedSelect(const ScopedSelect&) = delete;
    ScopedSelect& operator=(const ScopedSelect&) = delete;
private:
    HDC hdc_;
    HGDIOBJ old_;
};

class ScopedPrinter {
public:
    ScopedPrinter() = default;
    ~ScopedPrinter() { if (h_) ClosePrinter(h_); }
    ScopedPrinter(const ScopedPrinter&) = delete;
    ScopedPrinter& operator=(const ScopedPrinter&) = delete;
    HANDLE* out() { return &h_; }
    HANDLE get() const { return h_; }
private:
    HANDLE h_ = nullptr;
};

template <class T> class ComPtr {
public:
    ComPtr() = default;
    ~ComPtr() { reset(); }
    ComPtr(const ComPtr&) = delete;
    ComPtr& operator=(const ComPtr&) = delete;
    T* get() const { return p_; }
    T* operator->() const { return p_; }
    T** out() { reset(); return &p_; }
    void** outVoid() { return reinterpret_cast<void**>(out()); }
    explicit operator bool() const { return p_ != nullptr; }
    void reset() { if (p_) { p_->Release(); p_ = nullptr; } }
private:
    T* p_ = nullptr;
};
