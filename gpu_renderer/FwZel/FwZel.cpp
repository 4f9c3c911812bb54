#include <FwZel/FwZel.h>

FwZel* FwZel::spCorm = nullptr;

FwZel::FwZel() {
    spCorm = this;
}

FwZel::~FwZel() = default;

bool FwZel::onInit(int /*argc*/, char** /*ppArgv*/) {
    return true;
}

void FwZel::onShutdown() {}

void FwZel::onRender(int /*frameIndex*/) {}

void FwZel::onResize(int /*w*/, int /*h*/) {}

void FwZel::onIdle() {}
