#include "benchlib.h"

namespace Bench {

Error::Error(std::string const &message) : text_(message) {}
const char *Error::what() const noexcept { return text_.c_str(); }
std::string Error::GetText() const { return text_; }

Object::~Object() {}

Item::Item(uint32 id) : id_(id) {}
uint32 Item::GetId() const { return id_; }

WidgetImpl::WidgetImpl() : name_("widget"), size_(0), failures_(0) {
    items_.reserve(ITEM_COUNT);
    for (uint32 i = 0; i < ITEM_COUNT; ++i) items_.push_back(new Item(i));
}

WidgetImpl::~WidgetImpl() {
    for (Item *i : items_) delete i;
}

std::string WidgetImpl::GetName() { return name_; }
uint32 WidgetImpl::GetSize() { return size_; }
void WidgetImpl::SetSize(uint32 size) { size_ = size; }
std::vector<Item *> WidgetImpl::GetItems() { return items_; }

uint64 WidgetImpl::Sum(std::vector<uint64> const &values) {
    uint64 s = 0;
    for (uint64 v : values) s += v;
    return s;
}

void WidgetImpl::Fail() {
    ++failures_;
    throw Error("widget refused");
}

uint32 WidgetImpl::GetFailures() const { return failures_; }

WidgetImpl *WidgetImpl::Shared() {
    static WidgetImpl *w = new WidgetImpl();  // lives as long as the process
    return w;
}

Widget *WidgetImpl::SharedWidget() { return Shared(); }

}  // namespace Bench
