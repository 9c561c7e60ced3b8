@import "Vesk/vxObject/IObject.h"
@import "shapes/api/shape.h"
@import "shapes/api/kinds.h"

vxDefineTarget(app, 1)
void Register_Project_app();

using vesk::xout;

namespace
{

void PrintClass(vesk::ReflectedClass const& record)
{
    xout() << ((record.m_flags & vesk::CF_CLASS) ? "class " : "struct ") << record.m_name;
    if (record.m_metadata) xout() << ' ' << vesk::DecodeMetadata({record.m_metadata, record.m_strings});
    xout() << '\n';
    for (vesk::ssize_t i = 0; i < record.m_numFields; ++i)
    {
        vesk::ReflectedField const& field = record.m_fields[i];
        xout() << "    " << vesk::TypeText({field.m_type, record.m_strings}) << ' ' << field.m_name << '\n';
    }
    for (vesk::ssize_t i = 0; i < record.m_numMethods; ++i)
    {
        vesk::ReflectedClassMethod const& method = record.m_methods[i];
        xout() << "    " << method.m_name << '(';
        for (vesk::ssize_t a = 0; a < method.m_numArgs; ++a)
        {
            xout() << (a > 0 ? ", " : "") << vesk::TypeText({method.m_args[a].m_type, record.m_strings}) << ' '
                   << method.m_args[a].m_name;
        }
        xout() << (method.m_isConst ? ") const\n" : ")\n");
    }
}

// Prints the fields of any object whose class is reflected.
void PrintObject(vesk::ReflectedClass const& record, void const* object)
{
    for (vesk::ssize_t i = 0; i < record.m_numFields; ++i)
    {
        vesk::ReflectedField const& field = record.m_fields[i];
        xout() << "    " << field.m_name << " = ";
        vesk::PrintValue(xout(), vesk::DecodeType({field.m_type, record.m_strings}),
                         static_cast<char const*>(object) + field.m_offset);
        xout() << '\n';
    }
}

}

int main()
{
    Register_Project_app();
    for (vesk::ReflectedClass const* record : vesk::All<vesk::ReflectedClass>()) PrintClass(*record);

    geo::Circle circle(2);
    circle.centre.Move(3, 4);
    geo::Box box;
    geo::Drawing drawing;
    drawing.Settitle("a circle and a box");
    drawing.Draw(vesk::ptr<geo::IShape>(&circle), "front");
    drawing.Draw(vesk::ptr<geo::IShape>(&box), "back");
    xout() << drawing.title << ", area " << drawing.Area() << ", apart " << circle.centre.DistanceTo(box.corners[0]) << '\n';

    // By name alone: what a script or an editor does.
    vesk::ReflectedClass const& record = *vesk::Find<vesk::ReflectedClass>("geo::Circle");
    using Scale = void (*)(void*, vesk::float64);
    reinterpret_cast<Scale>(record.m_methods[0].m_function)(&circle, 0.5);
    xout() << "after " << record.m_methods[0].m_name << "(0.5):\n";
    PrintObject(record, &circle);

    geo::Pair<int, bool> pair;
    pair.Setuses(1);
    xout() << "a pair, used " << pair.uses << " times\n";

    for (geo::Length length : {geo::Length(1500), geo::Length(1.5)})
    {
        xout() << geo::Scaled(length, 2.0) << ", " << geo::Scaled(length, 50) << ", " << geo::Scaled(length, true) << '\n';
    }
    $makefunctor geo::Measure area { return width * height; }
    xout() << "measured " << area(2, 3) << ", in metres " << geo::InMetres(100, geo::Unit::Inch) << '\n';
    for (vesk::ReflectedGlobalVariable const* variable : vesk::All<vesk::ReflectedGlobalVariable>())
    {
        xout() << "variable " << variable->m_name << '\n';
    }

    geo::Canvas canvas;
    xout() << "canvas " << canvas.area << ' ' << canvas.area << ", a share " << canvas.Share(3);
    canvas.width = 6;
    xout() << ", wider " << canvas.area << ", a share " << canvas.Share(3) << ", calculated " << canvas.m_calculations
           << " times\n";
}
