// A small library used to test the binding generator: every wrapper shape
// in a few classes. Built into the test-only module _genfixture.
#ifndef QORCTL_TESTS_GEN_FIXTURE_H
#define QORCTL_TESTS_GEN_FIXTURE_H

#include <exception>
#include <string>
#include <vector>

#include "annotate.h"
#include "types.h"

#define FX_THROWS QC_ANNOTATE("throws:Fx::Error")

#define FX_LIMIT 42
#define FX_LABEL "fixture"

namespace Fx {

class Error : public std::exception {
public:
    explicit Error(const std::string &message);
    const char *what() const noexcept override;
    std::string GetText() const;
private:
    std::string text_;
};

enum Colour : int { RED = 1, GREEN = 2, BLUE = 4 };

// Three levels of virtual bases: Shape <- Polygon <- Square, and a second
// root Named joined in at the bottom.
class Shape {
public:
    virtual ~Shape();
    enum Kind : int { KIND_ROUND = 0, KIND_ANGULAR = 1 };
    virtual int GetKind() const = 0;
    virtual std::string Describe() = 0;
    static int Count();
};

class Named {
public:
    virtual ~Named();
    virtual std::string GetName() const = 0;
};

class Polygon : public virtual Shape {
public:
    int GetKind() const override;
    virtual uint32 GetSides() = 0;
};

class Square : public virtual Polygon, public virtual Named {
public:
    Square();
    Square(uint32 side, std::string const &name = "square");
    Square(Square const &other);
    ~Square() override;
    std::string Describe() override;
    uint32 GetSides() override;
    std::string GetName() const override;
    FX_THROWS void SetSide(uint32 side);
    uint32 GetSide() const;
    void Scale(uint32 factor, bool round = true, int32 offset = 0);
    std::string Join(std::vector< std::string > const &parts, std::string sep);
    uint64 Sum(std::vector< uint64 > const &values);
    std::vector< std::string > Words();
    // The square's own label list, by pointer (borrowed).
    std::vector< std::string > *Labels();
    std::vector< Shape * > Pieces();
    static Square *Largest();
    QC_OWNED static Square *Make(uint32 side);
    std::string Pick(Shape *shape);
    std::string Pick(std::string const &text);
    std::string Pick(uint32 n);
    Colour Paint(Colour c);
    int64 Shift(int64 v, uint8 bits, uint16 mask, char tag, Bool flag);
    bool operator==(Square const &other) const;
    // The same objects under a name of their own (no class, no casts).
    QC_RESULT_NAME("Square") static Square *Unnamed();
    std::string Measure(QC_NAME("Square") Square const &other);
private:
    uint32 side_;
    std::string name_;
    std::vector< std::string > labels_;
};

struct Point {
    int x;
    int y;
};

struct Record {
    Record();
    int32 count;
    uint32 size;
    uint64 big;
    int64 delta;
    bool enabled;
    Bool flag;
    char letter;
    std::string label;
    char code[8];
    Point origin;
    Point *link;
    uint32 slots[4];
    Colour colour;
    const int fixed;
    static uint32 instances;
    static const uint32 MAX_SLOTS = 4;
    static const uint32 LIMIT;
    static Point Corner;
    static char const *Names[3];
};

std::string Version();
int Tally(std::string const &what, bool twice = false);

extern uint32 Counter;
extern std::string Motto;
extern char const *Note;
extern Point Origin;

}  // namespace Fx

#endif
