// Finding nodes by path through the node interface, and how much of a path matched.
#include "TestObjects.h"
#include "com/TaskMem.h"
#include "resources/ResourceService.h"

#include <gtest/gtest.h>

namespace {

using qv::com::ComPtr;

class NodeLookupTest : public ::testing::Test {
protected:
    void SetUp() override {
        target_ = service_.LoadTargetText(uR"(<Target name="Board">
          <Connector name="C0">
            <DigitalLine name="DIO0"><Line>0</Line></DigitalLine>
            <DigitalLine name="A/B"><Line>slash</Line></DigitalLine>
          </Connector>
          <:Link name="Clock">C0/DIO0</:Link>
        </Target>)");
        ASSERT_NE(target_, nullptr);
        ASSERT_TRUE(target_->problems.empty());
        ASSERT_EQ(target_->tree->NodeObject(&target_->tree->Root(), root_.Put()), S_OK);
    }
    // FindNode from the root: the status, the matched length and the found node's path.
    struct Answer {
        HRESULT status;
        uint32_t matched;
        std::u16string path;
        bool operator==(const Answer&) const = default;
    };
    Answer Find(const char16_t* path) {
        Answer answer{E_FAIL, 12345, u""};
        ComPtr<IwbhwResourceTreeNode> node;
        answer.status = root_->FindNode(path, &answer.matched, node.Put());
        if (node) {
            BSTR text = nullptr;
            node->GetPath(&text);
            answer.path = qv::com::BstrToString(text);
            SysFreeString(text);
        }
        return answer;
    }

    wbhost::resources::ResourceService service_;
    wbhost::resources::Target* target_ = nullptr;
    ComPtr<IwbhwResourceTreeNode> root_;
};

TEST_F(NodeLookupTest, FoundPathsMatchWholeAndMissesCountTheNamesThatLed) {
    EXPECT_EQ(Find(u"C0/DIO0"), (Answer{S_OK, 7, u"/C0/DIO0"}));
    EXPECT_EQ(Find(u"c0/dio0"), (Answer{S_OK, 7, u"/C0/DIO0"}));
    EXPECT_EQ(Find(u""), (Answer{S_OK, 0, u"/"}));
    EXPECT_EQ(Find(u"C0/DIO9"), (Answer{S_FALSE, 2, u""}));
    EXPECT_EQ(Find(u"C0/DIO0/Pins/P1"), (Answer{S_FALSE, 7, u""}));
    EXPECT_EQ(Find(u"Nowhere/DIO0"), (Answer{S_FALSE, 0, u""}));
    // A text entry is not a node.
    EXPECT_EQ(Find(u"C0/DIO0/Line"), (Answer{S_FALSE, 7, u""}));
}

TEST_F(NodeLookupTest, EscapesLinksAndRelativePiecesAreFollowed) {
    EXPECT_EQ(Find(uR"(C0/A\/B)"), (Answer{S_OK, 7, uR"(/C0/A\/B)"}));
    EXPECT_EQ(Find(uR"(C0/A\/C)"), (Answer{S_FALSE, 2, u""}));
    EXPECT_EQ(Find(u"Clock"), (Answer{S_OK, 5, u"/C0/DIO0"}));
    EXPECT_EQ(Find(u"C0/./DIO0/../A\\/B"), (Answer{S_OK, 17, uR"(/C0/A\/B)"}));
    EXPECT_EQ(Find(u".."), (Answer{S_FALSE, 0, u""}));
}

TEST_F(NodeLookupTest, LookupsFromANodeAreRelativeUnlessTheyStartAtTheRoot) {
    ComPtr<IwbhwResourceTreeNode> connector;
    ASSERT_EQ(root_->FindNode(u"C0", nullptr, connector.Put()), S_OK);
    ComPtr<IwbhwResourceTreeNode> line;
    EXPECT_EQ(connector->FindNode(u"DIO0", nullptr, line.Put()), S_OK);
    uint32_t matched = 0;
    EXPECT_EQ(connector->FindNode(u"/C0/DIO0", &matched, line.Put()), S_OK);
    EXPECT_EQ(matched, 8u);
    EXPECT_EQ(connector->FindNode(u"C0/DIO0", &matched, line.Put()), S_FALSE);
    EXPECT_EQ(line.Get(), nullptr);
}

TEST_F(NodeLookupTest, ChildrenAttributesAndTypesAreTheNodesEntries) {
    ComPtr<IwbhwResourceTreeNode> connector;
    ASSERT_EQ(root_->FindNode(u"C0", nullptr, connector.Put()), S_OK);
    uint32_t count = 0;
    IwbhwResourceTreeNode** children = nullptr;
    ASSERT_EQ(connector->GetChildrenOfType(u"digitalline", &count, &children), S_OK);
    ASSERT_EQ(count, 2u);
    BSTR type = nullptr;
    EXPECT_EQ(children[1]->GetElementType(&type), S_OK);
    EXPECT_EQ(qv::com::BstrToString(type), u"DigitalLine");
    SysFreeString(type);
    BSTR name = nullptr;
    BSTR value = nullptr;
    EXPECT_EQ(children[1]->GetAttributeAt(0, &name, &value), S_OK);
    EXPECT_EQ(qv::com::BstrToString(name) + u"=" + qv::com::BstrToString(value), u"Line=slash");
    SysFreeString(name);
    SysFreeString(value);
    EXPECT_EQ(children[1]->GetAttributeAt(1, &name, &value), S_FALSE);
    for (uint32_t i = 0; i < count; ++i)
        children[i]->Release();
    CoTaskMemFree(children);
    // Links are followed by lookups but are not children.
    ASSERT_EQ(root_->GetChildren(&count, &children), S_OK);
    EXPECT_EQ(count, 1u);
    children[0]->Release();
    CoTaskMemFree(children);
}

} // namespace
