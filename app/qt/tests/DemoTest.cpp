#include "QtHost.h"

#include <QTableView>

namespace dovrel::test {
namespace {

// The window on the bundled demo company, as the viewer shows it, also
// saved as a picture in the build folder (render-demo.sh copies it out).
class DemoTest : public QtHost {};

TEST_F(DemoTest, TheFirstDeliveryNoteOfTheDemoCompanyIsShownInHebrew) {
    int result = object->ShowDoc(QString::fromUtf8(DOVREL_DEMO_DIR), 20, 2);
    ASSERT_TRUE(object->lastError().isEmpty()) << object->lastError().toStdString();
    EXPECT_EQ(result, 0);
    EXPECT_TRUE(boxes.empty());
    EXPECT_EQ(find<QLineEdit>("txtCustomerName")->text().trimmed(), Q("כהן שיפוצים ובניה"));
    EXPECT_EQ(find<QLineEdit>("txtReference1")->text().trimmed(), "4101");
    EXPECT_GT(find<QTableView>("DocLines")->model()->rowCount(), 1);
    QString file = QString::fromUtf8(DOVREL_QT_OUTPUT_DIR) + "/dovrel-viewer-demo.png";
    EXPECT_TRUE(widget->grab().save(file, "PNG")) << file.toStdString();
}

} // namespace
} // namespace dovrel::test
