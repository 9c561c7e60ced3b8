// An ordinary source of an ordinary CMake program.

#include "goods/api/item.h"

void Register_Project_goods();

using vesk::xout;

// Any object whose class is reflected: its record tells the fields.
void Print(vesk::ReflectedClass const& record, void const* object)
{
    xout() << record.m_name << '\n';
    for (vesk::ssize_t i = 0; i < record.m_numFields; ++i)
    {
        vesk::ReflectedField const& field = record.m_fields[i];
        xout() << "    " << vesk::TypeText({field.m_type, record.m_strings}) << ' ' << field.m_name << " = ";
        vesk::PrintValue(xout(), vesk::DecodeType({field.m_type, record.m_strings}),
                         static_cast<char const*>(object) + field.m_offset);
        xout() << '\n';
    }
}

int main()
{
    Register_Project_goods();
    goods::Item rope("rope", 12.5);
    Print(*vesk::Find<vesk::ReflectedClass>("goods::Item"), &rope);
    xout() << "    costs " << rope.Price() << '\n';
}
