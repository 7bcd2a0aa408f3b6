// Every host contract together: the interface identifiers are distinct.
#include "host/contracts/IwbItemStatusQuery.h"
#include "host/contracts/IwbProgram.h"
#include "host/contracts/IwbProgramRunner.h"
#include "host/contracts/IwbProgramRunnerService.h"
#include "host/contracts/IwbProjectItem.h"
#include "host/contracts/IwbProjectItemScope.h"
#include "host/contracts/IwbProjectItemSelector.h"
#include "host/contracts/IwbProjectItemUIMap.h"
#include "host/contracts/IwbProjectPropertyBag.h"
#include "host/contracts/IwbProjectProvider.h"
#include "host/contracts/IwbTargetItemChange.h"
#include "host/contracts/IwbhwResourceReservation.h"
#include "host/contracts/IwbhwResourceTreeAccess.h"
#include "host/contracts/IwbhwResourceTreeNode.h"
#include "host/contracts/IwbhwResourceTreeNodeObserver.h"
#include "host/contracts/IwbhwResourceTreeProvider.h"
#include "host/contracts/IwbhwTargetResources.h"

#include <gtest/gtest.h>
#include <vector>

namespace {

TEST(Contracts, InterfaceIdentifiersAreDistinct) {
    const std::vector<IID> ids = {
        IUnknown::iid,
        IwbItemStatusQuery::iid,
        IwbProgram::iid,
        IwbProgramRunner::iid,
        IwbProgramRunnerService::iid,
        IwbProjectItem::iid,
        IwbProjectItemScope::iid,
        IwbProjectItemSelector::iid,
        IwbProjectItemUIMap::iid,
        IwbProjectPropertyBag::iid,
        IwbProjectProvider::iid,
        IwbTargetItemChange::iid,
        IwbhwResourceReservation::iid,
        IwbhwResourceTreeAccess::iid,
        IwbhwResourceTreeNode::iid,
        IwbhwResourceTreeNodeObserver::iid,
        IwbhwResourceTreeProvider::iid,
        IwbhwTargetResources::iid,
    };
    for (size_t i = 0; i < ids.size(); ++i) {
        for (size_t j = i + 1; j < ids.size(); ++j) {
            EXPECT_FALSE(IsEqualGUID(ids[i], ids[j])) << i << " and " << j;
        }
    }
    // The runner is created with its own interface identifier as the class.
    EXPECT_TRUE(IsEqualGUID(wbproj::kProgramRunnerClass, IwbProgramRunner::iid));
}

} // namespace
