// What the project tests share: a scratch folder with a target description, and small COM
// objects standing in for provider-made item objects and selectors.
#pragma once

#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "host/contracts/IwbProjectItem.h"
#include "host/contracts/IwbProjectItemScope.h"
#include "host/contracts/IwbProjectItemSelector.h"

#include <filesystem>
#include <fstream>
#include <functional>
#include <string>
#include <unistd.h>

namespace projecttest {

// A fresh folder under the temporary directory, removed with everything in it at the end.
class ScratchFolder {
public:
    ScratchFolder() {
        std::string pattern =
            (std::filesystem::temp_directory_path() / "wbhost-project-XXXXXX").string();
        path_ = ::mkdtemp(pattern.data()) ? pattern : std::string();
    }
    ~ScratchFolder() {
        std::error_code ignored;
        std::filesystem::remove_all(path_, ignored);
    }
    ScratchFolder(const ScratchFolder&) = delete;
    ScratchFolder& operator=(const ScratchFolder&) = delete;
    std::string File(const std::string& name) const { return path_ + "/" + name; }
    const std::string& Path() const { return path_; }
    // Writes TEXT to NAME and answers its path.
    std::string Write(const std::string& name, const std::string& text) const {
        std::ofstream(File(name), std::ios::binary) << text;
        return File(name);
    }

private:
    std::string path_;
};

inline constexpr const char* kDescription = R"(<Target>
  <Line name="DIO0"><IOInterface>DigitalLine</IOInterface><Protocols>IOResource</Protocols></Line>
  <Line name="AI0"><IOInterface>AnalogInput</IOInterface><Protocols>IOResource</Protocols></Line>
</Target>
)";

// An item object that is a name scope, as a provider's sub-target might be.
class ScopeObjectImpl : public IwbProjectItemScope {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectItemScope>;
    virtual ~ScopeObjectImpl() = default;
};

// A plain item object that keeps its item, as providers' objects do.
class PlainObjectImpl : public IwbProjectItemSelector {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectItemSelector>;
    explicit PlainObjectImpl(IwbProjectItem* item)
        : item(qv::com::ComPtr<IwbProjectItem>::Share(item)) {}
    virtual ~PlainObjectImpl() = default;
    HRESULT SelectItem(IwbProjectItem*) override { return S_FALSE; }
    qv::com::ComPtr<IwbProjectItem> item;
};

// A selector that runs a function for each item.
class SelectorImpl : public IwbProjectItemSelector {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectItemSelector>;
    explicit SelectorImpl(std::function<HRESULT(IwbProjectItem*)> body) : body_(std::move(body)) {}
    virtual ~SelectorImpl() = default;
    HRESULT SelectItem(IwbProjectItem* item) override { return body_(item); }

private:
    std::function<HRESULT(IwbProjectItem*)> body_;
};

template <class Impl, class... Args> qv::com::ComPtr<CQVComObject<Impl>> Make(Args&&... args) {
    CQVComObject<Impl>* made = nullptr;
    CQVComObject<Impl>::CreateInstance(&made, std::forward<Args>(args)...);
    return qv::com::ComPtr<CQVComObject<Impl>>::Adopt(made);
}

// The attribute-set text a new I/O item is made with: its "resource" attribute is RESOURCE.
inline std::u16string ItemBag(std::u16string_view resource) {
    return u"<AttributeSet name=\"\">\n<Attribute name=\"resource\">\n<Value>" +
           std::u16string(resource) + u"</Value>\n</Attribute>\n</AttributeSet>\n";
}

inline std::u16string NameOf(IwbProjectItem* item) {
    BSTR name = nullptr;
    item->GetName(&name);
    std::u16string text = qv::com::BstrToString(name);
    SysFreeString(name);
    return text;
}

} // namespace projecttest
