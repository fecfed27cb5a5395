#include <QApplication>

#include <gtest/gtest.h>

#include "runtime/objects/MainQueue.h"

int main(int argc, char** argv) {
    testing::InitGoogleTest(&argc, argv);
    qputenv("QT_QPA_PLATFORM", "offscreen");
    qputenv("LANGUAGE", "en");
    (void)quorl::mainQueueDescriptor(); // before another thread starts
    const QApplication application(argc, argv);
    return RUN_ALL_TESTS();
}
