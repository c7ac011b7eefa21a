// Entry of every test program: the subsystems linked into it load their
// resources from the program itself, and its spooler calls reach the
// simulated spooler and render side.
#include "frame/module.h"
#include "simrender.h"
#include "simspooler.h"

#include <gtest/gtest.h>

int main(int argc, char** argv)
{
    ModuleAttach(GetModuleHandleW(nullptr));
    InstallSimSpooler(GetModuleHandleW(nullptr));
    InstallSimRender(GetModuleHandleW(nullptr));
    testing::InitGoogleTest(&argc, argv);
    return RUN_ALL_TESTS();
}
