@import "Vesk/vxObject/IObject.h"
@import "{{NAME}}_core/api/animal.h"
@import "{{NAME}}_core/api/meal.h"

vxDefineTarget({{NAME}}_app, 1)
void Register_Project_{{NAME}}_app();

using vesk::xout;

// Any object whose class is reflected: its record tells the fields.
void Print(vesk::ReflectedClass const& record, void const* object)
{
    xout() << record.m_name << ' ' << vesk::DecodeMetadata({record.m_metadata, record.m_strings}) << '\n';
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
    Register_Project_{{NAME}}_app();

    animals::Animal leo("Leo", animals::Diet::Meat, 200);
    Print(*vesk::Find<vesk::ReflectedClass>("animals::Animal"), &leo);
    xout() << "    eats " << leo.FoodPerDay() << " kg a day\n";

    vesk::ReflectedEnum const& diets = *vesk::Find<vesk::ReflectedEnum>("animals::Diet");
    xout() << diets.m_name << ':';
    for (vesk::ssize_t i = 0; i < diets.m_numLabels; ++i) xout() << ' ' << diets.m_labels[i];
    xout() << '\n';

    // What the first release wrote: its number, then the fields that a meal had then.
    vesk::Archive archive;
    vesk::SerialiseVariableLengthUint(archive, 1);
    archive << vesk::string8("Leo") << vesk::float64(10);
    vesk::InputArchive input(archive.m_bytes);
    animals::Feeding feeding;
    feeding.Deserialise(input);
    xout() << feeding.eater << " had " << feeding.kilos << " kg, as release 1 tells\n";
}
