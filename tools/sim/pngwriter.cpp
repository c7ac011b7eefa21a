#include "pngwriter.h"
#include "frame/scoped.h"

#include <wincodec.h>

BOOL SaveBitmapPng(HBITMAP hbm, LPCWSTR path)
{
    ComPtr<IWICImagingFactory> factory;
    if (FAILED(CoCreateInstance(CLSID_WICImagingFactory, nullptr, CLSCTX_INPROC_SERVER, IID_IWICImagingFactory,
                                factory.outVoid())))
        return FALSE;
    ComPtr<IWICBitmap> bitmap;
    if (FAILED(factory->CreateBitmapFromHBITMAP(hbm, nullptr, WICBitmapIgnoreAlpha, bitmap.out())))
        return FALSE;
    ComPtr<IWICStream> stream;
    if (FAILED(factory->CreateStream(stream.out())) || FAILED(stream->InitializeFromFilename(path, GENERIC_WRITE)))
        return FALSE;
    ComPtr<IWICBitmapEncoder> encoder;
    if (FAILED(factory->CreateEncoder(GUID_ContainerFormatPng, nullptr, encoder.out())) ||
        FAILED(encoder->Initialize(stream.get(), WICBitmapEncoderNoCache)))
        return FALSE;
    ComPtr<IWICBitmapFrameEncode> frame;
    if (FAILED(encoder->CreateNewFrame(frame.out(), nullptr)) || FAILED(frame->Initialize(nullptr)))
        return FALSE;
    UINT w = 0, h = 0;
    bitmap->GetSize(&w, &h);
    WICPixelFormatGUID format = GUID_WICPixelFormat24bppBGR;
    if (FAILED(frame->SetSize(w, h)) || FAILED(frame->SetPixelFormat(&format)) ||
        FAILED(frame->WriteSource(bitmap.get(), nullptr)) || FAILED(frame->Commit()) || FAILED(encoder->Commit()))
        return FALSE;
    return TRUE;
}
