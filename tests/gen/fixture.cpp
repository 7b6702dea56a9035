// The fixture library's behaviour: just enough for the generator tests to
// observe that each wrapper reached the right C++ code.
#include "fixture.h"

#include <sstream>

namespace Fx {

Error::Error(const std::string &message) : text_(message) {}
const char *Error::what() const noexcept { return text_.c_str(); }
std::string Error::GetText() const { return text_; }

static int shapes = 0;

Shape::~Shape() {}
int Shape::Count() { return shapes; }
Named::~Named() {}
int Polygon::GetKind() const { return KIND_ANGULAR; }

Square::Square() : side_(1), name_("unit") { ++shapes; }
Square::Square(uint32 side, std::string const &name) : side_(side), name_(name) { ++shapes; }
Square::Square(Square const &other) : Shape(), Polygon(), Named(), side_(other.side_), name_(other.name_ + " copy") { ++shapes; }
Square::~Square() { --shapes; }
std::string Square::Describe() {
    std::ostringstream s;
    s << name_ << " " << side_;
    return s.str();
}
uint32 Square::GetSides() { return 4; }
std::string Square::GetName() const { return name_; }
void Square::SetSide(uint32 side) {
    if (side == 0) throw Error("side must be positive");
    if (side == 13) throw std::runtime_error("unlucky side");
    side_ = side;
}
uint32 Square::GetSide() const { return side_; }
void Square::Scale(uint32 factor, bool round, int32 offset) {
    side_ = side_ * factor + (round ? 0 : 1) + offset;
}
std::string Square::Join(std::vector<std::string> const &parts, std::string sep) {
    std::string out;
    for (size_t i = 0; i < parts.size(); ++i) out += (i ? sep : "") + parts[i];
    return out;
}
uint64 Square::Sum(std::vector<uint64> const &values) {
    uint64 s = 0;
    for (uint64 v : values) s += v;
    return s;
}
std::vector<std::string> Square::Words() { return {name_, "has", std::to_string(side_)}; }
std::vector<std::string> *Square::Labels() {
    if (labels_.empty()) labels_ = {name_, "label"};
    return &labels_;
}
std::vector<Shape *> Square::Pieces() { return {this, nullptr, Largest()}; }
Square *Square::Largest() {
    static Square big(1000, "largest");
    return &big;
}
Square *Square::Make(uint32 side) { return new Square(side, "made"); }
std::string Square::Pick(Shape *shape) { return shape ? "shape:" + shape->Describe() : "shape:null"; }
std::string Square::Pick(std::string const &text) { return "text:" + text; }
std::string Square::Pick(uint32 n) { return "number:" + std::to_string(n); }
Colour Square::Paint(Colour c) { return c == RED ? BLUE : RED; }
int64 Square::Shift(int64 v, uint8 bits, uint16 mask, char tag, Bool flag) {
    // Shifted as unsigned: every bit pattern and width is defined.
    uint64 shifted = bits < 64 ? static_cast<uint64>(v) << bits : 0;
    return static_cast<int64>(shifted & mask) + tag + flag;
}
bool Square::operator==(Square const &other) const { return side_ == other.side_; }
Square *Square::Unnamed() { return Largest(); }
std::string Square::Measure(Square const &other) { return std::to_string(other.side_); }

uint32 Record::instances = 0;
const uint32 Record::LIMIT = 4294967295u;
Point Record::Corner = {1, 2};
char const *Record::Names[3] = {"one", "two", "three"};
Record::Record()
    : count(0), size(0), big(0), delta(0), enabled(false), flag(0), letter('a'), code{},
      origin{0, 0}, link(nullptr), slots{1, 2, 3, 4}, colour(GREEN), fixed(7) {
    ++instances;
}

std::string Version() { return "1.0"; }
int Tally(std::string const &what, bool twice) { return (int)what.size() * (twice ? 2 : 1); }

uint32 Counter = 5;
std::string Motto = "measure twice";
char const *Note = "first note";
Point Origin = {3, 4};

}  // namespace Fx
