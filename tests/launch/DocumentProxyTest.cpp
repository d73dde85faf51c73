#include "platform/launch/DocumentProxy.h"
#include "platform/launch/DocumentIcons.h"
#include "platform/launch/TypeRegistry.h"
#include "tests/launch/Desk.h"

namespace test {
namespace {

using namespace platform;

using DocumentProxies = Desk;

Image iconOf(const std::string& name, std::string_view type,
             IconFormat format = IconFormat::largeDocument) {
    return DocumentProxy(name, std::string(type)).icon(format);
}

TEST_F(DocumentProxies, HaveTheIconOfTheirTypeInTheSizeOfTheFormat) {
    open();
    EXPECT_EQ(iconOf("a", types::pdf, IconFormat::list), DocumentIcons::forType(types::pdf, 40));
    EXPECT_EQ(iconOf("a", types::pdf).size(), (Size{192, 192}));
    EXPECT_EQ(iconOf("a", types::folder), DocumentIcons::folder(192));
    EXPECT_EQ(iconOf("a.pdf", ""), iconOf("b", types::pdf))
        << "by the name, where there is no type";
    EXPECT_EQ(iconOf("a.xyzzy", types::data), iconOf("b", "dyn.xyzzy"));
    EXPECT_EQ(DocumentProxy("a", "", "application/pdf").icon(IconFormat::list),
              iconOf("b", types::pdf, IconFormat::list));
    EXPECT_NE(iconOf("a", types::pdf), iconOf("a", types::plainText));
}

} // namespace
} // namespace test
