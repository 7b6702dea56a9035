// The library the benchmarks bind: one object of each call shape that the
// timing table measures, with library work kept as small as the shape allows
// so that the binding layer is what the numbers show.
//
// Widget is an interface over the virtual root Object; WidgetImpl implements
// it through a virtual base, so a WidgetImpl handed to a Widget method needs
// the pointer adjustment read from the object's virtual table.
#ifndef QORCTL_BENCH_BENCHLIB_H
#define QORCTL_BENCH_BENCHLIB_H

#include <exception>
#include <string>
#include <vector>

#include "annotate.h"
#include "types.h"

#define BENCH_THROWS QC_ANNOTATE("throws:Bench::Error")

namespace Bench {

class Error : public std::exception {
public:
    explicit Error(std::string const &message);
    const char *what() const noexcept override;
    std::string GetText() const;
private:
    std::string text_;
};

class Object {
public:
    virtual ~Object();
};

class Item : public virtual Object {
public:
    explicit Item(uint32 id);
    uint32 GetId() const;
private:
    uint32 id_;
};

class Widget : public virtual Object {
public:
    virtual std::string GetName() = 0;
    virtual uint32 GetSize() = 0;
    virtual void SetSize(uint32 size) = 0;
    // Every item of the widget (ITEM_COUNT of them), owned by the widget.
    virtual std::vector< Bench::Item * > GetItems() = 0;
    virtual uint64 Sum(std::vector< uint64 > const &values) = 0;
    // Always throws Error.
    BENCH_THROWS virtual void Fail() = 0;
};

class WidgetImpl : public virtual Widget {
public:
    enum { ITEM_COUNT = 1000 };
    WidgetImpl();
    ~WidgetImpl() override;
    std::string GetName() override;
    uint32 GetSize() override;
    void SetSize(uint32 size) override;
    std::vector< Bench::Item * > GetItems() override;
    uint64 Sum(std::vector< uint64 > const &values) override;
    BENCH_THROWS void Fail() override;
    // How many times Fail() has thrown; lets a run check that every timed
    // call reached the library.
    uint32 GetFailures() const;

    // The library's own widget, typed as the implementation and as the
    // interface (the same object).
    static Bench::WidgetImpl *Shared();
    static Bench::Widget *SharedWidget();
private:
    // Not copyable: the widget owns its items. (Declared private rather than
    // deleted: the generator binds a deleted copy constructor.)
    WidgetImpl(WidgetImpl const &);
    WidgetImpl &operator=(WidgetImpl const &);
    std::string name_;
    uint32 size_;
    uint32 failures_;
    std::vector< Bench::Item * > items_;
};

}  // namespace Bench

#endif
